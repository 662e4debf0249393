#pragma once

#include <cstdint>
#include <string>

namespace project::postgresql {

/// Checks that a text is a UUID in lower case with hyphens.
/// @param where the service, for the message.
/// @throws StoreError with the kind Refused otherwise.
void requireUuid(std::string const& text, std::string const& where);

/// The number of a project's advisory lock: the first half of its UUID.
std::int64_t lockKey(std::string const& project);

/// The channel of a project's notifications.
inline std::string channelOf(std::string const& project) {
    return "pm_" + project;
}

} // namespace project::postgresql
