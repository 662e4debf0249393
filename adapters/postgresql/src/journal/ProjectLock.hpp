#pragma once

#include <chrono>
#include <cstdint>
#include <string>
#include <vector>

#include "journal/ServerSession.hpp"

namespace project::postgresql {

/// The lock that excludes other writers of a project: an advisory lock of the server's session. It is lost
/// with the connection.
class ProjectLock {
public:
    ProjectLock(ServerSession& session, std::string const& project);

    /// Takes the lock, and then runs statements in the same round trip. If that fails, call release.
    /// @return the answers to the statements.
    /// @throws StoreError with the kind Busy and the lock holder if the patience has run out.
    std::vector<Result> take(std::chrono::milliseconds patience, std::vector<Call> const& next,
                             Deadline const& deadline);

    /// Takes the lock again, with the same patience, if it was lost with the connection.
    void takeAgain(Deadline const& deadline);

    /// Releases the lock without waiting for the answer.
    /// @param next statements to send with it.
    void release(std::vector<Call> const& next) noexcept;

    /// @throws StoreError with the kind Refused if the lock was not taken, or was released.
    void require() const;

private:
    bool isHeld() const;
    [[noreturn]] void throwHolder(Deadline const& deadline);

    ServerSession& session_;
    std::string key_;
    std::chrono::milliseconds patience_{0};
    bool isWanted_ = false;          ///< between take and release, even if the connection was lost
    std::uint64_t heldBySerial_ = 0; ///< the connection that holds the lock; 0 for none
};

} // namespace project::postgresql
