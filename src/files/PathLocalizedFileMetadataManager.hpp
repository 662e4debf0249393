#pragma once

#include <string>

#include "project/files/FileMetadataManager.hpp"

namespace project::management {

/// Lays the files of one scope out in the metadata tree as they lie in the folders below the project root:
/// the address of a file's node is computed from its path, and nothing is looked up or cached.
///
/// The address is ("Files", scope), then ("File", name) for each element of the path relative to the root.
class PathLocalizedFileMetadataManager : public FileMetadataManager {
public:
    using MetadataPath = metadata::MetadataPath;
    using MetadataNode = metadata::MetadataNode;

    /// Stores copies of the three; asks neither the store nor the disk.
    PathLocalizedFileMetadataManager(Path root, std::shared_ptr<metadata::MetadataManager> metadataManager,
                                     std::u16string scope);

    void setFileNodes(std::map<Path, std::shared_ptr<MetadataNode>> files) override;
    std::map<Path, std::unique_ptr<MetadataNode>> getAllFileNodes() override;
    std::unique_ptr<MetadataNode> getFileNode(Path file) override;
    bool hasFileNode(Path file) override;
    void removeFileNodes(std::vector<Path> files) override;
    std::vector<Path> getExtraEntries() override;
    std::vector<Path> getChildFiles(Path file) override;

    /// The address of a file. Pure text work: no lock, no check. A path outside the root gets the address
    /// that its relative form spells.
    MetadataPath toMetadataPath(Path const& file) const;

    /// The file of an address, whatever the types of its elements; the root for the scope's head.
    Path toFilePath(MetadataPath const& path) const;

    /// True when a node is stored at the address and its last element denotes a file. Takes the read lock.
    bool isFileMetadataPath(MetadataPath const& path);

    /// Adds a file's node to a batch, and the marker when it is a folder on disk now. Takes the write lock.
    void addFileNode(Path const& file, std::shared_ptr<MetadataNode> node,
                     std::map<MetadataPath, std::shared_ptr<MetadataNode>>& batch);

private:
    Path root_;
    std::shared_ptr<metadata::MetadataManager> metadataManager_;
    std::u16string scope_;
};

} // namespace project::management
