#pragma once

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "project/stores/Export.hpp"
#include "project/stores/JournalEntry.hpp"

namespace project::stores {

/// The log of a project that several machines share: entries that a server numbers without gaps and keeps
/// durable. JournalBackend stores a project's definition in it.
///
/// The journal owns the connection. It connects at the first operation, and connects again when the
/// connection is lost; a lock that was lost with the connection is taken again before the next append. Every
/// wait is bounded. The journal passes on what the server contains; JournalBackend verifies it.
///
/// All operations throw StoreError. Its file() is name(). The kind is Unreachable if the server cannot be
/// reached or does not answer in time, DiskFailed if the server reports a failure of its own, such as a full
/// disk, and Refused if a right is missing, the project does not exist on the server, the log has a later
/// format, or the process is a fork of the one that opened the journal. Each operation lists further kinds.
/// One thread at a time, except for awaitChange and wake.
class PROJECT_STORES_EXPORT Journal {
public:
    /// A server accepts no batch with more bytes. A longer one is committed with a body.
    static constexpr std::size_t longestBatch = std::size_t{1} << 20;

    /// The result of an append.
    enum class Appended {
        Stored,     ///< the entry is durable, and stored once, however often it was sent
        Superseded, ///< the newest entry is not the one before it: another client has written, or the server
                    ///< was reset. The entry is not stored and never will be
    };

    virtual ~Journal() = default;

    /// The service and the project, for messages: UTF-8, without a secret.
    virtual std::string name() const = 0;

    /// Checks for changes: one round trip.
    ///
    /// With a version, the result begins with the entry of that version, without its lines, so that the
    /// caller can compare its identity. It contains all later entries. If that entry does not exist, because
    /// the log was cleaned or the server was reset to an earlier state, the result may be empty or begin
    /// later.
    ///
    /// Without a version, the result begins with the newest body, whose bytes are included. It is empty if
    /// the log has no entries.
    virtual JournalLook look(std::optional<std::uint64_t> seen) = 0;

    /// Takes the lock that excludes other writers, and then checks for changes, as look does: one round trip
    /// if the lock is free. Writers get the lock in the order in which they asked for it. The lock provides
    /// order; the guard of append provides correctness.
    /// @param patience how long to wait for the lock. The answer of the server has a limit of its own.
    /// @throws StoreError with the kind Busy and the lock holder if the time has run out. The lock is not
    /// held
    ///         after any error.
    virtual JournalLook lock(std::chrono::milliseconds patience, std::optional<std::uint64_t> seen) = 0;

    /// Releases the lock without waiting for the answer. Does nothing if the lock is not held.
    virtual void unlock() noexcept = 0;

    /// The bytes of a body that a look returned or records lists. The journal may store it in pieces and
    /// compressed.
    /// @throws StoreError with the kind Damaged if a part of the body is missing or unreadable.
    virtual std::string body(JournalPosition const& entry) = 0;

    /// Appends an entry, if the newest entry has the version before it and the sum `after`; for version 1, if
    /// the log has no entries. Returns when the server says that the entry is durable, in the sense of its
    /// settings. Requires the lock. If the connection is lost, the journal connects and locks again and sends
    /// the entry with the same id again, until the outcome is known or the time has run out. An entry whose
    /// id is already stored at its version is Stored.
    /// @throws StoreError with the kind OutcomeUnknown if the entry may be stored, or may be stored later.
    /// With
    ///         any other kind it is not stored and never will be.
    virtual Appended append(NewJournalEntry const& entry) = 0;

    /// Waits until another client has appended an entry. It may return early, for example when the connection
    /// is lost, and it may miss an entry: it shows when to check for changes and does not replace the check.
    /// May be called by one thread while another one calls other operations.
    /// @return false if the time has run out.
    virtual bool awaitChange(std::chrono::milliseconds time) = 0;

    /// Makes awaitChange return, and the next call of it if none is waiting. May be called by any thread.
    virtual void wake() noexcept = 0;

    /// Author and time of entries, the newest first. One round trip.
    /// @param before only entries with a smaller version; empty for the newest.
    /// @param count the largest number of entries to return.
    virtual std::vector<JournalRecord> records(std::optional<std::uint64_t> before, std::size_t count) = 0;

    /// @throws StoreError with the kind Refused if the user does not own the project. One round trip.
    virtual void requireOwner() = 0;

    /// Deletes all entries with a smaller version, and the pieces of bodies that belong to no entry. Requires
    /// the lock. The pieces of an append that is in progress must stay, or make that append fail.
    /// @param version the version of a body.
    /// @return the number of deleted entries.
    /// @throws StoreError with the kind Refused, with nothing deleted, if the user does not own the project.
    virtual std::size_t deleteBefore(std::uint64_t version) = 0;
};

} // namespace project::stores
