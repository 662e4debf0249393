#pragma once

#include <atomic>
#include <chrono>
#include <condition_variable>
#include <cstddef>
#include <mutex>
#include <string>
#include <thread>

#include "texts/Message.hpp"

namespace projectctl {

/// Shows the current work of the tool on the terminal: one line, after a second, deleted at the end.
///
/// A thread draws the line, because the work may be one long call into the library. Without a terminal there
/// is no thread, and nothing is written. Of two that exist at the same time, only the first one is shown.
class Progress {
public:
    struct Timing {
        std::chrono::milliseconds patience = std::chrono::seconds(1); ///< time until the line is shown
        std::chrono::milliseconds interval = std::chrono::milliseconds(200);
    };

    /// @param work the first piece of work. Its text is only read if it is shown.
    explicit Progress(Message const& work);

    /// @param descriptor the terminal to draw on; nothing is drawn if it is not a terminal.
    Progress(std::string work, int descriptor, Timing timing);
    ~Progress();
    Progress(Progress const&) = delete;
    Progress& operator=(Progress const&) = delete;

    /// Continues with another piece of work, with a count of 0.
    void begin(Message const& work);

    /// Sets the count, which is shown if it is not 0. Cheap enough to call for each file.
    void reach(std::size_t count) noexcept { count_.store(count, std::memory_order_relaxed); }

    /// Ends the one that is shown, before results are written to the terminal.
    static void endShown();

private:
    static Progress*& shown();
    void start();
    void end();
    void drawUntilStopped();
    std::string line();

    int descriptor_;
    Timing timing_;
    std::atomic<std::size_t> count_ = 0;
    std::mutex mutex_;
    std::string work_;
    std::condition_variable changed_;
    bool isStopped_ = false;
    std::thread drawing_;
};

} // namespace projectctl
