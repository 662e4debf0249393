#include "FileTree.hpp"

#include <algorithm>

#include <project/metadata/MetadataFunctions.hpp>

namespace project_panel {

using project::session::FileKind;

void FileTree::read() {
    auto const guard = session_.store().acquireReadLock(); // the list and the labels are of one state
    files_ = session_.find({});
    readLabelNames();
    showRows();
}

void FileTree::readLabelNames() {
    labelNames_.clear();
    auto& labels = session_.project().getLabelManager();
    for (auto const& category : labels.getAllCategories()) {
        for (auto const& label : labels.getLabels(category)) {
            labelNames_.emplace(label.getUUID(), category.getName() + u": " + label.getName());
        }
    }
}

void FileTree::showRows() {
    rows_.clear();
    Path hidden; // the folded folder whose contents are being skipped; a folder comes before its contents
    for (auto const& file : files_) {
        if (!hidden.empty() && project::metadata::isParent(file.path, hidden)) {
            continue;
        }
        auto const relative = project::metadata::getRelativePath(session_.root(), file.path);
        auto const depth = static_cast<std::size_t>(std::count(relative.begin(), relative.end(), u'/'));
        rows_.push_back(
            {file.path, relative.substr(relative.rfind(u'/') + 1), depth, file.kind == FileKind::Folder});
        hidden = isFolded(rows_.back()) ? file.path : Path();
    }
}

void FileTree::setFolded(Row const& row, bool folded) {
    if (!row.isFolder) {
        return;
    }
    if (folded) {
        folded_.insert(row.path);
    } else {
        folded_.erase(row.path);
    }
    showRows();
}

std::vector<std::u16string> FileTree::labelsOf(Row const& row) const {
    auto& files = session_.project().getFileManager();
    auto const guard = session_.store().acquireReadLock(); // the file stays in the project between the two
    std::vector<std::u16string> names;
    if (!files.isFileInProject(row.path)) {
        return names; // removed a moment ago: the next check for changes reports it
    }
    for (auto const& label : files.getLabelIDSets(row.path)) {
        auto const name = labelNames_.find(label.getLabelUUID());
        if (name != labelNames_.end()) { // not a label that was deleted
            names.push_back(name->second);
        }
    }
    std::sort(names.begin(), names.end());
    return names;
}

} // namespace project_panel
