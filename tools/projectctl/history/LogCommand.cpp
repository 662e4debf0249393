#include <optional>
#include <string>
#include <vector>

#include "cli/PathArguments.hpp"
#include "cli/TextArguments.hpp"
#include "history/ChangeJson.hpp"
#include "history/ChangeText.hpp"
#include "history/Commands.hpp"
#include "history/CommitChanges.hpp"
#include "history/PathHistory.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "project/metadata/MetadataFunctions.hpp"

namespace projectctl {

namespace {

using Changes = CommitChanges::Changes;

/// Shows the commits that changed the project, each with its changes.
class LogCommand : public Command {
public:
    CLI::App* declare(CLI::App& tool) override {
        auto* const app = tool.add_subcommand("log");
        completes(takeText(*app, "PATH", path_), Completes::ProjectPaths);
        app->add_option("--count", count_)->check(CLI::Range(1, most));
        app->add_flag("--json", isJson_);
        return app;
    }

    int run() override {
        GitProject const project("LogOfShared");
        std::optional<PathHistory> path;
        if (path_) {
            path.emplace(project::metadata::getRelativePath(project.root(), absolutePath(*path_)));
        }
        ChangeText text(ShownPaths(project.root()), "    ");
        JsonRows rows(json::log, "commits");
        int remaining = count_.value_or(most);
        CommitChanges(project).forEach([&](LoggedCommit const& commit, Changes const& all) {
            auto const changes = path ? path->takeFrom(all) : all;
            if (path && changes.empty()) {
                return true;
            }
            if (isJson_) {
                addCommit(rows, commit, changes);
            } else {
                writeHead(commit);
                text.write(changes);
            }
            return --remaining > 0;
        });
        if (isJson_) {
            rows.finish();
        }
        return 0;
    }

    bool isListing() const override { return true; }

private:
    static constexpr int most = 1'000'000'000;

    static void addCommit(JsonRows& rows, LoggedCommit const& commit, Changes const& changes) {
        std::vector<std::u16string> parents;
        for (auto const& parent : commit.parents) {
            parents.push_back(textOf(parent));
        }
        rows.begin();
        rows.addText("commit", textOf(commit.id));
        rows.addList("parents", parents);
        rows.addText("author", textOf(commit.author));
        rows.addText("time", textOf(commit.time));
        rows.addText("subject", textOf(commit.subject));
        rows.addKey("changes");
        JsonRows ofCommit;
        addChanges(ofCommit, changes);
        ofCommit.finish();
    }

    /// "1a2b3c4d5e 2026-11-22 Ada Lovelace: the subject"
    static void writeHead(LoggedCommit const& commit) {
        constexpr std::size_t shortId = 10;
        constexpr std::size_t day = 10;
        output().text() += commit.id.substr(0, shortId) + ' ' + commit.time.substr(0, day) + ' ' +
                           withoutControls(commit.author + ": " + commit.subject, false) + '\n';
    }

    std::optional<std::string> path_;
    std::optional<int> count_;
    bool isJson_ = false;
};

} // namespace

std::unique_ptr<Command> makeLogCommand() {
    return std::make_unique<LogCommand>();
}

} // namespace projectctl
