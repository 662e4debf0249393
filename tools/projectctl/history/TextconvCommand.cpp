#include <fstream>
#include <iterator>
#include <optional>
#include <string>

#include "cli/TextArguments.hpp"
#include "history/ChangeText.hpp"
#include "history/Commands.hpp"
#include "output/Failure.hpp"
#include "project/stores/DefinitionChange.hpp"

namespace projectctl {

namespace {

/// Writes the definition in a text in words, one line for each thing, for `git diff` to compare.
class TextconvCommand : public Command {
public:
    CLI::App* declare(CLI::App& tool) override {
        auto* const app = tool.add_subcommand("textconv");
        takeText(*app, "TEXT", text_)->required();
        return app;
    }

    int run() override {
        std::ifstream file(*text_, std::ios::binary);
        std::string const text{std::istreambuf_iterator<char>(file), {}};
        if (!file) {
            throw Failure(Message("FileUnreadable", *text_));
        }
        ChangeText(ShownPaths::fromRoot({}), "").write(project::stores::changesBetween({}, text));
        return 0;
    }

private:
    std::optional<std::string> text_;
};

} // namespace

std::unique_ptr<Command> makeTextconvCommand() {
    return std::make_unique<TextconvCommand>();
}

} // namespace projectctl
