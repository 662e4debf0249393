#pragma once

#include <memory>
#include <string>
#include <vector>

#include "project/core/FileManager.hpp"
#include "project/core/LabelManager.hpp"
#include "project/metadata/MetadataManager.hpp"

namespace project::management {

/// The categories and labels over a metadata store. It keeps nothing in memory: each call reads the store.
///
/// This manager stores definitions only. Before it removes one, it removes the labels from the files through
/// the file manager, so that files do not keep labels that cannot be resolved. A label that a file has twice
/// is removed once by deleteLabel, as by FileManager::removeLabels.
class LabelManagerBase : public LabelManager {
public:
    /// Accesses neither the store nor the file manager.
    /// @param fileManager must outlive this object.
    LabelManagerBase(std::shared_ptr<metadata::MetadataManager> metadataManager, FileManager* fileManager);

    void createCategory(CategoryIdentifier const& category) override;
    CategoryIdentifier getCategoryByUUID(std::u16string const& uuid) override;
    void deleteCategory(CategoryIdentifier const& category) override;
    void renameCategory(CategoryIdentifier const& category, std::u16string const& newName) override;
    std::vector<CategoryIdentifier> getAllCategories() override;
    void createLabel(CategoryIdentifier const& category, LabelIdentifier const& label) override;
    std::vector<LabelIdentifier> getLabels(CategoryIdentifier const& category) override;
    LabelIdentifier getLabelByUUID(CategoryIdentifier const& category, std::u16string uuid) override;
    void deleteLabel(CategoryIdentifier const& category, LabelIdentifier const& label) override;

private:
    using MetadataPath = metadata::MetadataPath;

    bool isCategoryPath(MetadataPath const& path);
    CategoryIdentifier readCategory(MetadataPath const& path);
    LabelIdentifier readLabel(MetadataPath const& path);
    MetadataPath requireCategoryPath(CategoryIdentifier const& category);
    void requireCategoryNameFree(std::u16string const& name);
    void requireLabelNameFree(CategoryIdentifier const& category, std::u16string const& name);
    void write(MetadataPath const& path, std::shared_ptr<metadata::MetadataNode> node);
    void remove(MetadataPath const& path);

    std::shared_ptr<metadata::MetadataManager> metadataManager_;
    FileManager* fileManager_;
};

} // namespace project::management
