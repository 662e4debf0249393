#include "cmlink/ReentrantReadWriteLock.hpp"

#include <condition_variable>
#include <cstddef>
#include <cstdint>
#include <exception>
#include <mutex>
#include <system_error>
#include <utility>

#include "texts/ErrorTexts.hpp"

namespace cmlink {

/// The state that all threads share: the threads that have the lock, and those that are next. A thread
/// accesses it only with its first guard and after its last one.
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
        bool const isFirst = access == Access::Write || readers_ == 1;
        if (isFirst && hooks_.first) {
            runFirst(lock, access);
        }
    }

    void leave(Access access) noexcept {
        std::unique_lock lock(mutex_);
        if (removeOne(access) > 0) {
            return;
        }
        if (hooks_.last) {
            isInHook_ = true;
            lock.unlock();
            hooks_.last();
            lock.lock();
            isInHook_ = false;
        }
        admitNext(access);
    }

private:
    void waitToRead(std::unique_lock<std::mutex>& lock) {
        std::uint64_t const turn = turn_;
        ++waitingReaders_;
        readersCanEnter_.wait(lock, [&] {
            bool const isOurTurn = waitingWriters_ == 0 || turn_ != turn;
            return !hasWriter_ && !isInHook_ && isOurTurn;
        });
        --waitingReaders_;
        if (turn_ != turn) {
            --admittedReaders_;
        }
        ++readers_;
    }

    void waitToWrite(std::unique_lock<std::mutex>& lock) {
        ++waitingWriters_;
        writersCanEnter_.wait(lock, [&] {
            bool const isFree = !hasWriter_ && readers_ == 0 && !isInHook_;
            return isFree && admittedReaders_ == 0;
        });
        --waitingWriters_;
        hasWriter_ = true;
    }

    void runFirst(std::unique_lock<std::mutex>& lock, Access access) {
        isInHook_ = true;
        lock.unlock();
        try {
            hooks_.first(access);
        } catch (...) {
            lock.lock();
            isInHook_ = false;
            removeOne(access);
            admitNext(access);
            throw;
        }
        lock.lock();
        isInHook_ = false;
        if (access == Access::Read) {
            readersCanEnter_.notify_all();
        }
    }

    /// Removes this thread. @return the number of threads that still have the lock.
    std::size_t removeOne(Access access) noexcept {
        if (access == Access::Write) {
            hasWriter_ = false;
            return 0;
        }
        return --readers_;
    }

    /// Wakes the threads that are next, after the last thread has released the lock.
    void admitNext(Access before) noexcept {
        if (before == Access::Write && waitingReaders_ > 0) {
            ++turn_;
            admittedReaders_ = waitingReaders_;
        }
        if (admittedReaders_ > 0 || waitingWriters_ == 0) {
            readersCanEnter_.notify_all();
        } else {
            writersCanEnter_.notify_one();
        }
    }

    std::mutex mutex_;
    std::condition_variable readersCanEnter_;
    std::condition_variable writersCanEnter_;
    Hooks hooks_;
    std::size_t readers_ = 0;
    bool hasWriter_ = false;
    bool isInHook_ = false; ///< a hook is running, during which no thread can enter
    std::size_t waitingReaders_ = 0;
    std::size_t waitingWriters_ = 0;
    std::uint64_t turn_ =
        0; ///< incremented when a writer leaves and the readers that are waiting then are admitted
    std::size_t admittedReaders_ = 0; ///< admitted and not in yet; they precede every writer
};

namespace {

/// One lock that the current thread has, and the number of its guards. The list rarely has more than two
/// entries. It has no destructor, so that guards work in whatever order the objects of a thread or the
/// program are destroyed.
struct Hold {
    ReentrantReadWriteLock const* lock;
    ReentrantReadWriteLock::Access access; ///< of the first guard
    std::size_t guards;
    Hold* next;
};

constinit thread_local Hold* holds = nullptr;

/// The pointer to the current thread's entry for a lock, or the null pointer at the end of the list.
Hold** findHold(ReentrantReadWriteLock const* lock) noexcept {
    Hold** at = &holds;
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
    if (Hold* const held = *findHold(this)) {
        if (access == Access::Write && held->access == Access::Read) {
            // Two threads that read and wait for the write lock would wait for each other forever.
            throw std::system_error(std::make_error_code(std::errc::resource_deadlock_would_occur),
                                    fl::i18n::errorTexts.get("ReaderWantsToWrite"));
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
    Hold* const held = *place;
    if (held == nullptr) {
        std::terminate(); // taken on another thread: the lock would never be released
    }
    if (--held->guards > 0) {
        return;
    }
    Access const access = held->access;
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
