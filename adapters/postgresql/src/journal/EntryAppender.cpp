#include "journal/EntryAppender.hpp"

#include <array>
#include <vector>

#include <unistd.h>

#include "journal/BodyPieces.hpp"
#include "journal/LookRows.hpp"
#include "texts/ErrorTexts.hpp"

namespace project::postgresql {

namespace {

using stores::StoreError;
using Appended = stores::Journal::Appended;

// The guard: an entry is stored only after the one that its writer saw last. Nothing else decides.
constexpr Statement insertNext{
    "insert_next",
    "INSERT INTO pm.entry (project, version, id, kind, after, sum, lines, pieces, host)"
    " SELECT $1::uuid, $2::bigint, $3::uuid, $4::text, $5::bytea, $6::bytea, $7::bytea, $8::int, $9::text"
    " FROM pm.entry WHERE project = $1::uuid AND version = $2::bigint - 1 AND sum = $5::bytea"
    " ON CONFLICT (project, version) DO NOTHING"};

constexpr Statement insertFirst{
    "insert_first",
    "INSERT INTO pm.entry (project, version, id, kind, after, sum, lines, pieces, host)"
    " SELECT $1::uuid, $2::bigint, $3::uuid, $4::text, $5::bytea, $6::bytea, $7::bytea, $8::int, $9::text"
    " WHERE NOT EXISTS (SELECT FROM pm.entry WHERE project = $1::uuid)"
    " ON CONFLICT (project, version) DO NOTHING"};

// In the transaction of the entry, and only if that is stored: no piece is without an entry.
constexpr Statement insertPiece{"insert_piece",
                                "INSERT INTO pm.piece (project, id, number, bytes)"
                                " SELECT $1::uuid, $2::uuid, $3::int, $4::bytea WHERE EXISTS"
                                " (SELECT FROM pm.entry WHERE project = $1::uuid AND version = $5::bigint"
                                " AND id = $2::uuid) ON CONFLICT (project, id, number) DO NOTHING"};

constexpr Statement idAtVersion{
    "id_at_version", "SELECT id::text FROM pm.entry WHERE project = $1::uuid AND version = $2::bigint"};

constexpr Statement writeBarrier{"write_barrier", "UPDATE pm.barrier SET n = n + 1 WHERE project = $1::uuid"};

std::string hostName() {
    std::array<char, 256> name{};
    return ::gethostname(name.data(), name.size() - 1) == 0 ? name.data() : "";
}

} // namespace

EntryAppender::EntryAppender(ServerSession& session, ProjectLock& lock, std::string const& project,
                             stores::NewJournalEntry const& entry)
    : session_(session),
      lock_(lock),
      project_(project),
      entry_(entry),
      version_(std::to_string(entry.position.version)),
      pieces_(entry.isBody ? cutBody(entry.body) : std::vector<std::string>()),
      deadline_(session.deadline()) {
}

Appended EntryAppender::append() {
    try {
        return session_.repeat(deadline_, [this] {
            auto const earlier = isUncertain_ ? outcome() : std::nullopt;
            return earlier ? *earlier : attempt();
        });
    } catch (StoreError const& error) {
        if (!isUncertain_) {
            throw;
        }
        throw StoreError(StoreError::Kind::OutcomeUnknown, session_.where(), 0,
                         errorTexts.get("ChangeUncertain", error.problem()),
                         errorTexts.get("RemedyOfUncertainChange"));
    }
}

Appended EntryAppender::attempt() {
    lock_.takeAgain(deadline_);
    isUncertain_ = true;
    if (insert() == 0) {
        return outcome().value_or(Appended::Superseded);
    }
    if (session_.connection().hasWarned()) { // the commit may not have waited for its standby
        passBarrier();
    }
    return Appended::Stored;
}

/// @return the number of entries that were stored.
std::size_t EntryAppender::insert() {
    auto const count = std::to_string(pieces_.size());
    auto const host = hostName();
    auto const& [version, id, sum] = entry_.position;
    std::vector<Call> calls{{version == 1 ? insertFirst : insertNext,
                             {{project_},
                              {version_},
                              {id},
                              {entry_.isBody ? "b" : "t"},
                              {entry_.after, true},
                              {sum, true},
                              {entry_.lines, true},
                              {count},
                              {host}}}};
    std::vector<std::string> numbers;
    numbers.reserve(pieces_.size());
    for (auto const& piece : pieces_) {
        auto const& number = numbers.emplace_back(std::to_string(numbers.size() + 1));
        calls.push_back({insertPiece, {{project_}, {id}, {number}, {piece, true}, {version_}}});
    }
    try {
        return session_.run(calls, entry_.isBody ? session_.transferDeadline() : deadline_)
            .front()
            .affected();
    } catch (ConnectionLost const&) {
        throw;
    } catch (StoreError const&) { // the transaction failed as a whole
        isUncertain_ = false;
        throw;
    }
}

/// Which entry has the version, now that no process on the server can store ours unless it is sent again.
/// @return nothing if none has it.
std::optional<Appended> EntryAppender::outcome() {
    auto const answers = session_.run({{idAtVersion, {{project_}, {version_}}}}, deadline_);
    auto const& rows = answers.front();
    if (rows.rows() > 0 && rows.bytes(0, 0) == entry_.position.id) {
        passBarrier();
        return Appended::Stored;
    }
    isUncertain_ = false;
    return rows.rows() > 0 ? std::optional(Appended::Superseded) : std::nullopt;
}

/// Waits until all that the server shows is as durable as a commit. With a synchronous standby, a server also
/// shows entries whose commit was interrupted while it waited for the standby, and which a failover would
/// lose.
void EntryAppender::passBarrier() {
    auto const answers = session_.run({{writeBarrier, {{project_}}}}, deadline_);
    if (answers.front().affected() == 0) {
        throwNoProject(session_.where());
    }
    if (session_.connection().hasWarned()) {
        throw ConnectionLost(session_.where(), errorTexts.get("StandbyNotAwaited"));
    }
}

} // namespace project::postgresql
