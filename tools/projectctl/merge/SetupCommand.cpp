#include "cli/WorkingFolder.hpp"
#include "git/MergeSetup.hpp"
#include "merge/Commands.hpp"
#include "output/Failure.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "project/ProjectFolder.hpp"

namespace projectctl {

namespace {

/// Readies a clone of a repository for work on the project in it.
class SetupCommand : public Command {
public:
    CLI::App* declare(CLI::App& tool) override {
        return tool.add_subcommand("setup",
                                   "Have git merge the project's text by what it says, in this clone of "
                                   "the repository");
    }

    int run() override {
        auto const root = findProjectRoot(workingFolder());
        if (lookForMergeSetup(root) == MergeSetup::NoRepository) {
            throw Failure("\"" + shown(root) +
                          "\" is in no git repository, so that there is nothing to set up");
        }
        setUpMerge(root);
        output().say("git merges the project's text by 'projectctl merge' now.");
        return 0;
    }
};

} // namespace

std::unique_ptr<Command> makeSetupCommand() {
    return std::make_unique<SetupCommand>();
}

} // namespace projectctl
