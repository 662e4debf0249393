#include "cmlink/ReentrantReadWriteLock.hpp"

#include <condition_variable>
#include <cstddef>
#include <cstdint>
#include <exception>
#include <mutex>
#include <system_error>
#include <utility>

namespace cmlink {

/// What all threads share: who is in, and who is next. A thread comes here only with its first guard and when
/// its last one goes.
class ReentrantReadWriteLock::State {
public:
    explicit State(Hooks hooks) : hooks_(std::move(hooks)) {}

    void enter(Access access) {
        std::unique_lock lock(mutex_);
        if (access == Access::Read) {
            waitToRead(lock);
        } else {
            waitToWrite(lock);
        }
        bool const isFirst = access == Access::Write || reading_ == 1;
        if (isFirst && hooks_.first) {
            runFirst(lock, access);
        }
    }

    void leave(Access access) noexcept {
        std::unique_lock lock(mutex_);
        if (dropOne(access) > 0) {
            return;
        }
        if (hooks_.last) {
            inHook_ = true;
            lock.unlock();
            hooks_.last();
            lock.lock();
            inHook_ = false;
        }
        letOthersIn(access);
    }

private:
    void waitToRead(std::unique_lock<std::mutex>& lock) {
        auto const turn = turn_;
        ++waitingReaders_;
        readersMayGo_.wait(lock, [&] {
            bool const isOurTurn = waitingWriters_ == 0 || turn_ != turn;
            return !writing_ && !inHook_ && isOurTurn;
        });
        --waitingReaders_;
        if (turn_ != turn) {
            --readersToCome_;
        }
        ++reading_;
    }

    void waitToWrite(std::unique_lock<std::mutex>& lock) {
        ++waitingWriters_;
        writersMayGo_.wait(lock, [&] {
            bool const isFree = !writing_ && reading_ == 0 && !inHook_;
            return isFree && readersToCome_ == 0;
        });
        --waitingWriters_;
        writing_ = true;
    }

    void runFirst(std::unique_lock<std::mutex>& lock, Access access) {
        inHook_ = true;
        lock.unlock();
        try {
            hooks_.first(access);
        } catch (...) {
            lock.lock();
            inHook_ = false;
            dropOne(access);
            letOthersIn(access);
            throw;
        }
        lock.lock();
        inHook_ = false;
        if (access == Access::Read) {
            readersMayGo_.notify_all();
        }
    }

    /// @return how many threads hold the lock after this one let go of it.
    std::size_t dropOne(Access access) noexcept {
        if (access == Access::Write) {
            writing_ = false;
            return 0;
        }
        return --reading_;
    }

    /// Wakes those whose turn it is, after the last thread that held the lock let go of it.
    void letOthersIn(Access before) noexcept {
        if (before == Access::Write && waitingReaders_ > 0) {
            ++turn_;
            readersToCome_ = waitingReaders_;
        }
        if (readersToCome_ > 0 || waitingWriters_ == 0) {
            readersMayGo_.notify_all();
        } else {
            writersMayGo_.notify_one();
        }
    }

    std::mutex mutex_;
    std::condition_variable readersMayGo_;
    std::condition_variable writersMayGo_;
    Hooks hooks_;
    std::size_t reading_ = 0;
    bool writing_ = false;
    bool inHook_ = false; ///< a hook runs: nobody gets in meanwhile
    std::size_t waitingReaders_ = 0;
    std::size_t waitingWriters_ = 0;
    std::uint64_t turn_ = 0; ///< grows when a writer lets go and the readers waiting then get their turn
    std::size_t readersToCome_ = 0; ///< of those that got their turn; no writer gets in before they did
};

namespace {

/// That the current thread holds a lock, and how often. The list has one or two entries at almost all times.
/// It has no destructor, so that guards work in whatever order a thread or the program tears its objects
/// down.
struct Hold {
    ReentrantReadWriteLock const* lock;
    ReentrantReadWriteLock::Access access; ///< of the first guard
    std::size_t guards;
    Hold* next;
};

constinit thread_local Hold* holds = nullptr;

/// The pointer that leads to the current thread's hold of a lock, or the null one at the end of the list.
Hold** findHold(ReentrantReadWriteLock const* lock) noexcept {
    auto at = &holds;
    while (*at != nullptr && (*at)->lock != lock) {
        at = &(*at)->next;
    }
    return at;
}

} // namespace

ReentrantReadWriteLock::ReentrantReadWriteLock() : ReentrantReadWriteLock(Hooks()) {
}

ReentrantReadWriteLock::ReentrantReadWriteLock(Hooks hooks)
    : state_(std::make_unique<State>(std::move(hooks))) {
}

ReentrantReadWriteLock::~ReentrantReadWriteLock() = default;

ReentrantReadWriteLock::LockGuard ReentrantReadWriteLock::readLock() {
    return acquire(Access::Read);
}

ReentrantReadWriteLock::LockGuard ReentrantReadWriteLock::writeLock() {
    return acquire(Access::Write);
}

ReentrantReadWriteLock::LockGuard ReentrantReadWriteLock::acquire(Access access) {
    if (auto* const held = *findHold(this)) {
        if (access == Access::Write && held->access == Access::Read) {
            // Two threads that read and wait to write would wait for each other for ever.
            throw std::system_error(std::make_error_code(std::errc::resource_deadlock_would_occur),
                                    "A thread that reads cannot wait to write");
        }
        ++held->guards;
        return LockGuard(*this);
    }
    auto hold = std::make_unique<Hold>(Hold{this, access, 1, nullptr});
    state_->enter(access);
    hold->next = holds;
    holds = hold.release();
    return LockGuard(*this);
}

void ReentrantReadWriteLock::release() noexcept {
    auto* const place = findHold(this);
    auto* const held = *place;
    if (held == nullptr) {
        std::terminate(); // taken on another thread: going on would leave the lock held for ever
    }
    if (--held->guards > 0) {
        return;
    }
    auto const access = held->access;
    *place = held->next;
    delete held;
    state_->leave(access);
}

ReentrantReadWriteLock::LockGuard::LockGuard(ReentrantReadWriteLock& lock) noexcept : lock_(&lock) {
}

ReentrantReadWriteLock::LockGuard::LockGuard(LockGuard&& other) noexcept
    : lock_(std::exchange(other.lock_, nullptr)) {
}

ReentrantReadWriteLock::LockGuard& ReentrantReadWriteLock::LockGuard::operator=(LockGuard&& other) noexcept {
    LockGuard taken(std::move(other));
    std::swap(lock_, taken.lock_);
    return *this;
}

ReentrantReadWriteLock::LockGuard::~LockGuard() {
    if (lock_ != nullptr) {
        lock_->release();
    }
}

} // namespace cmlink
