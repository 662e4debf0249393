#include "support/MemoryJournal.hpp"

#include <algorithm>
#include <stdexcept>
#include <utility>

#include "project/stores/StoreError.hpp"
#include "support/CrashingDisk.hpp"

namespace project::test {

using stores::JournalLook;
using stores::JournalPosition;
using stores::JournalRecord;
using stores::StoreError;

namespace {

StoreError error(StoreError::Kind kind, std::string problem) {
    return StoreError(kind, "memory/project", 0, std::move(problem), "");
}

} // namespace

void JournalServer::plan(InjectedFault fault, std::size_t callsBefore) {
    planned_ = fault;
    callsBefore_ = callsBefore;
}

bool JournalServer::cancelPlan() {
    lasting_ = InjectedFault::None;
    return std::exchange(planned_, InjectedFault::None) != InjectedFault::None;
}

std::size_t JournalServer::count(std::string const& call) const {
    return static_cast<std::size_t>(std::count(calls.begin(), calls.end(), call));
}

JournalServer::Entry& JournalServer::entry(std::uint64_t version) {
    auto const found = std::find_if(entries_.begin(), entries_.end(), [version](Entry const& entry) {
        return entry.read.position.version == version;
    });
    if (found == entries_.end()) {
        throw std::logic_error("the log has no such version");
    }
    return *found;
}

void JournalServer::resetTo(std::uint64_t version) {
    dropConnections();
    delayed_.reset();
    while (!entries_.empty() && entries_.back().read.position.version > version) {
        entries_.pop_back();
    }
}

void JournalServer::deleteBefore(std::uint64_t version) {
    while (!entries_.empty() && entries_.front().read.position.version < version) {
        pieces_.erase(entries_.front().read.position.id);
        entries_.pop_front();
    }
}

void JournalServer::dropConnections() {
    std::lock_guard const guard(mutex_);
    oldestSession_ = sessions_ + 1;
    holder_ = 0;
    changed_.notify_all();
}

bool JournalServer::isConnected(std::uint64_t session) const {
    return session >= oldestSession_;
}

void JournalServer::disconnect(std::uint64_t session) {
    if (holder_ == session) {
        holder_ = 0;
    }
    changed_.notify_all();
}

std::uint64_t JournalServer::newest() const {
    return entries_.empty() ? 0 : entries_.back().read.position.version;
}

/// The statement that decides.
JournalServer::Appended JournalServer::insert(Entry const& entry) {
    if (auto const found = find(entry.read.position)) {
        return *found;
    }
    bool const follows = entry.read.position.version == newest() + 1 &&
                         (entries_.empty() || entries_.back().read.position.sum == entry.read.after);
    if (!follows || (entry.read.isBody && !pieces_.contains(entry.read.position.id))) {
        return Appended::Superseded;
    }
    entries_.push_back(entry);
    changed_.notify_all();
    return Appended::Stored;
}

/// The outcome of an append, as far as it is known.
std::optional<JournalServer::Appended> JournalServer::find(JournalPosition const& position) const {
    for (Entry const& entry : entries_) {
        if (entry.read.position.version == position.version) {
            return entry.read.position.id == position.id ? Appended::Stored : Appended::Superseded;
        }
    }
    return std::nullopt;
}

JournalLook JournalServer::look(std::optional<std::uint64_t> seen) const {
    auto begin = entries_.begin();
    JournalLook result;
    if (seen) {
        begin = std::find_if(entries_.begin(), entries_.end(),
                             [seen](Entry const& entry) { return entry.read.position.version >= *seen; });
    } else {
        auto const newestBody = std::find_if(entries_.rbegin(), entries_.rend(),
                                             [](Entry const& entry) { return entry.read.isBody; });
        begin = newestBody == entries_.rend() ? entries_.begin() : std::prev(newestBody.base());
        if (auto const bytes =
                newestBody == entries_.rend() ? pieces_.end() : pieces_.find(begin->read.position.id);
            bytes != pieces_.end()) {
            result.body = bytes->second;
        }
    }
    for (auto entry = begin; entry != entries_.end(); ++entry) {
        result.entries.push_back(entry->read);
        if (entry->read.position.version == seen) {
            result.entries.back().lines.clear();
        }
    }
    return result;
}

JournalServer::InjectedFault JournalServer::nextFault(std::string const& call) {
    calls.push_back(call);
    if (lasting_ != InjectedFault::None) {
        return lasting_;
    }
    if (planned_ == InjectedFault::None || callsBefore_-- > 0) {
        return InjectedFault::None;
    }
    InjectedFault const fault = std::exchange(planned_, InjectedFault::None);
    if (fault == InjectedFault::Unreachable || fault == InjectedFault::Stalls ||
        fault == InjectedFault::StallsLate) {
        lasting_ = InjectedFault::Unreachable;
    }
    return fault;
}

void JournalServer::delay(Entry const& entry) {
    std::lock_guard const guard(mutex_);
    delayed_ = entry;
    delay_ = callsBeforeLate;
}

void JournalServer::runDelayed() {
    if (delayed_ && delay_-- == 0) {
        insert(*std::exchange(delayed_, std::nullopt));
    }
}

MemoryJournal::MemoryJournal(std::shared_ptr<JournalServer> server, std::string user)
    : server_(std::move(server)), user_(std::move(user)) {
}

MemoryJournal::~MemoryJournal() {
    std::lock_guard const guard(server_->mutex_);
    disconnect();
}

/// One call of the server, with the fault that is planned for it. @param effect runs on the server.
template <typename Effect>
auto MemoryJournal::call(std::string const& name, Effect const& effect) {
    using Fault = JournalServer::InjectedFault;
    if (isDead_) {
        throw ProcessDied();
    }
    if (auto const act = server_->beforeCall) {
        act(name);
    }
    std::unique_lock guard(server_->mutex_);
    connect();
    Fault const fault = server_->nextFault(name);
    if (fault != Fault::Unreachable && fault != Fault::LostBefore) {
        server_->runDelayed();
    }
    switch (fault) {
    case Fault::None:
        return effect(guard);
    case Fault::LostBefore:
        disconnect();
        throw ConnectionLost();
    case Fault::LostAfter:
        effect(guard);
        disconnect();
        throw ConnectionLost();
    case Fault::Stalls:
        effect(guard);
        disconnect();
        throw NoAnswer();
    case Fault::DiskFull:
        throw error(StoreError::Kind::DiskFailed, "the disk of the server is full");
    case Fault::DiesBefore:
        die();
    case Fault::DiesAfter:
        effect(guard);
        die();
    case Fault::Unreachable:
    case Fault::StallsLate:
        break;
    }
    disconnect();
    throw NoAnswer{fault == Fault::StallsLate};
}

/// A call that may be repeated when the connection is lost.
template <typename Effect>
auto MemoryJournal::callAgain(std::string const& name, Effect const& effect) {
    for (int attempt = 0;; ++attempt) {
        try {
            return call(name, effect);
        } catch (ConnectionLost const&) {
            if (attempt == 2) {
                throw error(StoreError::Kind::Unreachable, "the connection is lost again and again");
            }
        } catch (NoAnswer const&) {
            throw error(StoreError::Kind::Unreachable, "the server does not answer");
        }
    }
}

void MemoryJournal::connect() {
    if (session_ == 0 || !server_->isConnected(session_)) {
        session_ = ++server_->sessions_;
    }
}

void MemoryJournal::disconnect() {
    server_->disconnect(session_);
    session_ = 0;
}

void MemoryJournal::die() {
    isDead_ = true;
    disconnect();
    throw ProcessDied();
}

JournalLook MemoryJournal::look(std::optional<std::uint64_t> seen) {
    return callAgain("look", [&](auto&) { return server_->look(seen); });
}

JournalLook MemoryJournal::lock(std::chrono::milliseconds patience, std::optional<std::uint64_t> seen) {
    patience_ = patience;
    return callAgain("lock", [&](auto& guard) {
        bool const isFree = server_->changed_.wait_for(
            guard, patience, [&] { return server_->holder_ == 0 || server_->holder_ == session_; });
        if (!isFree) {
            throw error(StoreError::Kind::Busy, "is locked by " + server_->holderName_);
        }
        server_->holder_ = session_;
        server_->holderName_ = user_;
        return server_->look(seen);
    });
}

void MemoryJournal::unlock() noexcept {
    if (isDead_ || session_ == 0) {
        return;
    }
    std::lock_guard const guard(server_->mutex_);
    if (server_->holder_ == session_) {
        server_->holder_ = 0;
        server_->changed_.notify_all();
    }
}

std::string MemoryJournal::body(JournalPosition const& entry) {
    return callAgain("body", [&](auto&) {
        auto const found = server_->pieces_.find(entry.id);
        if (found == server_->pieces_.end()) {
            throw error(StoreError::Kind::Damaged, "a part of the body is missing");
        }
        return found->second;
    });
}

stores::Journal::Appended MemoryJournal::append(stores::NewJournalEntry const& entry) {
    if (entry.lines.size() > longestBatch) {
        throw std::logic_error("the lines of an entry are too long");
    }
    JournalServer::Entry const stored{
        {entry.position, entry.isBody, std::string(entry.after), std::string(entry.lines)}, user_};
    bool isSent = false;
    try {
        for (int attempt = 0; attempt < 3; ++attempt) {
            try {
                return tryToAppend(stored, entry.body, isSent);
            } catch (ConnectionLost const&) {
                // connects again
            }
        }
    } catch (NoAnswer const&) {
        // reported below
    } catch (StoreError const&) {
        if (!isSent) {
            throw;
        }
    }
    throw isSent ? error(StoreError::Kind::OutcomeUnknown,
                         "the server did not answer: it is unknown whether the batch is in the project")
                 : error(StoreError::Kind::Unreachable, "the server does not answer");
}

stores::Journal::Appended MemoryJournal::tryToAppend(JournalServer::Entry const& entry, std::string_view body,
                                                     bool& isSent) {
    JournalPosition const& position = entry.read.position;
    if (isSent) { // the session that sent it has ended, so it is there or will never be
        auto const found = call("find", [&](auto&) { return server_->find(position); });
        isSent = false;
        if (found) {
            return *found;
        }
    }
    if (session_ == 0 || server_->holder_ != session_) {
        call("lock", [&](auto& guard) {
            bool const isFree =
                server_->changed_.wait_for(guard, patience_, [&] { return server_->holder_ == 0; });
            if (!isFree) {
                throw error(StoreError::Kind::Busy, "is locked by " + server_->holderName_);
            }
            server_->holder_ = session_;
            server_->holderName_ = user_;
        });
    }
    if (entry.read.isBody) {
        call("pieces", [&](auto&) { server_->pieces_[position.id] = std::string(body); });
    }
    isSent = true;
    try {
        return call("insert", [&](auto&) { return server_->insert(entry); });
    } catch (NoAnswer const& failure) {
        if (failure.isLate) {
            server_->delay(entry);
        }
        throw;
    } catch (StoreError const&) {
        isSent = false; // the server has refused it
        throw;
    }
}

bool MemoryJournal::awaitChange(std::chrono::milliseconds time) {
    std::unique_lock guard(server_->mutex_);
    bool const isChanged =
        server_->changed_.wait_for(guard, time, [&] { return isWoken_ || server_->newest() != awaited_; });
    awaited_ = server_->newest();
    isWoken_ = false;
    return isChanged;
}

void MemoryJournal::wake() noexcept {
    std::lock_guard const guard(server_->mutex_);
    isWoken_ = true;
    server_->changed_.notify_all();
}

std::vector<JournalRecord> MemoryJournal::records(std::optional<std::uint64_t> before, std::size_t count) {
    return callAgain("records", [&](auto&) {
        std::vector<JournalRecord> result;
        for (auto entry = server_->entries_.rbegin(); entry != server_->entries_.rend(); ++entry) {
            if (result.size() < count && (!before || entry->read.position.version < *before)) {
                result.push_back({entry->read.position, entry->read.isBody, entry->author, "host", {}});
            }
        }
        return result;
    });
}

void MemoryJournal::requireOwner() {
    callAgain("owner", [&](auto&) {
        if (user_ != server_->owner_) {
            throw error(StoreError::Kind::Refused, "only the owner of the project may do this");
        }
        return true;
    });
}

std::size_t MemoryJournal::deleteBefore(std::uint64_t version) {
    return callAgain("delete", [&](auto&) {
        if (user_ != server_->owner_) {
            throw error(StoreError::Kind::Refused, "only the owner of the project may delete its history");
        }
        std::size_t const before = server_->entries_.size();
        server_->deleteBefore(version);
        std::erase_if(server_->pieces_, [&](auto const& piece) {
            return std::none_of(server_->entries_.begin(), server_->entries_.end(),
                                [&](auto const& entry) { return entry.read.position.id == piece.first; });
        });
        return before - server_->entries_.size();
    });
}

} // namespace project::test
