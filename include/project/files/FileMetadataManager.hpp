#pragma once

#include <map>
#include <memory>
#include <vector>

#include "project/core/Export.hpp"
#include "project/metadata/MetadataManager.hpp"

namespace project::management {

using metadata::Path;

/// Stores one metadata node for each file, in a scope of its own.
///
/// Paths are absolute and in the form of the project's root. setFileNodes and removeFileNodes hold the
/// store's write lock for the whole operation, all other operations but getExtraEntries its read lock.
class PROJECT_MANAGEMENT_EXPORT FileMetadataManager {
public:
    virtual ~FileMetadataManager();

    /// Stores the nodes of the files in one batch, which is written also if it is empty. A node that a file
    /// has is replaced. A path that is a folder on disk also gets the marker of a folder. Makes one system
    /// call for each file.
    virtual void setFileNodes(std::map<Path, std::shared_ptr<metadata::MetadataNode>> files) = 0;

    /// Returns copies of the nodes of all files of the scope, the root folder included.
    virtual std::map<Path, std::unique_ptr<metadata::MetadataNode>> getAllFileNodes() = 0;

    /// Returns a copy of a file's node, which the caller owns.
    /// @throws FileNotInProject if the file has no node.
    virtual std::unique_ptr<metadata::MetadataNode> getFileNode(Path file) = 0;

    /// Returns true if the file has a node.
    virtual bool hasFileNode(Path file) = 0;

    /// Removes the nodes of the files and everything below them in one batch. Files without a node are
    /// skipped.
    virtual void removeFileNodes(std::vector<Path> files) = 0;

    /// Returns an empty list, deliberately: in this layout a scope has no entries besides its files. Takes no
    /// lock.
    virtual std::vector<Path> getExtraEntries() = 0;

    /// Returns the files of the scope directly below a path, by name in code units. The list may be empty.
    virtual std::vector<Path> getChildFiles(Path file) = 0;
};

} // namespace project::management
