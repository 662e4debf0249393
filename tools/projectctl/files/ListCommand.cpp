#include <optional>
#include <string>

#include "cli/ArgumentPaths.hpp"
#include "cli/TextArguments.hpp"
#include "cli/WorkingFolder.hpp"
#include "files/Commands.hpp"
#include "output/JsonRows.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "project/FileList.hpp"
#include "project/ProjectCommand.hpp"

namespace projectctl {

namespace {

/// Lists the project's files and folders, all or those below one of them.
class ListCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& tool) override {
        auto* const app = tool.add_subcommand(
            "list", "List the project's files and folders by their paths from the project's root");
        takeText(*app, "PATH", path_, "List this and what is in the project below it; everything by default");
        auto* const tree =
            app->add_flag("--tree", tree_, "As a tree, folders with a slash behind their names");
        auto* const json =
            app->add_flag("--json", json_, "As a JSON array of objects with \"path\" and \"kind\"");
        auto* const null = app->add_flag("-0,--null", null_, "With a zero byte behind each path");
        tree->excludes(json)->excludes(null);
        json->excludes(null);
        return app;
    }

    int run(OpenProject& project) override {
        auto const path = path_ ? ArgumentPaths(workingFolder()).absolute(*path_) : project.root();
        project.warnOfDamage(); // first: it reads the text, and the list needs no second look at the disk
        writeList(project, path);
        return 0;
    }

private:
    void writeList(OpenProject& project, Path const& path) const {
        FileList const list(project);
        project.requireInProject(path);
        if (json_) {
            writeJson(list, path);
        } else if (tree_) {
            writeTree(list, path);
        } else if (null_ || !output().isTerminal()) {
            writePaths(list, path, null_ ? '\0' : '\n');
        } else {
            writeQuoted(list, path);
        }
    }

    static void writePaths(FileList const& list, Path const& from, char end) {
        list.visit(from, [end](FileList::File const& file) {
            appendBytes(output().text(), file.path);
            output().text() += end;
            output().settle();
        });
    }

    static void writeQuoted(FileList const& list, Path const& from) {
        list.visit(from, [](FileList::File const& file) {
            output().name(file.path);
            output().text() += '\n';
            output().settle();
        });
    }

    static void writeTree(FileList const& list, Path const& from) {
        list.visit(from, [](FileList::File const& file) {
            std::u16string_view name = file.path;
            name.remove_prefix(file.depth == 0 ? 0 : name.rfind(u'/') + 1);
            output().text().append(2 * file.depth, ' ');
            output().name(name);
            output().text() += file.kind == Kind::Folder ? "/\n" : "\n";
            output().settle();
        });
    }

    static void writeJson(FileList const& list, Path const& from) {
        JsonRows rows;
        list.visit(from, [&rows](FileList::File const& file) {
            rows.begin();
            rows.addFile(file.path, file.kind);
        });
        rows.finishOutput();
    }

    std::optional<std::string> path_;
    bool tree_ = false;
    bool json_ = false;
    bool null_ = false;
};

} // namespace

std::unique_ptr<Command> makeListCommand() {
    return std::make_unique<ListCommand>();
}

} // namespace projectctl
