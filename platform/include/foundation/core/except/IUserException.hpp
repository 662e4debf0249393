#pragma once

#include <string>

#include "foundation/core/except/IException.hpp"

namespace foundation::core::except {

/// An exception whose text is meant for the user, in the user's language.
class PROJECT_PLATFORM_EXPORT IUserException : public IException {
public:
    ~IUserException() override;

    /// Replaces the string by the text in the language that is set now.
    virtual void convert_str(std::u16string& text) const = 0;

    /// Replaces the string by the same text in UTF-8. A lone surrogate becomes U+FFFD.
    virtual void convert_str(std::string& text) const = 0;

    /// Returns the text in the language that is set now.
    virtual std::u16string ToUstringImpl() const = 0;
};

} // namespace foundation::core::except
