#pragma once

#include <algorithm>
#include <chrono>
#include <cstdint>
#include <memory>
#include <string>
#include <thread>
#include <vector>

#include <sys/types.h>

#include "connection/ConnectOptions.hpp"
#include "connection/Connection.hpp"
#include "connection/ServerError.hpp"
#include "project/postgresql/ServiceSettings.hpp"

namespace project::postgresql {

/// A session on the server that is established again when the connection is lost.
///
/// A process on the server that lost its client may still hold the lock, or still run a statement. Each new
/// connection ends those of this session first. An operation that runs on it is then the only one of ours.
class ServerSession {
public:
    /// @param where the service and the project, for messages.
    ServerSession(ServiceSettings const& settings, std::string where);

    /// Runs an operation that may be repeated. When the connection is lost, connects again and repeats it,
    /// until the time of an operation has run out. A session that was never connected tries only once.
    /// @param operation receives the session, connected.
    template <class Operation>
    auto repeat(Deadline const& deadline, Operation const& operation) {
        for (auto pause = shortestPause;; pause = std::min(pause * 2, longestPause)) {
            try {
                connect(deadline);
                return operation();
            } catch (ConnectionLost const&) {
                close();
                if (!wasConnected_ || deadline.isOver()) {
                    throw;
                }
                std::this_thread::sleep_for(std::min(pause, deadline.remaining()));
            }
        }
    }

    /// Does nothing if the session is connected. Otherwise connects, and terminates the processes on the
    /// server that served earlier connections.
    void connect(Deadline const& deadline);

    /// Closes the connection, whose process on the server is ended at the next one.
    void close() noexcept;

    /// Runs statements as one transaction, in one round trip.
    /// @param extraSilence how much longer than usual the server may take.
    std::vector<Result> run(std::vector<Call> const& calls, Deadline const& deadline,
                            std::chrono::milliseconds extraSilence = std::chrono::milliseconds(0));

    /// Sends statements without waiting. Closes the connection if that is not possible.
    void post(std::vector<Call> const& calls) noexcept;

    Deadline deadline() const { return Deadline(settings_.operationLimit); }

    /// The end of a run that sends or receives a body.
    Deadline transferDeadline() const { return Deadline(settings_.transferLimit); }

    /// The process on the server that serves the current connection; 0 if there is none.
    int process() const { return connection_ ? current_.process : 0; }

    /// The number of connections so far. A lock belongs to one of them.
    std::uint64_t serial() const { return serial_; }

    /// Refuses a connection whose statements reach different processes: a connection pooler.
    /// @param process the one that answered.
    void requireProcess(std::int64_t process) const;

    Connection& connection() const { return *connection_; }

    std::string const& where() const { return where_; }

    ServiceSettings const& settings() const { return settings_; }

private:
    /// A process on the server. Its number alone may be used again by another process.
    struct ServerProcess {
        int process = 0;
        std::string start;
    };

    void introduce(Deadline const& deadline);
    void endFormerProcesses(Deadline const& deadline);

    static constexpr std::chrono::milliseconds shortestPause{5}; ///< before the next attempt to connect
    static constexpr std::chrono::milliseconds longestPause{500};

    ServiceSettings settings_;
    std::string where_;
    std::unique_ptr<ConnectOptions> options_; ///< read at the first connection
    std::unique_ptr<Connection> connection_;
    ServerProcess current_;
    std::vector<ServerProcess> former_; ///< their connection was lost; they may be running
    bool wasConnected_ = false;
    std::uint64_t serial_ = 0;
    pid_t owner_; ///< the process that created the session
};

} // namespace project::postgresql
