#pragma once

#include <string>

#include "project/core/Export.hpp"

namespace project::management {

/// An object that is identified by a UUID, while everything else about it may change.
class PROJECT_MANAGEMENT_EXPORT Unique {
public:
    virtual ~Unique();

    /// Returns the UUID as it was given or generated. Its form is not checked.
    virtual std::u16string getUUID() const = 0;

protected:
    Unique() = default;
    Unique(Unique const&) = default;
    Unique& operator=(Unique const&) = default;
};

} // namespace project::management
