#include "cli/HelpCommand.hpp"

#include <algorithm>
#include <string>
#include <vector>

#include "cli/DeclaredTool.hpp"
#include "cli/HelpFormatter.hpp"
#include "cli/TextArguments.hpp"
#include "output/JsonRows.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"

namespace projectctl {

namespace {

class HelpCommand : public Command {
public:
    explicit HelpCommand(CommandList const& verbs) : verbs_(verbs) {}

    CLI::App* declare(CLI::App& tool) override {
        auto* const app = tool.add_subcommand("help");
        takeTexts(*app, "VERB", words_);
        app->add_flag("--json", isJson_);
        return app;
    }

    int run() override {
        DeclaredTool const tool(verbs_);
        auto const verb = describe(tool.find(words_));
        if (isJson_) {
            writeJson(verb);
        } else {
            output().text() += helpOf(verb);
        }
        return 0;
    }

private:
    static void writeJson(VerbDescription const& verb) {
        JsonDocument document(json::help);
        document.addText("name", textOf(verb.name));
        document.addText("summary", textOf(verb.summary));
        document.addText("details", textOf(verb.details));
        document.addText("usage", textOf(verb.usage()));
        document.addText("example", textOf(verb.example));
        add(document, "arguments", verb.arguments);
        add(document, "options", verb.options);
        document.addKey("verbs");
        JsonRows members;
        for (auto const& member : verb.members) {
            members.begin();
            members.addText("name", textOf(member.name));
            members.addText("summary", textOf(member.summary));
        }
        members.finish();
        document.finish();
    }

    static void add(JsonDocument& document, char const* key, std::vector<OptionDescription> const& options) {
        document.addKey(key);
        JsonRows rows;
        for (auto const& option : options) {
            std::vector<std::u16string> names(option.names.size());
            std::ranges::transform(option.names, names.begin(), textOf);
            rows.begin();
            rows.addList("names", names);
            rows.addText("value", textOf(option.value));
            rows.addFlag("required", option.isRequired);
            rows.addFlag("repeated", option.isRepeated);
            rows.addText("text", textOf(option.text));
        }
        rows.finish();
    }

    CommandList const& verbs_;
    std::vector<std::string> words_;
    bool isJson_ = false;
};

} // namespace

std::unique_ptr<Command> makeHelpCommand(CommandList const& verbs) {
    return std::make_unique<HelpCommand>(verbs);
}

} // namespace projectctl
