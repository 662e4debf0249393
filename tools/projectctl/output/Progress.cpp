#include "output/Progress.hpp"

#include <csignal>
#include <string_view>
#include <utility>

#include <unistd.h>

#include "output/Output.hpp"

namespace projectctl {

namespace {

constexpr std::string_view clearLine = "\r\033[K";

void draw(int descriptor, std::string_view text) {
    // Progress is not worth waiting for a terminal that is busy.
    [[maybe_unused]] auto const written = write(descriptor, text.data(), text.size());
}

} // namespace

Progress::Progress(Message const& work)
    : descriptor_(STDERR_FILENO), work_(isatty(descriptor_) == 1 ? work.text() : std::string()) {
    if (!output().isQuiet()) {
        start();
    }
}

Progress::Progress(std::string work, int descriptor, Timing timing)
    : descriptor_(descriptor), timing_(timing), work_(std::move(work)) {
    start();
}

void Progress::start() {
    if (isatty(descriptor_) != 1 || shown() != nullptr) {
        return;
    }
    shown() = this;
    // The thread blocks all signals: it would otherwise receive those that the main thread has blocked.
    sigset_t all;
    sigset_t before;
    sigfillset(&all);
    pthread_sigmask(SIG_SETMASK, &all, &before);
    drawing_ = std::thread([this] { drawUntilStopped(); });
    pthread_sigmask(SIG_SETMASK, &before, nullptr);
}

Progress::~Progress() {
    end();
}

void Progress::end() {
    if (!drawing_.joinable()) {
        return;
    }
    {
        std::lock_guard const guard(mutex_);
        isStopped_ = true;
    }
    changed_.notify_one();
    drawing_.join();
    shown() = nullptr;
}

void Progress::endShown() {
    if (shown() != nullptr) {
        shown()->end();
    }
}

/// Used by the main thread alone.
Progress*& Progress::shown() {
    static Progress* one = nullptr;
    return one;
}

void Progress::begin(Message const& work) {
    if (drawing_.joinable()) {
        std::lock_guard const guard(mutex_);
        work_ = work.text();
        reach(0);
    }
}

void Progress::drawUntilStopped() {
    std::unique_lock guard(mutex_);
    if (changed_.wait_for(guard, timing_.patience, [this] { return isStopped_; })) {
        return;
    }
    do {
        draw(descriptor_, line());
    } while (!changed_.wait_for(guard, timing_.interval, [this] { return isStopped_; }));
    draw(descriptor_, clearLine);
}

std::string Progress::line() {
    auto const count = count_.load(std::memory_order_relaxed);
    auto const text = count > 0 ? Message("ProgressCount", work_, count) : Message("ProgressWork", work_);
    return std::string(clearLine) + text.text();
}

} // namespace projectctl
