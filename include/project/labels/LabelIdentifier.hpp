#pragma once

#include <string>

#include "project/core/Export.hpp"
#include "project/core/Unique.hpp"
#include "project/labels/LabelReadOnlyState.hpp"

namespace project::management {

/// A label without its category: its UUID, and the properties that it had when it was read. An immutable
/// value.
///
/// The UUID identifies the label in its category. The properties become stale without notice when the label
/// is changed.
class PROJECT_MANAGEMENT_EXPORT LabelIdentifier : private Unique {
public:
    /// A label with these properties. The form of the UUID is not checked.
    LabelIdentifier(std::u16string uuid, std::u16string name, LabelReadOnlyState state);

    std::u16string getUUID() const override;

    /// Returns the name that users see.
    virtual std::u16string getName() const;

    /// Returns whether the label may be deleted. Despite the name it is a state with three values.
    virtual LabelReadOnlyState isReadOnly() const;

    /// Compares the UUID, the name and the state. Two values for the same label differ if it was changed
    /// between the two reads.
    bool operator==(LabelIdentifier const& other) const;
    /// Compares the same properties.
    bool operator!=(LabelIdentifier const& other) const;

private:
    friend class LabelDefinition;

    std::u16string uuid_;
    std::u16string name_;
    LabelReadOnlyState readOnlyState_;
};

/// A label in its editable form, from which a new one is created. A change does not affect the store.
class PROJECT_MANAGEMENT_EXPORT LabelDefinition : public LabelIdentifier {
public:
    /// A label with the state INHERITED and a new UUID.
    explicit LabelDefinition(std::u16string const& name);

    /// The same with a given UUID, whose form is not checked.
    LabelDefinition(std::u16string const& name, std::u16string const& uuid);

    /// @return this object.
    LabelDefinition& setIsReadOnly(LabelReadOnlyState state);
};

} // namespace project::management
