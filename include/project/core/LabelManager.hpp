#pragma once

#include <string>
#include <vector>

#include "project/core/Export.hpp"

namespace project::management {

class CategoryIdentifier;
class LabelIdentifier;

/// The categories of a project and the labels in each of them. The FileManager stores the labels of each
/// file.
///
/// Categories and labels are identified by UUID; names are compared only when something is created. A query
/// holds the store's read lock for the whole operation, a change its write lock.
class PROJECT_MANAGEMENT_EXPORT LabelManager {
public:
    virtual ~LabelManager();

    /// Stores a category under its UUID. If a category with this UUID is stored, the new one replaces it and
    /// keeps its labels: this is deliberate, and the only way to change the flags of a category.
    /// @throws CategoryExistsByName if a category has this name.
    virtual void createCategory(CategoryIdentifier const& category) = 0;

    /// Returns the category with this UUID.
    /// @throws CategoryDoesNotExistsByUUID if it is not stored.
    virtual CategoryIdentifier getCategoryByUUID(std::u16string const& uuid) = 0;

    /// Removes the category's labels from all files of the project, then the category with its labels. A
    /// category that is not stored is not an error.
    /// @throws CanNotModifyReadOnlyCategory if the given object says that it is read-only. The stored
    ///         category is deliberately not checked: a client that manages read-only categories passes a
    ///         writable object.
    virtual void deleteCategory(CategoryIdentifier const& category) = 0;

    /// Stores another name for the category with this UUID. Another category may have the same name. A
    /// category that is not stored is not an error.
    /// @throws CanNotModifyReadOnlyCategory if the given object says that it is read-only.
    virtual void renameCategory(CategoryIdentifier const& category, std::u16string const& newName) = 0;

    /// Returns all categories, sorted by UUID.
    virtual std::vector<CategoryIdentifier> getAllCategories() = 0;

    /// Stores a label in a category under its UUID. Read-only categories accept new labels too.
    /// @throws CategoryDoesNotExist if the category is not stored.
    /// @throws LabelExistsByName if a label of the category has this name.
    /// @throws LabelReadOnlyStateUndefined if a stored label of the category has an unknown state.
    /// @throws std::out_of_range if the label's own state is not a LabelReadOnlyState.
    virtual void createLabel(CategoryIdentifier const& category, LabelIdentifier const& label) = 0;

    /// Returns the labels of a category, sorted by UUID.
    /// @throws CategoryDoesNotExist if the category is not stored.
    /// @throws LabelReadOnlyStateUndefined if a label has an unknown state.
    virtual std::vector<LabelIdentifier> getLabels(CategoryIdentifier const& category) = 0;

    /// Returns the label of a category with this UUID.
    /// @throws CategoryDoesNotExist if the category is not stored.
    /// @throws LabelDoesNotExistsByUUID if the category does not contain the label.
    /// @throws LabelReadOnlyStateUndefined if the label has an unknown state.
    virtual LabelIdentifier getLabelByUUID(CategoryIdentifier const& category, std::u16string uuid) = 0;

    /// Removes the label from all files of the project, then the label itself. A label that is not stored is
    /// not an error.
    /// @throws CanNotModifyReadOnlyLabel if the given objects say that it is read-only.
    virtual void deleteLabel(CategoryIdentifier const& category, LabelIdentifier const& label) = 0;
};

} // namespace project::management
