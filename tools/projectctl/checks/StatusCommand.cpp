#include <set>
#include <string>
#include <utility>
#include <vector>

#include "checks/Commands.hpp"
#include "checks/FindingForms.hpp"
#include "checks/MergeSetupCheck.hpp"
#include "checks/Problems.hpp"
#include "checks/RenameForms.hpp"
#include "checks/StatusScan.hpp"
#include "checks/SyncCheck.hpp"
#include "cli/ExitCode.hpp"
#include "cli/ShownPaths.hpp"
#include "files/DiskFolder.hpp"
#include "git/GitIgnore.hpp"
#include "output/Colors.hpp"
#include "output/JsonRows.hpp"
#include "output/Kind.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "output/Progress.hpp"
#include "project/ProjectCommand.hpp"
#include "project/metadata/MetadataFunctions.hpp"
#include "renames/FindRenames.hpp"
#include "renames/SimilarityOption.hpp"

namespace projectctl {

namespace {

/// Shows the differences between the project and the disk, and the problems of the definition.
class StatusCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& tool) override {
        auto* const app = tool.add_subcommand("status");
        app->add_flag("--json", isJson_);
        app->add_flag("--gitignore", leavesOutIgnored_);
        app->add_flag("--exit-code", hasExitCode_);
        auto* const renames = app->add_flag("--renames", showsRenames_);
        declareSimilarity(*app, similarity_)->needs(renames);
        return app;
    }

    int run(OpenProject& project) override {
        root_ = project.root();
        project.warnOfDamage();
        project.warnOfUnfinishedMove();
        auto const scan = compare(project);
        for (auto const& folder : scan.unreadable()) {
            printWarning(Message("AsReported", problemOf(folder)));
        }
        auto const shown = isJson_ ? ShownPaths::fromRoot(root_) : ShownPaths(root_);
        Differences found{leavesOutIgnored_ ? withoutIgnored(scan.added()) : scan.added(), scan.gone(),
                          findProblems(project, shown)};
        append(found.problems, findOutOfDate(project, shown));
        if (project.log() == nullptr) { // git merges no log
            checkMergeSetup(root_, found.problems);
        }
        placeInText(found.problems, project);
        sortByWeight(found.problems);
        if (showsRenames_) {
            found.renames = renamesIn(project);
            leaveOutPaired(found);
        }
        isJson_ ? writeJson(found) : writeLines(found);
        bool const isClean = found.added.empty() && found.gone.empty() && countFaults(found.problems) == 0 &&
                             found.renames.pairs.empty() && found.renames.ambiguous.empty();
        return hasExitCode_ && !isClean ? exit_code::finding : exit_code::done;
    }

    bool isListing() const override { return true; }

private:
    using Files = std::vector<StatusScan::File>;

    struct Differences {
        Files added;
        Files gone;
        Findings problems;
        Renames renames{};
    };

    Renames renamesIn(OpenProject& project) const {
        Progress const progress(Message("ProgressRenames"));
        return findRenames(project, similarity_);
    }

    /// Files that are paired are neither new nor gone.
    void leaveOutPaired(Differences& found) const {
        std::set<std::u16string> earlier;
        std::set<std::u16string> later;
        for (auto const& rename : found.renames.pairs) {
            earlier.insert(rename.from);
            later.insert(rename.to);
        }
        auto const leaveOut = [this](Files& files, std::set<std::u16string> const& paired) {
            std::erase_if(files, [&](StatusScan::File const& file) {
                return paired.contains(project::metadata::getRelativePath(root_, file.path));
            });
        };
        leaveOut(found.gone, earlier);
        leaveOut(found.added, later);
    }

    static StatusScan compare(OpenProject& project) {
        Progress progress(Message("ProgressStatus"));
        StatusScan scan(project);
        scan.run(progress);
        return scan;
    }

    Files withoutIgnored(Files const& files) const {
        std::vector<Path> paths;
        for (auto const& file : files) {
            paths.push_back(file.path);
        }
        auto const kept = withoutIgnoredByGit(root_, std::move(paths));
        Files result;
        for (auto const& file : files) {
            if (result.size() < kept.size() && file.path == kept[result.size()]) { // in the same order
                result.push_back(file);
            }
        }
        return result;
    }

    void writeLines(Differences const& found) const {
        writeLines(colored(Color::New, Message("StatusNew").text()), found.added, true);
        writeLines(colored(Color::Gone, Message("StatusGone").text()), found.gone, false);
        writeRenameLines(found.renames, ShownPaths(root_));
        auto const bad = colored(Color::Fault, Message("StatusBad").text());
        auto const note = colored(Color::Note, Message("StatusNote").text());
        for (auto const& problem : found.problems) {
            output().text() +=
                (problem.isFault() ? bad : note) + ' ' + withoutControls(problem.text, false) + '\n';
        }
        if (found.added.empty() && found.gone.empty() && found.problems.empty() && found.renames.isEmpty()) {
            output().say(Message("SameFiles"));
        }
    }

    /// @param hasSlashes whether folders end with a slash, because they are shown without their contents.
    void writeLines(std::string const& word, Files const& files, bool hasSlashes) const {
        ShownPaths shown(root_);
        for (auto const& file : files) {
            std::u16string path(shown.ofAbsolute(file.path));
            path += hasSlashes && file.kind == Kind::Folder ? u"/" : u"";
            output().text() += word + ' ';
            output().name(path);
            output().text() += '\n';
            output().flushWhenLarge();
        }
    }

    void writeJson(Differences const& found) const {
        JsonDocument document(showsRenames_ ? json::statusRenames : json::status);
        document.addKey("new");
        writeJson(found.added);
        document.addKey("gone");
        writeJson(found.gone);
        if (showsRenames_) {
            document.addKey("renames");
            writeRenameRows(found.renames);
        }
        addFindings(document, found.problems);
        document.finish();
    }

    void writeJson(Files const& files) const {
        JsonRows rows;
        for (auto const& file : files) {
            rows.begin();
            rows.addFile(project::metadata::getRelativePath(root_, file.path), file.kind);
        }
        rows.finish();
    }

    Path root_;
    bool isJson_ = false;
    bool leavesOutIgnored_ = false;
    bool hasExitCode_ = false;
    bool showsRenames_ = false;
    int similarity_ = usualSimilarity;
};

} // namespace

std::unique_ptr<Command> makeStatusCommand() {
    return std::make_unique<StatusCommand>();
}

} // namespace projectctl
