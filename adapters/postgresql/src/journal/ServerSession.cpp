#include "journal/ServerSession.hpp"

#include <utility>

#include <unistd.h>

#include "texts/ErrorTexts.hpp"

namespace project::postgresql {

namespace {

using std::chrono::milliseconds;
using stores::StoreError;

/// Settings of the session, as far as the server knows them: it ends a statement whose client is gone, and
/// notices a dead client. Each statement of a journal reads a few rows by their key, whatever the values are,
/// so the server plans it once. Without these settings, it plans a check for changes each time, which takes
/// longer than the check, or reads a whole table that was small when it was planned.
constexpr Statement configure{
    "", "SELECT set_config(s.name, s.value, false) FROM (VALUES"
        " ('client_connection_check_interval', '5s'), ('tcp_keepalives_idle', '10'),"
        " ('tcp_keepalives_interval', '5'), ('tcp_keepalives_count', '3'), ('tcp_user_timeout', '10s'),"
        " ('plan_cache_mode', 'force_generic_plan'), ('enable_seqscan', 'off'), ('jit', 'off'),"
        " ('search_path', '')) AS s(name, value)"
        " WHERE current_setting(s.name, true) IS NOT NULL"};

constexpr Statement identify{"", "SELECT pid, extract(epoch FROM backend_start)::text FROM pg_stat_activity"
                                 " WHERE pid = pg_backend_pid()"};

constexpr Statement terminate{"",
                              "SELECT pg_terminate_backend(pid) FROM pg_stat_activity"
                              " WHERE pid = $1::int AND extract(epoch FROM backend_start)::text = $2::text"};

constexpr Statement isRunning{"",
                              "SELECT FROM pg_stat_activity"
                              " WHERE pid = $1::int AND extract(epoch FROM backend_start)::text = $2::text"};

constexpr milliseconds timeToEnd{5000};
constexpr milliseconds shortPause{2};

} // namespace

ServerSession::ServerSession(ServiceSettings const& settings, std::string where)
    : settings_(settings), where_(std::move(where)), owner_(::getpid()) {
}

void ServerSession::connect(Deadline const& deadline) {
    refuseAfterFork(owner_, where_);
    if (connection_) {
        return;
    }
    if (!options_) {
        options_ = std::make_unique<ConnectOptions>(settings_.service);
    }
    connection_ = std::make_unique<Connection>(*options_, where_, deadline.within(settings_.connectLimit));
    current_ = ServerProcess();
    ++serial_;
    try {
        introduce(deadline);
        endFormerProcesses(deadline);
    } catch (...) {
        close();
        throw;
    }
    wasConnected_ = true;
}

void ServerSession::close() noexcept {
    if (connection_ && current_.process != 0) {
        former_.push_back(std::exchange(current_, ServerProcess()));
    }
    connection_.reset();
}

std::vector<Result> ServerSession::run(std::vector<Call> const& calls, Deadline const& deadline,
                                       milliseconds extraSilence) {
    return connection_->run(calls, {deadline, settings_.silenceLimit + extraSilence});
}

void ServerSession::post(std::vector<Call> const& calls) noexcept {
    if (connection_ && !connection_->post(calls)) {
        close();
    }
}

void ServerSession::requireProcess(std::int64_t process) const {
    if (process != connection_->serverProcess()) {
        throw StoreError(StoreError::Kind::Refused, where_, 0, errorTexts.get("Pooler"),
                         errorTexts.get("RemedyOfPooler"));
    }
}

void ServerSession::introduce(Deadline const& deadline) {
    auto const results = run({{configure, {}}, {identify, {}}}, deadline);
    auto const& identity = results.back();
    if (identity.rows() != 1) {
        throw StoreError(StoreError::Kind::Refused, where_, 0, errorTexts.get("ProcessesHidden"), "");
    }
    requireProcess(identity.number(0, 0));
    current_ = {static_cast<int>(identity.number(0, 0)), identity.text(0, 1)};
}

void ServerSession::endFormerProcesses(Deadline const& deadline) {
    for (; !former_.empty(); former_.pop_back()) {
        auto const number = std::to_string(former_.back().process);
        std::vector<Parameter> const identity{{number}, {former_.back().start}};
        run({{terminate, identity}}, deadline);
        Deadline const end = deadline.within(timeToEnd);
        while (run({{isRunning, identity}}, deadline).front().rows() > 0) {
            if (end.isOver()) {
                throw ConnectionLost(where_, errorTexts.get("FormerProcess"));
            }
            std::this_thread::sleep_for(shortPause);
        }
    }
}

} // namespace project::postgresql
