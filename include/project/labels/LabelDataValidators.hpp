#pragma once

#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "project/core/Export.hpp"

namespace project::management {

/// Defines for one data type which texts are valid as the data of a label on a file.
///
/// The library itself does not check data: a client chooses a validator, by the category's data type or
/// otherwise, and calls it before it stores data. Validators have no state; any thread may call them.
class PROJECT_MANAGEMENT_EXPORT LabelDataValidator {
public:
    virtual ~LabelDataValidator();

    /// Returns true if the text is valid data of this type.
    virtual bool isValid(std::u16string const& text) const = 0;

    /// Returns the name of the data type, as categories have it, for example "Logical".
    virtual std::u16string getDataType() const = 0;

    /// Returns the class of the values in lower case, for example "logical". It may differ from the data
    /// type.
    virtual std::u16string getDataClass() const = 0;
};

/// Data type "None", class "none". No text is valid, not even the empty one: a label of a category of this
/// type has no data.
class PROJECT_MANAGEMENT_EXPORT EmptyDataValidator : public LabelDataValidator {
public:
    bool isValid(std::u16string const& text) const override;
    std::u16string getDataType() const override;
    std::u16string getDataClass() const override;
};

/// Data type "String", class "char": the two names deliberately differ. Every text is valid.
class PROJECT_MANAGEMENT_EXPORT StringDataValidator : public LabelDataValidator {
public:
    bool isValid(std::u16string const& text) const override;
    std::u16string getDataType() const override;
    std::u16string getDataClass() const override;
};

/// Data type "Logical", class "logical". Only "true" and "false" in lower case are valid.
class PROJECT_MANAGEMENT_EXPORT LogicalDataValidator : public LabelDataValidator {
public:
    bool isValid(std::u16string const& text) const override;
    std::u16string getDataType() const override;
    std::u16string getDataClass() const override;
};

/// All validators, in this order: EmptyDataValidator, StringDataValidator, LogicalDataValidator.
class PROJECT_MANAGEMENT_EXPORT LabelDataValidators {
public:
    LabelDataValidators();

    /// Returns the first validator for which the predicate returns true, shared with this object; null if
    /// there is none.
    /// @throws std::bad_function_call for an empty function object.
    std::shared_ptr<LabelDataValidator>
    getValidator(std::function<bool(LabelDataValidator&)> predicate) const;

private:
    std::vector<std::shared_ptr<LabelDataValidator>> validators_;
};

} // namespace project::management
