#pragma once

#include <condition_variable>
#include <cstdint>
#include <deque>
#include <functional>
#include <map>
#include <memory>
#include <mutex>
#include <optional>
#include <string>
#include <vector>

#include "project/stores/Journal.hpp"

namespace project::test {

/// The server of a shared project, in memory. The calls of its clients are recorded. Any call can be made to
/// fail in the ways in which a network fails, or to be the last one of a client's process.
class JournalServer {
public:
    enum class InjectedFault {
        None,
        LostBefore,  ///< the connection is lost before the server gets the call; the client connects again
        LostAfter,   ///< the connection is lost before the client gets the answer; the client connects again
        Unreachable, ///< the server gets neither this call nor a later one, until the plan is cancelled
        Stalls, ///< the server does the call, but the answer does not arrive, nor does that of a later call
        StallsLate, ///< the same, and the server does an insert only before a later call
        DiskFull,   ///< the server reports a failure, and the call has no effect
        DiesBefore, ///< the process of the client dies before the call
        DiesAfter,  ///< the process of the client dies after the call
    };

    /// An entry as the server stores it. Tests may damage it.
    struct Entry {
        stores::JournalEntry read;
        std::string author;
    };

    explicit JournalServer(std::string owner = "owner") : owner_(std::move(owner)) {}

    /// The calls so far, in order: "look", "lock", "pieces", "insert", "find", "body", "records", "delete".
    std::vector<std::string> calls;

    /// Called before each call, to act as another client.
    std::function<void(std::string const& call)> beforeCall;

    /// The calls that the server does before an insert that is late.
    std::size_t callsBeforeLate = 1;

    /// Plans a fault for one call, after a number of others. Those that the client's process or the network
    /// does not survive last until the plan is cancelled.
    void plan(InjectedFault fault, std::size_t callsBefore);

    /// Cancels the planned fault. @return true if it has not happened yet.
    bool cancelPlan();

    std::size_t count(std::string const& call) const;

    std::deque<Entry>& entries() { return entries_; }

    /// The entry of a version.
    Entry& entry(std::uint64_t version);

    /// The bytes of a stored body. Tests may damage or erase them.
    std::map<std::string, std::string>& pieces() { return pieces_; }

    /// Resets the server to an earlier state.
    void resetTo(std::uint64_t version);

    /// Deletes the entries before a version.
    void deleteBefore(std::uint64_t version);

    /// Ends all sessions, which releases the lock. The clients connect again.
    void dropConnections();

private:
    friend class MemoryJournal;

    using Appended = stores::Journal::Appended;

    bool isConnected(std::uint64_t session) const;
    void disconnect(std::uint64_t session);
    Appended insert(Entry const& entry);
    std::optional<Appended> find(stores::JournalPosition const& position) const;
    stores::JournalLook look(std::optional<std::uint64_t> seen) const;
    InjectedFault nextFault(std::string const& call);
    void delay(Entry const& entry);
    void runDelayed();
    std::uint64_t newest() const;

    std::string const owner_;
    std::mutex mutex_;
    std::condition_variable changed_; ///< the lock was released, or an entry was appended
    std::deque<Entry> entries_;
    std::map<std::string, std::string> pieces_; ///< by the id of the entry
    std::uint64_t sessions_ = 0;
    std::uint64_t oldestSession_ = 1; ///< sessions before it have ended
    std::uint64_t holder_ = 0;        ///< the session that holds the lock
    std::string holderName_;
    std::optional<Entry> delayed_; ///< an insert that the server does later
    std::size_t delay_ = 0;        ///< the calls before it
    InjectedFault planned_ = InjectedFault::None;
    InjectedFault lasting_ = InjectedFault::None; ///< a fault that has happened and lasts
    std::size_t callsBefore_ = 0;
};

/// The journal of one client of a JournalServer. It connects and sends again as Journal requires.
class MemoryJournal : public stores::Journal {
public:
    explicit MemoryJournal(std::shared_ptr<JournalServer> server, std::string user = "owner");
    ~MemoryJournal() override;

    std::string name() const override { return "memory/project"; }

    stores::JournalLook look(std::optional<std::uint64_t> seen) override;
    stores::JournalLook lock(std::chrono::milliseconds patience, std::optional<std::uint64_t> seen) override;
    void unlock() noexcept override;
    std::string body(stores::JournalPosition const& entry) override;
    Appended append(stores::NewJournalEntry const& entry) override;
    bool awaitChange(std::chrono::milliseconds time) override;
    void wake() noexcept override;
    std::vector<stores::JournalRecord> records(std::optional<std::uint64_t> before,
                                               std::size_t count) override;
    void requireOwner() override;
    std::size_t deleteBefore(std::uint64_t version) override;

private:
    /// The connection was lost during a call, and the client can connect again.
    struct ConnectionLost {};

    /// No answer arrived in time.
    struct NoAnswer {
        bool isLate = false; ///< the server will do the call later
    };

    template <typename Effect>
    auto call(std::string const& name, Effect const& effect);

    template <typename Effect>
    auto callAgain(std::string const& name, Effect const& effect);

    void connect();
    void disconnect();
    [[noreturn]] void die();
    void takeLock(std::chrono::milliseconds patience);
    Appended tryToAppend(JournalServer::Entry const& entry, std::string_view body, bool& isSent);

    std::shared_ptr<JournalServer> server_;
    std::string user_;
    std::uint64_t session_ = 0;
    std::chrono::milliseconds patience_ = std::chrono::milliseconds(0);
    std::uint64_t awaited_ = 0;
    bool isWoken_ = false;
    bool isDead_ = false;
};

} // namespace project::test
