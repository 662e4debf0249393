#pragma once

#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "project/core/Export.hpp"

namespace project::management {

/// Says for one data type which texts a label may carry as its data on a file.
///
/// The library names data types and checks no data: clients choose a validator, by CategoryIdentifier's data
/// type or otherwise, and ask it before they store data. Validators have no state; any thread may ask them.
class PROJECT_MANAGEMENT_EXPORT LabelDataValidator {
public:
    virtual ~LabelDataValidator();

    /// True when the text is acceptable as data of this type.
    virtual bool isValid(std::u16string const& text) const = 0;

    /// The type's name as the data type of a category has it, for instance "Logical".
    virtual std::u16string getDataType() const = 0;

    /// The class of the values, in lower case, for instance "logical". It need not spell the data type.
    virtual std::u16string getDataClass() const = 0;
};

/// Data type "None", class "none". Accepts nothing, not even the empty text: a label of a category of this
/// type carries no data.
class PROJECT_MANAGEMENT_EXPORT EmptyDataValidator : public LabelDataValidator {
public:
    bool isValid(std::u16string const& text) const override;
    std::u16string getDataType() const override;
    std::u16string getDataClass() const override;
};

/// Data type "String", class "char": two names of the one type. Accepts every text, the empty one included.
class PROJECT_MANAGEMENT_EXPORT StringDataValidator : public LabelDataValidator {
public:
    bool isValid(std::u16string const& text) const override;
    std::u16string getDataType() const override;
    std::u16string getDataClass() const override;
};

/// Data type "Logical", class "logical". Accepts "true" and "false" in lower case, and nothing else.
class PROJECT_MANAGEMENT_EXPORT LogicalDataValidator : public LabelDataValidator {
public:
    bool isValid(std::u16string const& text) const override;
    std::u16string getDataType() const override;
    std::u16string getDataClass() const override;
};

/// The validators that there are, in this order: EmptyDataValidator, StringDataValidator,
/// LogicalDataValidator.
class PROJECT_MANAGEMENT_EXPORT LabelDataValidators {
public:
    LabelDataValidators();

    /// The first validator that the predicate answers true for, shared with this object; null when there is
    /// none.
    /// @throws std::bad_function_call for an empty function object.
    std::shared_ptr<LabelDataValidator>
    getValidator(std::function<bool(LabelDataValidator&)> predicate) const;

private:
    std::vector<std::shared_ptr<LabelDataValidator>> validators_;
};

} // namespace project::management
