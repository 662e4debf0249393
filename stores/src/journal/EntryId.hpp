#pragma once

#include <string>

namespace project::stores {

/// A new random UUID for an entry of a journal.
std::string newEntryId();

} // namespace project::stores
