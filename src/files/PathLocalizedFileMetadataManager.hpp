#pragma once

#include <string>

#include "project/files/FileMetadataManager.hpp"

namespace project::management {

/// Stores the files of one scope in the metadata tree in the shape of the folders below the project's root.
/// The address of a file's node is computed from its path; nothing is looked up.
///
/// The address is ("Files", scope), then ("File", name) for each element of the path relative to the root.
class PathLocalizedFileMetadataManager : public FileMetadataManager {
public:
    using MetadataPath = metadata::MetadataPath;
    using MetadataNode = metadata::MetadataNode;

    /// Accesses neither the store nor the disk.
    PathLocalizedFileMetadataManager(Path root, std::shared_ptr<metadata::MetadataManager> metadataManager,
                                     std::u16string scope);
    ~PathLocalizedFileMetadataManager() override;

    void setFileNodes(std::map<Path, std::shared_ptr<MetadataNode>> files) override;
    std::map<Path, std::unique_ptr<MetadataNode>> getAllFileNodes() override;
    std::unique_ptr<MetadataNode> getFileNode(Path file) override;
    bool hasFileNode(Path file) override;
    void removeFileNodes(std::vector<Path> files) override;
    std::vector<Path> getExtraEntries() override;
    std::vector<Path> getChildFiles(Path file) override;

    /// Returns the same as hasFileNode, and does not copy the path. Takes the read lock.
    bool isFile(Path const& path);

    /// Returns the same as getChildFiles, and does not copy the path. Takes the read lock.
    std::vector<Path> childFiles(Path const& file);

    /// Returns the address of a file, from the text alone, without lock or check. The address of a path
    /// outside the root has a step for each ".." of its relative form.
    MetadataPath toMetadataPath(Path const& file) const;

    /// Returns the path for an address, whatever the types of its steps; the root for the scope's first step.
    Path toFilePath(MetadataPath const& path) const;

    /// Returns true if the address has a node and its last step has the type of a file or of a scope. Takes
    /// the read lock.
    bool isFileMetadataPath(MetadataPath const& path);

    /// Adds a file's node to a batch, and the marker if the path is a folder on disk. Takes the write lock.
    void addFileNode(Path const& file, std::shared_ptr<MetadataNode> node,
                     std::map<MetadataPath, std::shared_ptr<MetadataNode>>& batch);

private:
    /// The last address that was computed. Most files are next to the previous one, and then all steps but
    /// the last one are shared.
    class LastAddress;

    Path root_;
    std::shared_ptr<metadata::MetadataManager> metadataManager_;
    std::u16string scope_;
    std::unique_ptr<LastAddress> lastAddress_;
};

} // namespace project::management
