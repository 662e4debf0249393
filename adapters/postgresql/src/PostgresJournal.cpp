#include "project/postgresql/PostgresJournal.hpp"

#include <atomic>
#include <cstdint>
#include <limits>
#include <utility>

#include "journal/ChangeListener.hpp"
#include "journal/EntryAppender.hpp"
#include "journal/LookRows.hpp"
#include "journal/ProjectId.hpp"
#include "journal/ProjectLock.hpp"
#include "journal/ServerSession.hpp"
#include "project/stores/StoreError.hpp"
#include "texts/ErrorTexts.hpp"

namespace project::postgresql {

namespace {

using std::chrono::milliseconds;
using stores::JournalLook;
using stores::JournalRecord;
using stores::NewJournalEntry;
using stores::StoreError;

// Nobody waits for this commit, which contains nothing that has to be durable.
constexpr Statement notify{"notify",
                           "SELECT set_config('synchronous_commit', 'off', true), pg_notify($1::text, '')"};

constexpr Statement piecesOfEntry{
    "", "SELECT pieces FROM pm.entry WHERE project = $1::uuid AND version = $2::bigint AND id = $3::uuid"};

constexpr Statement allPieces{"", "SELECT id::text, number, bytes FROM pm.piece"
                                  " WHERE project = $1::uuid AND id = $2::uuid ORDER BY number"};

constexpr Statement newestRecords{"", "SELECT version, id::text, sum, kind::text, author::text, host,"
                                      " (extract(epoch FROM at) * 1000000)::bigint FROM pm.entry"
                                      " WHERE project = $1::uuid AND version < $2::bigint"
                                      " ORDER BY version DESC LIMIT $3::bigint"};

// The role that ran setup.sql owns the tables, and every project in them.
constexpr Statement isOwner{"", "SELECT coalesce(pg_has_role(c.relowner, 'USAGE'), false) FROM pg_class c"
                                " WHERE c.oid = to_regclass('pm.entry')"};

constexpr Statement deleteEntries{
    "", "DELETE FROM pm.entry WHERE project = $1::uuid AND version < $2::bigint AND EXISTS"
        " (SELECT FROM pm.entry WHERE project = $1::uuid AND version = $2::bigint AND kind = 'b')"};

constexpr Statement deletePieces{"", "DELETE FROM pm.piece WHERE project = $1::uuid AND id NOT IN"
                                     " (SELECT id FROM pm.entry WHERE project = $1::uuid AND kind = 'b')"};

JournalRecord recordAt(Result const& rows, int row) {
    JournalRecord record;
    record.position = {static_cast<std::uint64_t>(rows.number(row, 0)), rows.text(row, 1), rows.text(row, 2)};
    record.isBody = rows.bytes(row, 3) == "b";
    record.author = rows.text(row, 4);
    record.host = rows.text(row, 5);
    record.time = std::chrono::system_clock::time_point(std::chrono::microseconds(rows.number(row, 6)));
    return record;
}

} // namespace

class PostgresJournal::Implementation {
    /// Runs an operation that may be repeated, on a connection.
    template <class Operation>
    auto run(Deadline const& deadline, Operation const& operation) {
        return session_.repeat(deadline, [&] {
            process_ = session_.process();
            return operation();
        });
    }

public:
    Implementation(ServiceSettings const& settings, std::string project)
        : project_(std::move(project)),
          where_(ConnectOptions::nameOf(settings.service) + ", project " + project_),
          channel_(channelOf(project_)),
          session_(settings, where_),
          lock_(session_, project_),
          listener_(settings, where_, channel_) {}

    std::string const& name() const { return where_; }

    JournalLook look(std::optional<std::uint64_t> seen) {
        LookRows const rows(project_, seen);
        auto const deadline = session_.deadline();
        return run(deadline, [&] { return lookNow(rows, deadline); });
    }

    JournalLook lock(milliseconds patience, std::optional<std::uint64_t> seen) {
        LookRows const rows(project_, seen);
        Deadline const deadline(session_.settings().operationLimit + patience);
        Deadline const lockDeadline(patience);
        try {
            return run(deadline, [&] {
                auto const answers =
                    lock_.take(lockDeadline.remaining(), rows.calls(), limitOf(rows, deadline));
                auto result = rows.read(answers, where_);
                return result ? std::move(*result) : lookNow(rows, deadline);
            });
        } catch (...) {
            unlock();
            throw;
        }
    }

    void unlock() noexcept {
        std::vector<Call> calls;
        if (std::exchange(hasNews_, false)) {
            calls.push_back({notify, {{channel_}}});
        }
        lock_.release(calls);
    }

