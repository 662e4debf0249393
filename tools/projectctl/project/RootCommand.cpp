#include "cli/WorkingFolder.hpp"
#include "output/JsonDocument.hpp"
#include "output/Output.hpp"
#include "project/Commands.hpp"
#include "project/ProjectFolder.hpp"

namespace projectctl {

namespace {

/// Prints the root of the project. It does not open the project: scripts also need the root of a damaged one.
class RootCommand : public Command {
public:
    CLI::App* declare(CLI::App& tool) override {
        auto* const app = tool.add_subcommand("root");
        app->add_flag("--json", isJson_);
        return app;
    }

    int run() override {
        auto const root = findProjectRoot(workingFolder());
        if (isJson_) {
            JsonDocument document(json::root);
            document.addText("root", root.native());
            document.finish();
        } else {
            output().name(root.native());
            output().text() += '\n';
        }
        return 0;
    }

private:
    bool isJson_ = false;
};

} // namespace

std::unique_ptr<Command> makeRootCommand() {
    return std::make_unique<RootCommand>();
}

} // namespace projectctl
