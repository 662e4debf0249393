#pragma once

#include <algorithm>
#include <chrono>

namespace project::postgresql {

/// The end of a limited time.
class Deadline {
public:
    explicit Deadline(std::chrono::milliseconds time) : end_(std::chrono::steady_clock::now() + time) {}

    /// Zero if the time has run out.
    std::chrono::milliseconds remaining() const {
        auto const left =
            std::chrono::ceil<std::chrono::milliseconds>(end_ - std::chrono::steady_clock::now());
        return std::max(left, std::chrono::milliseconds(0));
    }

    bool isOver() const { return remaining() == std::chrono::milliseconds(0); }

    /// The earlier one of this deadline and another limit.
    Deadline within(std::chrono::milliseconds time) const { return Deadline(std::min(remaining(), time)); }

private:
    std::chrono::steady_clock::time_point end_;
};

} // namespace project::postgresql
