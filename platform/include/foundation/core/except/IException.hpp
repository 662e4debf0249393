#pragma once

#include "PlatformExport.hpp"

namespace foundation::core::except {

/// The interface of every exception of the framework.
///
/// It deliberately does not derive from std::exception: the exceptions derive from it through another base,
/// and a handler for std::exception would not catch an exception with two of them.
class PROJECT_PLATFORM_EXPORT IException {
public:
    /// Returns a copy, which the caller owns. The copy of a nested exception is its plain form.
    virtual IException* clone() const = 0;

    /// Throws a copy of this object in its plain form.
    [[noreturn]] virtual void rethrow() const = 0;

    virtual ~IException();

    /// Returns the text in UTF-8, in the language that was set when the exception was created.
    virtual char const* what() const noexcept = 0;
};

} // namespace foundation::core::except
