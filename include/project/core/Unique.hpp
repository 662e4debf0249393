#pragma once

#include <string>

#include "project/core/Export.hpp"

namespace project::management {

/// Something that is known by a UUID, whatever else about it changes.
class PROJECT_MANAGEMENT_EXPORT Unique {
public:
    virtual ~Unique();

    /// The UUID as it was given or generated; its form is not checked.
    virtual std::u16string getUUID() const = 0;

protected:
    Unique() = default;
    Unique(Unique const&) = default;
    Unique& operator=(Unique const&) = default;
};

} // namespace project::management
