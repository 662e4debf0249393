#pragma once

#include <optional>
#include <string>

#include "project/core/LabelManager.hpp"
#include "project/labels/CategoryIdentifier.hpp"
#include "project/labels/Label.hpp"
#include "project/labels/LabelIdentifier.hpp"
#include "project/session/Query.hpp"

namespace projectctl {

/// Finds categories and labels by their names, or by their UUIDs.
///
/// A caller that changes the result holds a guard of the store from before the search until after the change.
class LabelNames {
public:
    /// @param labels borrowed.
    explicit LabelNames(project::management::LabelManager& labels) : labels_(labels) {}

    /// @param name bytes of an argument.
    /// @throws CategoryDoesNotExist, CategoryDoesNotExistsByUUID; Failure if several categories have the
    /// name.
    project::management::CategoryIdentifier category(std::string const& name);

    /// A label of a category.
    /// @throws the same errors as category(); LabelDoesNotExistsByUUID; Failure if no label or several labels
    ///         have the name.
    project::management::Label label(std::string const& category, std::string const& name);

    /// A label, or any label of a category if no label is given, as a condition of a query.
    /// @throws the same errors as category() and label().
    project::session::LabelChoice choice(std::string const& category,
                                         std::optional<std::string> const& label);

    /// The same as label(), but UUIDs are accepted even if the label or its category was deleted. Files may
    /// still have such a label.
    project::management::Label labelEvenIfDeleted(std::string const& category, std::string const& name);

private:
    std::optional<project::management::CategoryIdentifier> find(std::u16string const& category);
    std::optional<project::management::LabelIdentifier>
    find(project::management::CategoryIdentifier const& category, std::u16string const& label);

    project::management::LabelManager& labels_;
};

} // namespace projectctl
