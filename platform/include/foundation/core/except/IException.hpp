#pragma once

#include "PlatformExport.hpp"

namespace foundation::core::except {

/// What every exception of the framework can do, whatever else it derives from.
///
/// It does not derive from std::exception: the exceptions reach that by another base, and with two of them a
/// handler for std::exception would not catch.
class PROJECT_PLATFORM_EXPORT IException {
public:
    /// A copy on the heap, which the caller owns. Of a nested exception the copy is the plain form.
    virtual IException* clone() const = 0;

    /// Throws a copy of this object, in the plain form.
    [[noreturn]] virtual void rethrow() const = 0;

    virtual ~IException();

    /// The text in UTF-8, in the language that was set when the exception was made.
    virtual char const* what() const noexcept = 0;
};

} // namespace foundation::core::except
