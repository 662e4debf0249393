#pragma once

#include <cstdint>
#include <optional>

#include "project/stores/Journal.hpp"

namespace project::stores {

/// The newest body in a journal, or the newest one before a version; empty if there is none.
std::optional<JournalPosition> newestBody(Journal& journal, std::optional<std::uint64_t> before);

} // namespace project::stores
