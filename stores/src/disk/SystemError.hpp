#pragma once

#include <cerrno>
#include <string>

#include "project/stores/StoreError.hpp"

namespace project::stores {

/// Throws the StoreError for a failed system call: its reason in the system's words, and what to do about it.
/// @param action what could not be done, as in "can't be read".
/// @param error the system's number for the reason.
[[noreturn]] void throwSystemError(std::string const& file, char const* action, int error);

/// Makes a call again as long as signals interrupt it.
/// @param call gives a negative number, with errno set, when it fails.
template <typename Call>
int repeatWhenInterrupted(Call const& call) {
    int result = 0;
    do {
        result = call();
    } while (result < 0 && errno == EINTR);
    return result;
}

} // namespace project::stores
