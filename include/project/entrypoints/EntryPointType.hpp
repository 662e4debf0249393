#pragma once

#include <cstdint>
#include <string>

#include "project/core/Export.hpp"

namespace project::management {

/// The role of an entry point in the project's life.
enum class EntryPointType : std::int32_t { Basic = 0, Startup = 1, Shutdown = 2, BatchJob = 3 };

/// The name under which a type is stored: "Basic", "Startup", "Shutdown" or "Batch_Job".
///
/// Empty for a value that is none of the four; such a call adds the value to a map of the process, so it must
/// not run beside any other use of these two functions. All other calls may come from any thread.
PROJECT_MANAGEMENT_EXPORT std::u16string toString(EntryPointType type);

/// The type of a name, compared by code units. Beside what toString gives, "StartUp" and "Batch Job" are
/// accepted.
/// @throws EntryPointTypeUndefined with the name, nested over the std::out_of_range of the lookup.
PROJECT_MANAGEMENT_EXPORT EntryPointType getFromName(std::u16string name);

} // namespace project::management
