#include "cli/WorkingFolder.hpp"
#include "output/Output.hpp"
#include "project/Commands.hpp"
#include "project/ProjectFolder.hpp"

namespace projectctl {

namespace {

/// Prints the root of the project. It does not open the project: scripts also need the root of a damaged one.
class RootCommand : public Command {
public:
    CLI::App* declare(CLI::App& tool) override { return tool.add_subcommand("root"); }

    int run() override {
        output().name(findProjectRoot(workingFolder()).native());
        output().text() += '\n';
        return 0;
    }
};

} // namespace

std::unique_ptr<Command> makeRootCommand() {
    return std::make_unique<RootCommand>();
}

} // namespace projectctl
