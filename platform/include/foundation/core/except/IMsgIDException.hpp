#pragma once

#include <string>

#include "foundation/core/except/IUserException.hpp"
#include "resource_core/BaseMsgID.hpp"

namespace foundation::core::except {

/// An exception whose text comes from a message catalog.
class PROJECT_PLATFORM_EXPORT IMsgIDException : public IUserException {
public:
    ~IMsgIDException() override;

    /// Returns the error id, "catalog:message", which is the same in every language.
    virtual std::string GetID() const = 0;

    /// Returns the message's text from the catalog, in the language that is set now.
    virtual std::u16string GetUnicodeMessageTxt() const = 0;

    /// Returns the message with its arguments, which is valid as long as the exception.
    virtual resource_core::BaseMsgID const& GetBaseMsgIDObj() const = 0;

    /// Returns the error id of a message, for example "ZEPHRA:project:management:FileNotInProject".
    static std::string get_error_id(resource_core::BaseMsgID const& message);
};

} // namespace foundation::core::except
