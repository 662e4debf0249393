#include "FileAddition.hpp"

#include <map>
#include <memory>
#include <optional>
#include <set>
#include <utility>

#include "project/files/FileMetadataManager.hpp"
#include "project/metadata/MetadataFunctions.hpp"
#include "project/metadata/TreeSchema.hpp"
#include "project/stores/Node.hpp"

namespace project::session {

namespace {

namespace fileSchema = metadata::schema::files;

using Nodes = std::map<Path, std::shared_ptr<metadata::MetadataNode>>;

/// The folders above added paths that have labels, with their nodes. Folders that are added again themselves
/// are not among them.
class LabelledFolders {
public:
    LabelledFolders(std::vector<Path> const& added, management::FileMetadataManager& fileList)
        : added_(added), fileList_(fileList) {}

    Nodes above(Path const& root) {
        std::set<Path> visited;
        for (auto const& path : added_) {
            auto folder = metadata::getParentFolder(path);
            while (metadata::isParent(folder, root) && visited.insert(folder).second) {
                take(folder);
                folder = metadata::getParentFolder(folder);
            }
        }
        return std::move(result_);
    }

private:
    void take(Path const& folder) {
        if (!fileList_.hasFileNode(folder)) {
            return;
        }
        auto node = fileList_.getFileNode(folder);
        if (!metadata::isEqual(*node, *stores::plainNode()) && !isAdded(folder)) {
            result_.emplace(folder, std::move(node));
        }
    }

    bool isAdded(Path const& folder) {
        if (!sorted_) {
            sorted_.emplace(added_.begin(), added_.end());
        }
        return sorted_->contains(folder);
    }

    std::vector<Path> const& added_;
    management::FileMetadataManager& fileList_;
    std::optional<std::set<Path>> sorted_; ///< of the added paths, when first needed
    Nodes result_;
};

} // namespace

void addBelowLabelledFolders(std::vector<Path> const& added, management::FileManager& files) {
    auto const fileList = files.getFileMetadataManagerFor(fileSchema::fileListScope);
    auto folders = LabelledFolders(added, *fileList).above(files.getProjectRoot());
    files.add(added);
    if (!folders.empty()) {
        fileList->setFileNodes(std::move(folders));
    }
}

} // namespace project::session
