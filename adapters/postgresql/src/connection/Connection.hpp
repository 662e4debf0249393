#pragma once

#include <chrono>
#include <deque>
#include <optional>
#include <set>
#include <string>
#include <string_view>
#include <vector>

#include <libpq-fe.h>
#include <sys/types.h>

#include "connection/ConnectOptions.hpp"
#include "connection/Deadline.hpp"
#include "connection/Result.hpp"
#include "connection/Statement.hpp"

namespace project::postgresql {

/// A connection to the server on which every wait has an end.
///
/// After ConnectionLost, only the destructor may be called. After another error, the connection can be used.
/// In a forked child, run throws and the destructor closes only the child's own descriptor: the parent's
/// session goes on.
class Connection {
public:
    /// How long to wait.
    struct Limits {
        Deadline whole;
        std::chrono::milliseconds silence; ///< without anything from the server, while an answer is due
    };

    /// @param where the service and the project, for messages.
    /// @throws ConnectionLost, or StoreError if another attempt is useless.
    Connection(ConnectOptions const& options, std::string where, Deadline const& deadline);
    ~Connection();
    Connection(Connection const&) = delete;
    Connection& operator=(Connection const&) = delete;

    /// Runs statements as one transaction and in one round trip. Returns after the commit.
    /// @return the answer to each of them.
    /// @throws StoreError if one of them failed: none has an effect then.
    std::vector<Result> run(std::vector<Call> const& calls, Limits const& limits);

    /// Sends statements, as one transaction, without waiting for the answer, which the next run drops.
    /// @return false if they could not be sent at once. The connection must be closed then.
    bool post(std::vector<Call> const& calls) noexcept;

    /// A notification of a channel that the session listens to, without waiting.
    /// @return the process that sent it; nothing if none has arrived.
    std::optional<int> notification();

    /// Readable when something has arrived from the server.
    int descriptor() const { return PQsocket(handle_); }

    /// The server process that the connection leads to, as it introduced itself.
    int serverProcess() const { return PQbackendPID(handle_); }

    /// Whether the server sent a warning during the last run. A commit that does not wait for its standby any
    /// longer warns.
    bool hasWarned() const { return hasWarned_; }

    /// An identifier in quotes.
    std::string quoted(std::string const& identifier) const;

private:
    /// Sends calls and the end of their transaction. @return false if the connection was lost.
    bool send(std::vector<Call> const& calls, Limits const* limits);
    bool sendOne(Call const& call);

    struct Answers {
        std::vector<Result> results;
        std::optional<Result> failure; ///< of the first statement that failed; the others were not executed
    };

    Answers receive(Limits const& limits);
    PGresult* nextResult(Limits const& limits);
    void flush(Limits const& limits);
    void waitFor(short events, Limits const& limits);
    void requireOwnProcess() const;
    [[noreturn]] void throwLost() const;
    static void noteWarning(void* connection, PGresult const* notice);

    std::string where_;
    pid_t process_;
    PGconn* handle_;
    std::set<std::string_view> prepared_;
    std::deque<char const*>
        expected_;   ///< for each answer to come: the statement's name if it is prepared by it
    int posted_ = 0; ///< transactions whose answers nobody has read
    bool hasWarned_ = false;
};

} // namespace project::postgresql
