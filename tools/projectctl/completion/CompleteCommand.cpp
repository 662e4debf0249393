#include <exception>
#include <string>
#include <string_view>
#include <vector>

#include "cli/TextArguments.hpp"
#include "completion/ArgumentCandidates.hpp"
#include "completion/Commands.hpp"
#include "completion/TypedLine.hpp"
#include "output/Output.hpp"

namespace projectctl {

namespace {

/// Writes the candidates for a word, for the completion of a shell: each one's value, a tab and its
/// description, ended by a zero byte. A value may contain tabs and line ends, a description does not.
///
/// Writes nothing when something is wrong: a message would appear in the middle of the line that is being
/// typed.
class CompleteCommand : public Command {
public:
    explicit CompleteCommand(CommandList const& commands) : commands_(commands) {}

    CLI::App* declare(CLI::App& tool) override {
        auto* const app = tool.add_subcommand(completeCommandName);
        app->group(""); // hidden: people do not call it
        takeTexts(*app, "WORDS", words_);
        auto* const bash = app->add_flag("--bash", isBash_);
        app->add_flag("--fish", isFish_)->excludes(bash);
        return app;
    }

    int run() override {
        try {
            isBash_ ? writeForBash() : writeWithDescriptions();
        } catch (std::exception const&) {
            output().text().clear();
        }
        return 0;
    }

private:
    void writeWithDescriptions() const {
        auto const arguments = isFish_ ? argumentsOf(readTypedLine(words_.at(0), Shell::Fish)) : words_;
        for (auto const& candidate : candidatesFor(orEmptyWord(arguments), commands_)) {
            output().text() += candidate.value + '\t' + candidate.description + '\0';
        }
    }

    void writeForBash() const {
        std::string_view const text = words_.at(0);
        std::string_view const replaced = words_.at(1);
        if (!text.ends_with(replaced)) {
            return;
        }
        auto const kept = readTypedLine(text.substr(0, text.size() - replaced.size()), Shell::Bash);
        auto const arguments = argumentsOf(readTypedLine(text, Shell::Bash));
        for (auto const& candidate : candidatesFor(orEmptyWord(arguments), commands_)) {
            auto const rest = std::string_view(candidate.value).substr(kept.words.back().size());
            output().text() += quotedForBash(rest, kept.quote) + '\0';
        }
    }

    static std::vector<std::string> orEmptyWord(std::vector<std::string> arguments) {
        return arguments.empty() ? std::vector<std::string>(1) : std::move(arguments);
    }

    CommandList const& commands_;
    std::vector<std::string> words_;
    bool isBash_ = false;
    bool isFish_ = false;
};

} // namespace

std::unique_ptr<Command> makeCompleteCommand(CommandList const& commands) {
    return std::make_unique<CompleteCommand>(commands);
}

} // namespace projectctl
