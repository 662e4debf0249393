#include "connection/Connection.hpp"

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <memory>
#include <utility>

#include <poll.h>
#include <unistd.h>

#include "connection/ServerError.hpp"
#include "texts/ErrorTexts.hpp"

namespace project::postgresql {

namespace {

using std::chrono::milliseconds;
using stores::StoreError;

/// Waits for a descriptor. @return false at the end of the time.
bool awaitDescriptor(int descriptor, short events, Deadline const& deadline) {
    for (;;) {
        pollfd entry{descriptor, events, 0};
        int const count = ::poll(&entry, 1, static_cast<int>(deadline.remaining().count()));
        if (count > 0) {
            return true;
        }
        if (count == 0 || errno != EINTR) {
            return false;
        }
    }
}

std::string inSeconds(milliseconds time) {
    auto const tenths = time.count() / 100;
    return std::to_string(tenths / 10) + "." + std::to_string(tenths % 10) + " s";
}

/// Calls with more bytes are sent before the next one is added, so that they do not add up in memory.
constexpr std::size_t manyBytes = std::size_t{1} << 16;

std::size_t lengthOf(Call const& call) {
    std::size_t length = 0;
    for (auto const& parameter : call.parameters) {
        length += parameter.bytes.size();
    }
    return length;
}

} // namespace

Connection::Connection(ConnectOptions const& options, std::string where, Deadline const& deadline)
    : where_(std::move(where)),
      process_(::getpid()),
      handle_(PQconnectStartParams(options.keywords().data(), options.values().data(), 1)) {
    if (handle_ == nullptr) {
        throw StoreError(StoreError::Kind::DiskFailed, where_, 0, errorTexts.get("NoMemory"), "");
    }
    auto const finish = [](PGconn* handle) { PQfinish(handle); };
    std::unique_ptr<PGconn, decltype(finish)> guard(handle_, finish);
    PQsetErrorVerbosity(handle_, PQERRORS_VERBOSE); // the only way to the code of a refusal
    PQsetNoticeReceiver(handle_, &Connection::noteWarning, this);
    auto state = PQstatus(handle_) == CONNECTION_BAD ? PGRES_POLLING_FAILED : PGRES_POLLING_WRITING;
    while (state != PGRES_POLLING_OK) {
        if (state == PGRES_POLLING_FAILED) {
            throwConnectError(where_, PQerrorMessage(handle_));
        }
        short const events = state == PGRES_POLLING_READING ? POLLIN : POLLOUT;
        if (!awaitDescriptor(PQsocket(handle_), events, deadline)) {
            throw ConnectionLost(where_, errorTexts.get("ConnectionTimedOut"));
        }
        state = PQconnectPoll(handle_);
    }
    if (PQsetnonblocking(handle_, 1) != 0 || PQenterPipelineMode(handle_) != 1) {
        throwLost();
    }
    static_cast<void>(guard.release());
}

Connection::~Connection() {
    if (::getpid() == process_) {
        PQfinish(handle_);
    } else { // PQfinish would end the parent's session; the child's memory of it is never used again
        ::close(PQsocket(handle_));
    }
}

std::vector<Result> Connection::run(std::vector<Call> const& calls, Limits const& limits) {
    requireOwnProcess();
    for (; posted_ > 0; --posted_) {
        receive(limits);
    }
    hasWarned_ = false;
    if (!send(calls, &limits)) {
        throwLost();
    }
    flush(limits);
    auto answers = receive(limits);
    if (answers.failure) {
        throwStatementError(where_, answers.failure->handle());
    }
    return std::move(answers.results);
}

bool Connection::post(std::vector<Call> const& calls) noexcept {
    try {
        requireOwnProcess();
        ++posted_;
        return send(calls, nullptr) && PQflush(handle_) == 0;
    } catch (...) {
        return false;
    }
}

std::optional<int> Connection::notification() {
    requireOwnProcess();
    if (PQconsumeInput(handle_) != 1) {
        throwLost();
    }
    auto const finish = [](PGnotify* notification) { PQfreemem(notification); };
    std::unique_ptr<PGnotify, decltype(finish)> const notification(PQnotifies(handle_), finish);
    return notification != nullptr ? std::optional(notification->be_pid) : std::nullopt;
}

std::string Connection::quoted(std::string const& identifier) const {
    auto const finish = [](char* text) { PQfreemem(text); };
    std::unique_ptr<char, decltype(finish)> const text(
        PQescapeIdentifier(handle_, identifier.data(), identifier.size()), finish);
    if (text == nullptr) {
        throw StoreError(StoreError::Kind::Refused, where_, 0, errorTexts.get("NameUnusable", identifier),
                         "");
    }
    return text.get();
}

bool Connection::send(std::vector<Call> const& calls, Limits const* limits) {
    for (auto const& call : calls) {
        if (!sendOne(call)) {
            return false;
        }
        if (limits != nullptr && lengthOf(call) > manyBytes) {
            flush(*limits);
        }
    }
    return PQpipelineSync(handle_) == 1;
}

bool Connection::sendOne(Call const& call) {
    std::vector<char const*> values;
    std::vector<int> lengths;
    std::vector<int> formats;
    std::deque<std::string> texts; // libpq wants the end of a text marked by a zero
    for (auto const& parameter : call.parameters) {
        values.push_back(parameter.isBinary ? parameter.bytes.data()
                                            : texts.emplace_back(parameter.bytes).c_str());
        if (values.back() == nullptr) {
            values.back() = ""; // a null pointer would mean the value null
        }
        lengths.push_back(static_cast<int>(parameter.bytes.size()));
        formats.push_back(parameter.isBinary ? 1 : 0);
    }
    auto const count = static_cast<int>(values.size());
    auto const& statement = call.statement;
    if (*statement.name == '\0') {
        expected_.push_back(nullptr);
        return PQsendQueryParams(handle_, statement.text, count, nullptr, values.data(), lengths.data(),
                                 formats.data(), 1) == 1;
    }
    if (prepared_.insert(statement.name).second) {
        expected_.push_back(statement.name);
        if (PQsendPrepare(handle_, statement.name, statement.text, 0, nullptr) != 1) {
            return false;
        }
    }
    expected_.push_back(nullptr);
    return PQsendQueryPrepared(handle_, statement.name, count, values.data(), lengths.data(), formats.data(),
                               1) == 1;
}

Connection::Answers Connection::receive(Limits const& limits) {
    Answers answers;
    for (;;) {
        Result result(nextResult(limits));
        auto const status = PQresultStatus(result.handle());
        if (status == PGRES_PIPELINE_SYNC) {
            return answers;
        }
        if (expected_.empty()) {
            throwLost();
        }
        char const* const preparedName = expected_.front();
        expected_.pop_front();
        bool const isError = status != PGRES_COMMAND_OK && status != PGRES_TUPLES_OK;
        if (preparedName != nullptr && isError) {
            prepared_.erase(preparedName);
        }
        if (status == PGRES_FATAL_ERROR && !answers.failure) {
            answers.failure = std::move(result);
        } else if (preparedName == nullptr) {
            answers.results.push_back(std::move(result));
        }
    }
}

PGresult* Connection::nextResult(Limits const& limits) {
    for (int ends = 0; ends < 2; ++ends) { // each answer except the last one is followed by an end
        while (PQisBusy(handle_) != 0) {
            waitFor(POLLIN, limits);
            if (PQconsumeInput(handle_) != 1) {
                throwLost();
            }
        }
        PGresult* const result = PQgetResult(handle_);
        if (PQstatus(handle_) == CONNECTION_BAD) {
            PQclear(result);
            throwLost();
        }
        if (result != nullptr) {
            return result;
        }
    }
    throwLost();
}

void Connection::flush(Limits const& limits) {
    for (int left = PQflush(handle_); left != 0; left = PQflush(handle_)) {
        if (left < 0) {
            throwLost();
        }
        waitFor(POLLIN | POLLOUT, limits);
        if (PQconsumeInput(handle_) != 1) { // the server does not read on while we do not
            throwLost();
        }
    }
}

void Connection::waitFor(short events, Limits const& limits) {
    auto const limit = std::min(limits.whole.remaining(), limits.silence);
    if (!awaitDescriptor(PQsocket(handle_), events, Deadline(limit))) {
        throw ConnectionLost(where_, errorTexts.get("NoAnswer", inSeconds(limit)));
    }
}

void Connection::requireOwnProcess() const {
    refuseAfterFork(process_, where_);
}

void Connection::throwLost() const {
    throw ConnectionLost(where_, shownMessage(PQerrorMessage(handle_)));
}

void Connection::noteWarning(void* connection, PGresult const* notice) {
    char const* const severity = PQresultErrorField(notice, PG_DIAG_SEVERITY_NONLOCALIZED);
    if (severity != nullptr && std::strcmp(severity, "WARNING") == 0) {
        static_cast<Connection*>(connection)->hasWarned_ = true;
    }
}

} // namespace project::postgresql
