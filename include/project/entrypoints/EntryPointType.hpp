#pragma once

#include <cstdint>
#include <string>

#include "project/core/Export.hpp"

namespace project::management {

/// The kind of an entry point: basic, start-up, shut-down or batch job.
enum class EntryPointType : std::int32_t { Basic = 0, Startup = 1, Shutdown = 2, BatchJob = 3 };

/// Returns the name under which a type is stored: "Basic", "Startup", "Shutdown" or "Batch_Job".
///
/// Any other value gives an empty name, deliberately: an entry point of an unknown type can be written, and
/// only reading it is an error. Such a call adds the value to a map of the process, so no other thread may
/// use these two functions meanwhile. All other calls may come from any thread.
PROJECT_MANAGEMENT_EXPORT std::u16string toString(EntryPointType type);

/// Returns the type for a name, compared by code units. Besides the names that toString returns, "StartUp"
/// and "Batch Job" are known.
/// @throws EntryPointTypeUndefined with the name, nested over std::out_of_range, for any other name.
PROJECT_MANAGEMENT_EXPORT EntryPointType getFromName(std::u16string name);

} // namespace project::management
