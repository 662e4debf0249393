#pragma once

#include <string>

#include "project/core/Export.hpp"
#include "project/core/Unique.hpp"
#include "project/labels/LabelReadOnlyState.hpp"

namespace project::management {

/// A label without its category: a value that names it and tells what it was like when it was read.
///
/// Within its category a label is known by its UUID. The rest goes stale silently when the label is changed.
class PROJECT_MANAGEMENT_EXPORT LabelIdentifier : private Unique {
public:
    LabelIdentifier(std::u16string uuid, std::u16string name, LabelReadOnlyState state);

    std::u16string getUUID() const override;

    virtual std::u16string getName() const;

    /// Whether the label may be deleted: a state, not a flag.
    virtual LabelReadOnlyState isReadOnly() const;

    /// True when UUID, name and state are all the same: two values for one label differ when it was changed
    /// in between.
    bool operator==(LabelIdentifier const& other) const;
    bool operator!=(LabelIdentifier const& other) const;

private:
    friend class LabelDefinition;

    std::u16string uuid_;
    std::u16string name_;
    LabelReadOnlyState readOnlyState_;
};

/// A label in its editable form: what a new one is made from. Changing it changes nothing in the store.
class PROJECT_MANAGEMENT_EXPORT LabelDefinition : public LabelIdentifier {
public:
    /// A label that is as writable as its category, with a fresh UUID.
    explicit LabelDefinition(std::u16string const& name);

    /// The same with a UUID given, whose form is not checked.
    LabelDefinition(std::u16string const& name, std::u16string const& uuid);

    /// @return this object, so that calls can be chained.
    LabelDefinition& setIsReadOnly(LabelReadOnlyState state);
};

} // namespace project::management
