#include "cli/PathArguments.hpp"
#include "entrypoints/EntryCommands.hpp"
#include "project/ProjectCommand.hpp"

namespace projectctl {

namespace {

class RemoveEntryCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand("remove");
        paths_.declare(*app, Completes::EntryPoints);
        return app;
    }

    int run(OpenProject& project) override {
        auto const files = paths_.read();
        auto const guard = project.store().acquireWriteLock();
        for (auto const& file : files) { // check all of them before the first is changed
            project.requireInProject(file);
        }
        for (auto const& file : files) {
            project.manager().getEntryPointManager().removeEntryPoint(file);
        }
        return 0;
    }

private:
    PathArguments paths_;
};

} // namespace

std::unique_ptr<Command> makeRemoveEntryCommand() {
    return std::make_unique<RemoveEntryCommand>();
}

} // namespace projectctl
