#pragma once

#include <memory>
#include <vector>

#include "files/PathLocalizedFileMetadataManager.hpp"
#include "project/core/EntryPointManager.hpp"
#include "project/core/FileManager.hpp"
#include "project/core/LabelManager.hpp"

namespace project::management {

/// The file list over a metadata store. It keeps nothing in memory: a file is in the project if the store has
/// a node for it, or if it is the root.
///
/// The entry point manager and the label manager need the file manager themselves. They are therefore set
/// after construction, before the first call of remove and of the label operations.
class FileManagerBase : public FileManager {
public:
    FileManagerBase(Path projectRoot, std::shared_ptr<metadata::MetadataManager> metadataManager);
    ~FileManagerBase() override;

    /// Sets the manager that remove uses. It must outlive this object.
    void setEntryPointManager(EntryPointManager* entryPointManager);

    /// Sets the manager that the label operations use. It must outlive this object.
    void setLabelManager(LabelManager* labelManager);

    Path getProjectRoot() override;
    std::unique_ptr<FileMetadataManager> getFileMetadataManagerFor(std::u16string const& scope) override;
    void add(std::vector<Path> const& files) override;
    bool isFileInProject(Path const& path) const override;
    std::vector<Path> remove(std::vector<Path> const& files) override;
    std::vector<Path> getChildProjectFiles(Path const& path) const override;
    std::vector<Path> getProjectFiles() const override;

    // The label operations are defined in FileManagerLabels.cpp.
    std::vector<FileLabel> addLabels(std::vector<Path> const& files,
                                     std::vector<Label> const& labels) override;
    void removeLabels(std::vector<Path> const& files, std::vector<Label> const& labels) override;
    std::vector<LabelIDSet> getLabelIDSets(Path const& path) override;
    std::vector<FileLabel> getLabels(Path const& path) override;
    void removeCategory(std::vector<Path> const& files, CategoryIdentifier const& category) override;

private:
    using MetadataNode = metadata::MetadataNode;
    using FileNodes = std::map<Path, std::shared_ptr<MetadataNode>>;

    bool isMetadataFile(Path const& path) const;
    void requireAddable(Path const& path) const;
    void requireRemovable(std::vector<Path> const& files) const;
    std::vector<Path> withAllDescendants(std::vector<Path> const& files) const;

    /// @param files in Path order.
    void removeEntryPointsOf(std::vector<Path> const& files);
    void removeFromEveryScope(std::vector<Path> const& files);

    bool hasLabel(Path const& path, Label const& label);
    std::vector<FileLabel> addLabelToNode(MetadataNode& node, Label const& label, Path const& path);
    std::vector<FileLabel> takeCategoryLabels(CategoryIdentifier const& category, Path const& path,
                                              MetadataNode& categoryNode);
    metadata::MetadataPath getLabelDataPath(Path const& path) const;
    std::unique_ptr<MetadataNode> getLabelDataNode(Path const& path) const;
    void writeLabelDataNodes(FileNodes const& nodes);

    Path projectRoot_;
    std::shared_ptr<metadata::MetadataManager> metadataManager_;
    EntryPointManager* entryPointManager_ = nullptr;
    LabelManager* labelManager_ = nullptr;
    std::unique_ptr<PathLocalizedFileMetadataManager> fileStore_;
};

} // namespace project::management
