#pragma once

#include <string>

#include "project/core/Export.hpp"
#include "project/core/Unique.hpp"

namespace project::management {

/// A category of labels: a value that names it and tells what it was like when it was read.
///
/// A category is known by its UUID. The rest goes stale silently when the category is changed. There is no
/// comparison, since two values for one category may differ.
class PROJECT_MANAGEMENT_EXPORT CategoryIdentifier : private Unique {
public:
    /// @param dataType a LabelDataValidator's data type, or any other text; it is not checked.
    CategoryIdentifier(std::u16string uuid, std::u16string name, bool readOnly, bool singleValued,
                       std::u16string dataType);

    std::u16string getUUID() const override;

    virtual std::u16string getName() const;

    /// True when the category must not be renamed or deleted.
    virtual bool isReadOnly() const;

    /// True when a file bears at most one label of this category.
    virtual bool isSingleValued() const;

    /// What data the category's labels may carry on a file. Never empty: a category without a data type
    /// answers "None".
    std::u16string getDataType() const;

private:
    friend class CategoryDefinition;

    std::u16string uuid_;
    std::u16string name_;
    std::u16string dataType_;
    bool readOnly_;
    bool singleValued_;
};

/// A category in its editable form: what a new one is made from. Changing it changes nothing in the store.
class PROJECT_MANAGEMENT_EXPORT CategoryDefinition : public CategoryIdentifier {
public:
    /// A writable, multi-valued category of data type "None" with a fresh UUID.
    explicit CategoryDefinition(std::u16string const& name);

    /// The same with a UUID given, whose form is not checked.
    CategoryDefinition(std::u16string const& name, std::u16string const& uuid);

    // Each setter returns this object, so that calls can be chained.
    CategoryDefinition& setIsReadOnly(bool readOnly);
    CategoryDefinition& setIsSingleValued(bool singleValued);
    CategoryDefinition& setDataType(std::u16string dataType);
};

} // namespace project::management