    std::string body(stores::JournalPosition const& entry) {
        auto const version = std::to_string(entry.version);
        auto const deadline = session_.deadline();
        auto const answers = run(deadline, [&] {
            return session_.run(
                {{piecesOfEntry, {{project_}, {version}, {entry.id}}}, {allPieces, {{project_}, {entry.id}}}},
                session_.transferDeadline());
        });
        bool const isThere = answers[0].rows() == 1;
        auto bytes = isThere ? readPieces(answers[1], answers[0].number(0, 0)) : std::nullopt;
        if (!bytes) {
            throw StoreError(StoreError::Kind::Damaged, where_, 0,
                             errorTexts.get(isThere ? "BodyUnreadable" : "BodyMissing", version),
                             errorTexts.get("RemedyOfMissingBody"));
        }
        return std::move(*bytes);
    }

    Appended append(NewJournalEntry const& entry) {
        lock_.require();
        auto const result = EntryAppender(session_, lock_, project_, entry).append();
        process_ = session_.process();
        hasNews_ = hasNews_ || result == Appended::Stored;
        return result;
    }

    bool awaitChange(milliseconds time) { return listener_.await(time, process_); }

    void wake() noexcept { listener_.wake(); }

    std::vector<JournalRecord> records(std::optional<std::uint64_t> before, std::size_t count) {
        auto const end = std::to_string(before.value_or(std::numeric_limits<std::int64_t>::max()));
        auto const limit = std::to_string(count);
        auto const deadline = session_.deadline();
        auto const answers = run(deadline, [&] {
            return session_.run({{newestRecords, {{project_}, {end}, {limit}}}}, deadline);
        });
        std::vector<JournalRecord> records;
        records.reserve(static_cast<std::size_t>(answers[0].rows()));
        for (int row = 0; row < answers[0].rows(); ++row) {
            records.push_back(recordAt(answers[0], row));
        }
        return records;
    }

    void requireOwner() {
        auto const deadline = session_.deadline();
        auto const answers = run(deadline, [&] { return session_.run({{isOwner, {}}}, deadline); });
        if (answers[0].rows() == 0 || answers[0].number(0, 0) == 0) {
            throw StoreError(StoreError::Kind::Refused, where_, 0, errorTexts.get("OwnerOnly"),
                             errorTexts.get("RemedyOfOwnerOnly"));
        }
    }

    std::size_t deleteBefore(std::uint64_t version) {
        lock_.require();
        auto const end = std::to_string(version);
        auto const deadline = session_.deadline();
        auto const answers = run(deadline, [&] {
            lock_.takeAgain(deadline);
            return session_.run({{deleteEntries, {{project_}, {end}}}, {deletePieces, {{project_}}}},
                                deadline);
        });
        return answers[0].affected();
    }

private:
    Deadline limitOf(LookRows const& rows, Deadline const& deadline) const {
        return rows.hasBody() ? session_.transferDeadline() : deadline;
    }

    JournalLook lookNow(LookRows const& rows, Deadline const& deadline) {
        for (;;) {
            auto const answers = session_.run(rows.calls(), limitOf(rows, deadline));
            auto result = rows.read(answers, where_);
            session_.requireProcess(LookRows::process(answers));
            if (result) {
                return std::move(*result);
            }
            if (deadline.isOver()) { // somebody replaces the body again and again
                throw StoreError(StoreError::Kind::Busy, where_, 0, errorTexts.get("ChangedMeanwhile"),
                                 errorTexts.get("TryAgain"));
            }
        }
    }

    std::string project_;
    std::string where_;
    std::string channel_;
    ServerSession session_;
    ProjectLock lock_;
    ChangeListener listener_;
    std::atomic<int> process_ = 0; ///< the session's, on the server
    bool hasNews_ = false;         ///< an entry was appended, and nobody was notified
};

PostgresJournal::PostgresJournal(ServiceSettings settings, std::string project) {
    requireUuid(project, ConnectOptions::nameOf(settings.service));
    implementation_ = std::make_unique<Implementation>(settings, std::move(project));
}

PostgresJournal::~PostgresJournal() = default;

std::string PostgresJournal::name() const {
    return implementation_->name();
}

JournalLook PostgresJournal::look(std::optional<std::uint64_t> seen) {
    return implementation_->look(seen);
}

JournalLook PostgresJournal::lock(milliseconds patience, std::optional<std::uint64_t> seen) {
    return implementation_->lock(patience, seen);
}

void PostgresJournal::unlock() noexcept {
    implementation_->unlock();
}

std::string PostgresJournal::body(stores::JournalPosition const& entry) {
    return implementation_->body(entry);
}

stores::Journal::Appended PostgresJournal::append(NewJournalEntry const& entry) {
    return implementation_->append(entry);
}

bool PostgresJournal::awaitChange(milliseconds time) {
    return implementation_->awaitChange(time);
}

void PostgresJournal::wake() noexcept {
    implementation_->wake();
}

std::vector<JournalRecord> PostgresJournal::records(std::optional<std::uint64_t> before, std::size_t count) {
    return implementation_->records(before, count);
}

void PostgresJournal::requireOwner() {
    implementation_->requireOwner();
}

std::size_t PostgresJournal::deleteBefore(std::uint64_t version) {
    return implementation_->deleteBefore(version);
}

} // namespace project::postgresql
