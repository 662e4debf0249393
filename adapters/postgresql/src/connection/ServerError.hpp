#pragma once

#include <string>
#include <string_view>

#include <libpq-fe.h>
#include <sys/types.h>

#include "project/stores/StoreError.hpp"

namespace project::postgresql {

/// The connection was lost, or could not be established for a reason that may pass: another attempt may
/// succeed.
class ConnectionLost : public stores::StoreError {
public:
    /// @param where the service and the project.
    /// @param reason a clause; may be empty.
    ConnectionLost(std::string where, std::string const& reason);
};

/// Throws the error for a failed connection attempt: ConnectionLost if another attempt may succeed, otherwise
/// a StoreError with the kind Refused.
/// @param message libpq's message, with error codes (PQERRORS_VERBOSE).
[[noreturn]] void throwConnectError(std::string const& where, std::string_view message);

/// libpq's message as a clause, without codes.
std::string shownMessage(std::string_view message);

/// Throws the error for a statement that failed.
[[noreturn]] void throwStatementError(std::string const& where, PGresult const* result);

/// Throws a StoreError with the kind Refused in a fork of the process that opened a connection.
/// @param owner that process.
void refuseAfterFork(pid_t owner, std::string const& where);

/// The code of a failed statement; empty if it failed because the connection was lost.
std::string_view codeOf(PGresult const* result);

} // namespace project::postgresql
