#include "project/FoundFiles.hpp"

#include "cli/ShownPaths.hpp"
#include "output/JsonRows.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "project/FileTreeForm.hpp"

namespace projectctl {

using project::session::Query;

namespace {

void writeJson(FileList const& files, Query const& query) {
    JsonRows rows(json::list, "files");
    files.visit(query, [&rows](FileList::File const& file) {
        rows.begin();
        rows.addFile(file.path, file.kind);
    });
    rows.finish();
}

} // namespace

void FoundFiles::declare(CLI::App& app, bool hasTree) {
    auto* const tree = hasTree ? app.add_flag("--tree", isTree_) : nullptr;
    auto* const json = app.add_flag("--json", isJson_);
    auto* const null = app.add_flag("-0,--null", isNullEnded_);
    json->excludes(null);
    if (hasTree) {
        tree->excludes(json)->excludes(null);
    }
}

void FoundFiles::write(OpenProject& project, FileList const& files, Query const& query) const {
    if (isJson_) {
        writeJson(files, query);
    } else if (isTree_) {
        FileTreeForm tree{ShownPaths(project.root())};
        files.visit(query, [&tree](FileList::File const& file) { tree.write(file); });
    } else {
        writePaths(project, files, query);
    }
}

void FoundFiles::writePaths(OpenProject& project, FileList const& files, Query const& query) const {
    ShownPaths shown(project.root());
    files.visit(query, [this, &shown](FileList::File const& file) {
        auto const path = shown.of(file.path);
        if (isNullEnded_) {
            appendBytes(output().text(), path);
            output().text() += '\0';
        } else {
            output().name(path);
            output().text() += '\n';
        }
        output().flushWhenLarge();
    });
}

} // namespace projectctl
