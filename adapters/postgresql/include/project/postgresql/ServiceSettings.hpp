#pragma once

#include <chrono>
#include <string>

namespace project::postgresql {

/// How to reach the server of a shared project.
///
/// User, host, database, certificates and so on come from libpq's own configuration: the service file, the
/// password file, environment variables. Unless that configuration says otherwise, the connection requires
/// TLS with a verified certificate (`sslmode=verify-full`). The session is always one that can write.
struct ServiceSettings {
    /// The name of a service in libpq's service file, or a connection string (`key=value ...` or a URI).
    std::string service;

    /// The time for a connection, including the check of the user. The lookup of a host's name is not limited
    /// by it: the system's resolver has limits of its own.
    std::chrono::milliseconds connectLimit = std::chrono::seconds(10);

    /// How long the server may be silent while an answer is due. After that, the connection counts as lost.
    std::chrono::milliseconds silenceLimit = std::chrono::seconds(10);

    /// The time for a whole operation with all its attempts, apart from the wait for the lock. No attempt
    /// begins later.
    std::chrono::milliseconds operationLimit = std::chrono::seconds(30);

    /// The time in which a body is sent or received, as long as its bytes keep coming. A large body over a
    /// slow network takes longer than an operation.
    std::chrono::milliseconds transferLimit = std::chrono::minutes(5);

    /// The server ends a session that holds the lock and is idle for longer, so that a stopped process does
    /// not block the others forever.
    std::chrono::milliseconds idleLockLimit = std::chrono::minutes(1);
};

} // namespace project::postgresql
