#pragma once

#include <atomic>
#include <chrono>
#include <condition_variable>
#include <cstddef>
#include <mutex>
#include <string>
#include <thread>

namespace projectctl {

/// Tells the person at the terminal what takes so long: one line, from a second on, gone again at the end.
///
/// A thread of its own draws it, since the work may be one long call into the library. Where there is no
/// terminal there is no thread either, and nothing is written.
class Progress {
public:
    struct Timing {
        std::chrono::milliseconds patience = std::chrono::seconds(1); ///< before anything is shown
        std::chrono::milliseconds interval = std::chrono::milliseconds(200);
    };

    /// @param work what is done first, for instance "reading folders".
    explicit Progress(std::string work);

    /// @param descriptor where to draw, if it is a terminal.
    Progress(std::string work, int descriptor, Timing timing);
    ~Progress();
    Progress(Progress const&) = delete;
    Progress& operator=(Progress const&) = delete;

    /// Goes over to another piece of work, with a count of 0.
    void begin(std::string work);

    /// How far the work is; shown when it is not 0. Cheap enough to be called for each file.
    void reach(std::size_t count) noexcept { count_.store(count, std::memory_order_relaxed); }

private:
    void drawUntilStopped();
    std::string line();

    int descriptor_;
    Timing timing_;
    std::atomic<std::size_t> count_ = 0;
    std::mutex guarding_;
    std::string work_;
    std::condition_variable changed_;
    bool stopped_ = false;
    std::thread drawing_;
};

} // namespace projectctl
