#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

namespace project::stores {

/// The positions of the lines of a body, in order. Each takes four bytes; a body may nevertheless be longer
/// than these can count.
class LineStarts {
public:
    std::size_t size() const noexcept { return lows_.size(); }

    std::size_t operator[](std::size_t line) const noexcept {
        std::size_t high = 0;
        while (high < wraps_.size() && wraps_[high] <= line) {
            ++high;
        }
        return (high << lowBits) + lows_[line];
    }

    /// @param start behind those that were added before.
    void add(std::size_t start) {
        while (wraps_.size() < start >> lowBits) {
            wraps_.push_back(lows_.size());
        }
        lows_.push_back(static_cast<std::uint32_t>(start));
    }

    void reserve(std::size_t lines) { lows_.reserve(lines); }

private:
    static constexpr unsigned lowBits = 32;

    std::vector<std::uint32_t> lows_;
    std::vector<std::size_t> wraps_; ///< the lines from which on the high part is one more
};

} // namespace project::stores
