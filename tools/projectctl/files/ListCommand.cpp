#include <optional>
#include <string>

#include "cli/PathArguments.hpp"
#include "cli/ShownPaths.hpp"
#include "cli/TextArguments.hpp"
#include "files/Commands.hpp"
#include "output/JsonRows.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "project/FileList.hpp"
#include "project/ProjectCommand.hpp"

namespace projectctl {

namespace {

/// Lists the files and folders of the project, all of them or those below one of them.
class ListCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& tool) override {
        auto* const app = tool.add_subcommand("list", "List the files and folders of the project");
        takeText(*app, "PATH", path_,
                 "List this path and everything in the project below it (default: everything)");
        auto* const tree = app->add_flag("--tree", isTree_, "Write a tree, with a slash after each folder");
        auto* const json =
            app->add_flag("--json", isJson_, "Write a JSON array of objects with \"path\" and \"kind\"");
        auto* const null = app->add_flag("-0,--null", isNullEnded_, "End each path with a zero byte");
        tree->excludes(json)->excludes(null);
        json->excludes(null);
        return app;
    }

    int run(OpenProject& project) override {
        auto const path = path_ ? absolutePath(*path_) : project.root();
        project
            .warnOfDamage(); // first: this reads the text, and the list need not check it for changes again
        FileList const list(project);
        project.requireInProject(path);
        if (isJson_) {
            writeJson(list, path);
        } else if (isTree_) {
            writeTree(list, path, ShownPaths(project.root()));
        } else {
            writePaths(list, path, ShownPaths(project.root()));
        }
        return 0;
    }

private:
    void writePaths(FileList const& list, Path const& from, ShownPaths shown) const {
        list.visit(from, [this, &shown](FileList::File const& file) {
            if (isNullEnded_) {
                appendBytes(output().text(), shown.of(file.path));
                output().text() += '\0';
            } else {
                output().name(shown.of(file.path));
                output().text() += '\n';
            }
            output().flushWhenLarge();
        });
    }

    static void writeTree(FileList const& list, Path const& from, ShownPaths shown) {
        list.visit(from, [&shown](FileList::File const& file) {
            auto name = std::u16string_view(file.path);
            if (file.depth == 0) {
                name = shown.of(name);
            } else {
                name.remove_prefix(name.rfind(u'/') + 1);
            }
            output().text().append(2 * file.depth, ' ');
            output().name(name);
            output().text() += file.kind == Kind::Folder ? "/\n" : "\n";
            output().flushWhenLarge();
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
    bool isTree_ = false;
    bool isJson_ = false;
    bool isNullEnded_ = false;
};

} // namespace

std::unique_ptr<Command> makeListCommand() {
    return std::make_unique<ListCommand>();
}

} // namespace projectctl
