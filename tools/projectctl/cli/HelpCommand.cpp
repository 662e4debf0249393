#include "cli/HelpCommand.hpp"

#include <string>
#include <vector>

#include "cli/DeclaredTool.hpp"
#include "cli/HelpFormatter.hpp"
#include "cli/TextArguments.hpp"
#include "output/Output.hpp"

namespace projectctl {

namespace {

class HelpCommand : public Command {
public:
    explicit HelpCommand(CommandList const& verbs) : verbs_(verbs) {}

    CLI::App* declare(CLI::App& tool) override {
        auto* const app = tool.add_subcommand("help");
        takeTexts(*app, "VERB", words_);
        return app;
    }

    int run() override {
        DeclaredTool const tool(verbs_);
        output().text() += helpOf(describe(tool.find(words_)));
        return 0;
    }

private:
    CommandList const& verbs_;
    std::vector<std::string> words_;
};

} // namespace

std::unique_ptr<Command> makeHelpCommand(CommandList const& verbs) {
    return std::make_unique<HelpCommand>(verbs);
}

} // namespace projectctl
