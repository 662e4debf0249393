#pragma once

#include <string>
#include <vector>

#include "project/core/Export.hpp"

namespace project::management {

class CategoryIdentifier;
class LabelIdentifier;

/// The categories of a project and the labels in each of them. Which file bears which label is the
/// FileManager's.
///
/// Categories and labels are found by their UUID; names matter only where something is created. Queries take
/// the store's read lock, changes its write lock, each for the whole operation.
class PROJECT_MANAGEMENT_EXPORT LabelManager {
public:
    virtual ~LabelManager();

    /// Stores a category under the UUID that it carries.
    /// @throws CategoryExistsByName
    virtual void createCategory(CategoryIdentifier const& category) = 0;

    /// @throws CategoryDoesNotExistsByUUID
    virtual CategoryIdentifier getCategoryByUUID(std::u16string const& uuid) = 0;

    /// Takes the category's labels off all project files, then removes it with its labels. One that does not
    /// exist is no error.
    /// @throws CanNotModifyReadOnlyCategory when the object given says that it is read-only.
    virtual void deleteCategory(CategoryIdentifier const& category) = 0;

    /// Gives the category with this UUID another name, which is not checked. One that does not exist is no
    /// error.
    /// @throws CanNotModifyReadOnlyCategory when the object given says that it is read-only.
    virtual void renameCategory(CategoryIdentifier const& category, std::u16string const& newName) = 0;

    /// All categories, in the store's order.
    virtual std::vector<CategoryIdentifier> getAllCategories() = 0;

    /// Stores a label in a category under the UUID that it carries.
    /// @throws CategoryDoesNotExist, LabelExistsByName
    virtual void createLabel(CategoryIdentifier const& category, LabelIdentifier const& label) = 0;

    /// The labels of a category, in the store's order.
    /// @throws CategoryDoesNotExist, LabelReadOnlyStateUndefined
    virtual std::vector<LabelIdentifier> getLabels(CategoryIdentifier const& category) = 0;

    /// @throws CategoryDoesNotExist, LabelDoesNotExistsByUUID, LabelReadOnlyStateUndefined
    virtual LabelIdentifier getLabelByUUID(CategoryIdentifier const& category, std::u16string uuid) = 0;

    /// Takes the label off all project files, then removes it. One that does not exist is no error.
    /// @throws CanNotModifyReadOnlyLabel when the objects given say that it is read-only.
    virtual void deleteLabel(CategoryIdentifier const& category, LabelIdentifier const& label) = 0;
};

} // namespace project::management
