#pragma once

#include <string>

#include "project/core/Export.hpp"
#include "project/core/Unique.hpp"

namespace project::management {

/// A category of labels: its UUID, and the properties that it had when it was read. An immutable value.
///
/// The UUID identifies the category. The properties become stale without notice when the category is changed.
/// Two values for the same category may differ, so there is no comparison.
class PROJECT_MANAGEMENT_EXPORT CategoryIdentifier : private Unique {
public:
    /// @param dataType the data type of a LabelDataValidator, or any other text. It is not checked.
    CategoryIdentifier(std::u16string uuid, std::u16string name, bool readOnly, bool singleValued,
                       std::u16string dataType);

    std::u16string getUUID() const override;

    /// Returns the name that users see.
    virtual std::u16string getName() const;

    /// Returns true if the category must not be renamed or deleted.
    virtual bool isReadOnly() const;

    /// Returns true if a file can have at most one label of this category.
    virtual bool isSingleValued() const;

    /// Returns the type of the data that the category's labels have on a file. It is never empty: without a
    /// data type, the result is "None".
    std::u16string getDataType() const;

private:
    friend class CategoryDefinition;

    std::u16string uuid_;
    std::u16string name_;
    std::u16string dataType_;
    bool readOnly_;
    bool singleValued_;
};

/// A category in its editable form, from which a new one is created. A change does not affect the store.
class PROJECT_MANAGEMENT_EXPORT CategoryDefinition : public CategoryIdentifier {
public:
    /// A writable, multi-valued category with the data type "None" and a new UUID.
    explicit CategoryDefinition(std::u16string const& name);

    /// The same with a given UUID, whose form is not checked.
    CategoryDefinition(std::u16string const& name, std::u16string const& uuid);

    // Each setter returns this object.
    /// Sets whether the category must not be renamed or deleted. Returns this object, as all setters do.
    CategoryDefinition& setIsReadOnly(bool readOnly);
    /// Sets whether a file can have at most one label of this category.
    CategoryDefinition& setIsSingleValued(bool singleValued);
    /// Sets the type of the data that the category's labels have on a file.
    CategoryDefinition& setDataType(std::u16string dataType);
};

} // namespace project::management
