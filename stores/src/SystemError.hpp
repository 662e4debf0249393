#pragma once

#include <string>

#include "project/stores/StoreError.hpp"

namespace project::stores {

/// Throws the StoreError for a failed system call: its reason in the system's words, and what to do about it.
/// @param action what could not be done, as in "can't be read".
/// @param error the system's number for the reason.
[[noreturn]] void throwSystemError(std::string const& file, char const* action, int error);

} // namespace project::stores
