#pragma once

#include <cstddef>
#include <map>
#include <set>
#include <string>
#include <vector>

#include <project/session.hpp>

namespace project_panel {

using fl::filesystem::Path;

/// A file or folder of the project, as it is shown.
struct Row {
    Path path;
    std::u16string name;
    std::size_t depth; ///< number of folders between it and the root
    bool isFolder;
};

/// The files of a project as rows, without those in folded folders.
class FileTree {
public:
    explicit FileTree(project::session::Session& session) : session_(session) { read(); }

    /// Reads the file list and the names of the labels again. Folders stay folded.
    void read();

    std::vector<Row> const& rows() const noexcept { return rows_; }

    bool isFolded(Row const& row) const { return folded_.contains(row.path); }

    /// Folds a folder or unfolds it. A file is left alone.
    void setFolded(Row const& row, bool folded);

    /// The names of the labels on a file, sorted, with their categories.
    std::vector<std::u16string> labelsOf(Row const& row) const;

private:
    void readLabelNames();
    void showRows();

    project::session::Session& session_;
    std::vector<project::session::FoundFile> files_;
    std::map<std::u16string, std::u16string> labelNames_; ///< by UUID
    std::set<Path> folded_;
    std::vector<Row> rows_;
};

} // namespace project_panel
