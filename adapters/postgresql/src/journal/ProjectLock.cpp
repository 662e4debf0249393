#include "journal/ProjectLock.hpp"

#include <algorithm>

#include "journal/ProjectId.hpp"
#include "texts/ErrorTexts.hpp"

namespace project::postgresql {

namespace {

using std::chrono::milliseconds;
using stores::StoreError;

constexpr Statement takeLock{"take_lock", "SELECT set_config('lock_timeout', $2::text, false),"
                                          " set_config('idle_session_timeout', $3::text, false),"
                                          " pg_advisory_lock($1::bigint), pg_backend_pid()"};

constexpr Statement releaseLock{
    "release_lock", "SELECT pg_advisory_unlock($1::bigint), set_config('idle_session_timeout', '0', false)"};

constexpr Statement lockHolder{
    "", "SELECT a.usename::text, coalesce(a.application_name, ''), a.pid"
        " FROM pg_locks l JOIN pg_stat_activity a ON a.pid = l.pid"
        " WHERE l.locktype = 'advisory' AND l.granted AND l.objsubid = 1"
        " AND l.database = (SELECT oid FROM pg_database WHERE datname = current_database())"
        " AND (l.classid::bigint << 32 | l.objid::bigint) = $1::bigint"};

} // namespace

ProjectLock::ProjectLock(ServerSession& session, std::string const& project)
    : session_(session), key_(std::to_string(lockKey(project))) {
}

std::vector<Result> ProjectLock::take(milliseconds patience, std::vector<Call> const& next,
                                      Deadline const& deadline) {
    patience_ = patience;
    isWanted_ = true;
    auto const limit = std::to_string(std::max<std::int64_t>(patience.count(), 1)); // 0 would be no limit
    auto const idleLimit = std::to_string(session_.settings().idleLockLimit.count());
    std::vector<Call> calls{{takeLock, {{key_}, {limit}, {idleLimit}}}};
    calls.insert(calls.end(), next.begin(), next.end());
    std::vector<Result> answers;
    try {
        answers = session_.run(calls, deadline, patience);
    } catch (StoreError const& error) {
        if (error.kind() == StoreError::Kind::Busy) {
            throwHolder(deadline);
        }
        throw;
    }
    heldBySerial_ = session_.serial();
    session_.requireProcess(answers.front().number(0, 3));
    answers.erase(answers.begin());
    return answers;
}

void ProjectLock::takeAgain(Deadline const& deadline) {
    if (!isHeld()) {
        take(std::min(patience_, deadline.remaining()), {}, deadline);
    }
}

void ProjectLock::release(std::vector<Call> const& next) noexcept {
    try {
        std::vector<Call> calls;
        if (isHeld()) {
            calls.push_back({releaseLock, {{key_}}});
        }
        calls.insert(calls.end(), next.begin(), next.end());
        if (!calls.empty()) {
            session_.post(calls);
        }
    } catch (...) { // without memory, the lock is released with the connection
        session_.close();
    }
    isWanted_ = false;
    heldBySerial_ = 0;
}

void ProjectLock::require() const {
    if (!isWanted_) {
        throw StoreError(StoreError::Kind::Refused, session_.where(), 0, errorTexts.get("LockNotHeld"), "");
    }
}

bool ProjectLock::isHeld() const {
    return session_.process() != 0 && heldBySerial_ == session_.serial();
}

void ProjectLock::throwHolder(Deadline const& deadline) {
    auto const answers = session_.run({{lockHolder, {{key_}}}}, deadline);
    auto const& rows = answers[0];
    std::string holder = errorTexts.get("OtherProcess");
    if (rows.rows() > 0) {
        auto const program = rows.text(0, 1);
        holder = program.empty()
                     ? errorTexts.get("Holder", rows.text(0, 0), rows.number(0, 2))
                     : errorTexts.get("HolderWithProgram", rows.text(0, 0), program, rows.number(0, 2));
    }
    throw StoreError(StoreError::Kind::Busy, session_.where(), 0, errorTexts.get("LockHeldBy", holder),
                     errorTexts.get("RemedyOfLock"));
}

} // namespace project::postgresql
