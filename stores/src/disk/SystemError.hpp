#pragma once

#include <cerrno>
#include <string>

#include "project/stores/StoreError.hpp"

namespace project::stores {

/// Throws the StoreError for a failed system call, with the system's description of the error and a remedy.
/// @param problem the name of the text of the problem, for example "CannotRead".
/// @param error the error number of the system.
[[noreturn]] void throwSystemError(std::string const& file, char const* problem, int error);

/// Repeats a call as long as signals interrupt it.
/// @param call returns a negative number, with errno set, if it fails.
template <typename Call>
auto repeatWhenInterrupted(Call const& call) {
    decltype(call()) result = 0;
    do {
        result = call();
    } while (result < 0 && errno == EINTR);
    return result;
}

} // namespace project::stores
