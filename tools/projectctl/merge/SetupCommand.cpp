#include "cli/WorkingFolder.hpp"
#include "git/DiffSetup.hpp"
#include "git/MergeSetup.hpp"
#include "merge/Commands.hpp"
#include "output/Failure.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "project/ProjectFolder.hpp"

namespace projectctl {

namespace {

/// Configures a clone of a repository to merge the project's text with this tool.
class SetupCommand : public Command {
public:
    CLI::App* declare(CLI::App& tool) override {
        auto* const app = tool.add_subcommand("setup");
        auto* const diff = app->add_flag("--diff", showsWords_);
        app->add_flag("--no-diff", showsLines_)->excludes(diff);
        return app;
    }

    int run() override {
        auto const root = findProjectRoot(workingFolder());
        if (isShared(root)) {
            throw Failure(Message("SetupOfShared"));
        }
        if (mergeSetupOf(root) == MergeSetup::NoRepository) {
            throw Failure(Message("NotInRepository", shown(root)));
        }
        setUpMerge(root);
        output().say(Message("MergeSetUp"));
        if (showsWords_) {
            setUpDiff(root);
        }
        if (showsLines_) {
            removeDiffSetup(root);
        }
        return 0;
    }

private:
    bool showsWords_ = false;
    bool showsLines_ = false;
};

} // namespace

std::unique_ptr<Command> makeSetupCommand() {
    return std::make_unique<SetupCommand>();
}

} // namespace projectctl
