#pragma once

#include <map>
#include <memory>
#include <vector>

#include "project/core/Export.hpp"
#include "project/metadata/MetadataManager.hpp"

namespace project::management {

using metadata::Path;

/// Keeps one metadata node for each project file, in a scope of its own.
///
/// Paths are absolute and in the form of the project root. Each operation takes the store's lock for its
/// whole length, to write in setFileNodes and removeFileNodes, else to read.
class PROJECT_MANAGEMENT_EXPORT FileMetadataManager {
public:
    virtual ~FileMetadataManager();

    /// Replaces the nodes of all the files, in one write of the store also when there are none. Folders on
    /// disk get a marker beside their node; costs one stat for each file.
    virtual void setFileNodes(std::map<Path, std::shared_ptr<metadata::MetadataNode>> files) = 0;

    /// Every file of the scope that has a node, the root folder included.
    virtual std::map<Path, std::unique_ptr<metadata::MetadataNode>> getAllFileNodes() = 0;

    /// A copy of a file's node.
    /// @throws FileNotInProject when it has none.
    virtual std::unique_ptr<metadata::MetadataNode> getFileNode(Path file) = 0;

    virtual bool hasFileNode(Path file) = 0;

    /// Removes the nodes of files and all that lies below them, in one write of the store; files without a
    /// node are passed over.
    virtual void removeFileNodes(std::vector<Path> files) = 0;

    /// Nothing, for every scope there is.
    virtual std::vector<Path> getExtraEntries() = 0;

    /// The files directly below a path, in the store's order; empty when there are none.
    virtual std::vector<Path> getChildFiles(Path file) = 0;
};

} // namespace project::management
