#include "output/Output.hpp"
#include "output/Progress.hpp"
#include "project/Commands.hpp"
#include "project/ProjectCommand.hpp"

namespace projectctl {

namespace {

/// Rewrites the text in its canonical form, so that a commit contains only real changes.
class TidyCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& tool) override { return tool.add_subcommand("tidy"); }

    int run(OpenProject& project) override {
        Progress const progress(Message("ProgressTidy"));
        project.shield().raise();
        if (auto* const log = project.log()) {
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
};

} // namespace

std::unique_ptr<Command> makeTidyCommand() {
    return std::make_unique<TidyCommand>();
}

} // namespace projectctl
