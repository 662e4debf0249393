#include <string>
#include <utility>
#include <vector>

#include "Commands.hpp"
#include "GitIgnore.hpp"
#include "NameForms.hpp"
#include "OpenProject.hpp"
#include "Output.hpp"
#include "Progress.hpp"
#include "StatusScan.hpp"
#include "project/metadata/MetadataFunctions.hpp"

namespace projectctl {

namespace {

/// Tells in what the project and the disk differ.
class StatusCommand : public Command {
public:
    CLI::App* declare(CLI::App& tool) override {
        auto* const app = tool.add_subcommand(
            "status", "Tell what is new on disk and not in the project, and what is in the project and gone");
        app->add_flag("--json", json_, "As a JSON object with the arrays \"new\" and \"gone\"");
        app->add_flag("--gitignore", gitignore_, "Leave out what git ignores");
        return app;
    }

    int run() override {
        auto project = OpenProject::ofWorkingFolder();
        root_ = project.root();
        project.warnOfDamage();
        auto const scan = compare(project);
        for (auto const& line : scan.unreadable()) {
            printError("warning: " + line);
        }
        auto const added = gitignore_ ? withoutIgnored(scan.added()) : scan.added();
        json_ ? writeJson(added, scan.gone()) : writeLines(added, scan.gone());
        return 0;
    }

private:
    static StatusScan compare(OpenProject& project) {
        Progress progress("Comparing the project with the disk");
        StatusScan scan(project);
        scan.run(progress);
        return scan;
    }

    using Files = std::vector<StatusScan::File>;

    Files withoutIgnored(Files const& files) const {
        std::vector<Path> paths;
        for (auto const& file : files) {
            paths.push_back(file.path);
        }
        auto const kept = withoutIgnoredByGit(root_, std::move(paths));
        Files result;
        for (auto const& file : files) {
            if (result.size() < kept.size() && file.path == kept[result.size()]) { // they keep their order
                result.push_back(file);
            }
        }
        return result;
    }

    void writeLines(Files const& added, Files const& gone) const {
        writeLines("new  ", added, true);
        writeLines("gone ", gone, false);
        if (added.empty() && gone.empty()) {
            output().say("The project and the disk hold the same files.");
        }
    }

    /// @param standsForContents whether a folder is shown alone instead of what is in it.
    void writeLines(char const* word, Files const& files, bool standsForContents) const {
        for (auto const& file : files) {
            std::string path;
            appendBytes(path, project::metadata::getRelativePath(root_, file.path));
            path += standsForContents && file.kind == Kind::Folder ? "/" : "";
            output().text() += word;
            if (output().isTerminal()) {
                appendQuoted(output().text(), path);
            } else {
                output().text() += path;
            }
            output().text() += '\n';
            output().settle();
        }
    }

    void writeJson(Files const& added, Files const& gone) const {
        output().text() += "{\"new\": ";
        writeJson(added);
        output().text() += ",\n\"gone\": ";
        writeJson(gone);
        output().text() += "}\n";
    }

    void writeJson(Files const& files) const {
        char const* separator = "[\n";
        for (auto const& file : files) {
            output().text() += separator;
            appendJsonEntry(output().text(), project::metadata::getRelativePath(root_, file.path), file.kind);
            output().settle();
            separator = ",\n";
        }
        output().text() += files.empty() ? "[]" : "\n]";
    }

    Path root_;
    bool json_ = false;
    bool gitignore_ = false;
};

} // namespace

std::unique_ptr<Command> makeStatusCommand() {
    return std::make_unique<StatusCommand>();
}

} // namespace projectctl
