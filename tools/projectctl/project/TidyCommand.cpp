#include "output/Output.hpp"
#include "output/Progress.hpp"
#include "project/Commands.hpp"
#include "project/ProjectCommand.hpp"

namespace projectctl {

namespace {

/// Rewrites the text in its canonical form, so that a commit contains only real changes. Of the personal
/// text, it also deletes the labels of files that are not in the project.
class TidyCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& tool) override {
        auto* const app = tool.add_subcommand("tidy");
        app->add_flag("--personal", isPersonal_);
        return app;
    }

    int run(OpenProject& project) override {
        Progress const progress(Message("ProgressTidy"));
        project.shield().raise();
        if (isPersonal_) {
            tidyPersonal(project);
        } else if (auto* const log = project.log()) {
            output().say(Message(log->tidy() ? "LogTidied" : "LogIsTidy"));
        } else if (project.text().tidy()) {
            project.stageLater();
            output().say(Message("TextTidied"));
        } else {
            output().say(Message("TextIsTidy"));
        }
        return 0;
    }

    bool canRunInBatch() const override { return false; }

private:
    static void tidyPersonal(OpenProject& project) {
        auto const removed = project.personal().removeHidden();
        project.access().personalText().tidy();
        output().say(Message("PersonalTidied", removed.size()));
    }

    bool isPersonal_ = false;
};

} // namespace

std::unique_ptr<Command> makeTidyCommand() {
    return std::make_unique<TidyCommand>();
}

} // namespace projectctl
