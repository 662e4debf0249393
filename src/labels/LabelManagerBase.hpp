#pragma once

#include <memory>
#include <string>
#include <vector>

#include "project/core/FileManager.hpp"
#include "project/core/LabelManager.hpp"
#include "project/metadata/MetadataManager.hpp"

namespace project::management {

/// The categories and labels over a metadata store. Nothing is kept in memory: each call goes to the store.
///
/// Only definitions are kept here. What stands on files is cleaned through the file manager before a
/// definition goes, so that files don't keep labels that nobody can resolve; a label that stands twice on a
/// file is taken off once by deleteLabel, as by FileManager::removeLabels.
class LabelManagerBase : public LabelManager {
public:
    /// Neither store nor file manager is touched.
    /// @param fileManager borrowed; must outlive this object.
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
