#include <optional>
#include <string>

#include "cli/TextArguments.hpp"
#include "history/ChangeJson.hpp"
#include "history/ChangeText.hpp"
#include "history/Commands.hpp"
#include "history/GitProject.hpp"
#include "project/stores/DefinitionChange.hpp"

namespace projectctl {

namespace {

/// Shows the changes of a project between two commits, or from a commit to the files on disk.
class DiffCommand : public Command {
public:
    CLI::App* declare(CLI::App& tool) override {
        auto* const app = tool.add_subcommand("diff");
        takeText(*app, "A", earlier_);
        takeText(*app, "B", later_);
        app->add_flag("--json", isJson_);
        return app;
    }

    int run() override {
        GitProject const project("DiffOfShared");
        splitRange();
        auto const earlier = project.commit(earlier_.value_or("HEAD"));
        auto const later = later_ ? std::optional(project.commit(*later_)) : std::nullopt;
        auto const changes = project::stores::changesBetween(
            project.textIn(earlier), later ? project.textIn(*later) : project.textOnDisk(),
            project.renamesIn(project.changedFiles(earlier, later)));
        if (isJson_) {
            JsonRows rows(json::diff, "changes");
            addChanges(rows, changes);
            rows.finish();
        } else {
            ChangeText(ShownPaths(project.root()), "").write(changes);
        }
        return 0;
    }

    bool isListing() const override { return true; }

private:
    /// "A..B" is A and B, as for git.
    void splitRange() {
        auto const dots = earlier_ && !later_ ? earlier_->find("..") : std::string::npos;
        if (dots != std::string::npos) {
            later_ = earlier_->substr(dots + 2);
            earlier_ = earlier_->substr(0, dots);
            *later_ += later_->empty() ? "HEAD" : "";
            *earlier_ += earlier_->empty() ? "HEAD" : "";
        }
    }

    std::optional<std::string> earlier_;
    std::optional<std::string> later_;
    bool isJson_ = false;
};

} // namespace

std::unique_ptr<Command> makeDiffCommand() {
    return std::make_unique<DiffCommand>();
}

} // namespace projectctl
