#pragma once

#include <optional>
#include <string>

#include "project/core/LabelManager.hpp"
#include "project/labels/CategoryIdentifier.hpp"
#include "project/labels/Label.hpp"
#include "project/labels/LabelIdentifier.hpp"

namespace projectctl {

/// Finds categories and labels by their names, or by their UUIDs where a name would fit several.
///
/// Whoever acts on the result holds a guard of the store from before the question until after the act.
class LabelNames {
public:
    explicit LabelNames(project::management::LabelManager& labels) : labels_(labels) {}

    /// @param name bytes of an argument.
    /// @throws CategoryDoesNotExist, CategoryDoesNotExistsByUUID; Failure when several are called so.
    project::management::CategoryIdentifier category(std::string const& name);

    /// The label of a category, each by its name.
    /// @throws what category throws; LabelDoesNotExistsByUUID; Failure when there is no label of the name, or
    ///         when there are several.
    project::management::Label label(std::string const& category, std::string const& name);

    /// The same, but UUIDs of what no longer exists are taken as they are, so that what is left of it on
    /// files can be taken off.
    project::management::Label labelOrWhatIsLeft(std::string const& category, std::string const& name);

private:
    std::optional<project::management::CategoryIdentifier> find(std::u16string const& category);
    std::optional<project::management::LabelIdentifier>
    find(project::management::CategoryIdentifier const& category, std::u16string const& label);

    project::management::LabelManager& labels_;
};

} // namespace projectctl
