#pragma once

#include <atomic>
#include <cstddef>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "line/LineAddress.hpp"
#include "project/stores/Node.hpp"
#include "text/LineStarts.hpp"

namespace project::stores {

/// The bytes of a body, and the positions of its lines that are canonical and in order. These lines are
/// strictly sorted, so that an address is found by bisection. Lines are compared in place; nothing else is
/// stored of them.
class TextBody {
public:
    /// A half-open range of lines.
    struct Range {
        std::size_t begin;
        std::size_t end;

        bool empty() const noexcept { return begin == end; }
    };

    TextBody() = default;

    explicit TextBody(std::string bytes) : bytes_(std::move(bytes)) {}

    std::string const& bytes() const noexcept { return bytes_; }

    /// The number of lines that can be found, without the first and the last line of the body.
    std::size_t size() const noexcept { return starts_.size(); }

    Range all() const noexcept { return {0, starts_.size()}; }

    /// A line without its end.
    std::string_view line(std::size_t index) const noexcept;

    LineAddress address(std::size_t index) const noexcept;

    /// The first line in a range that does not come before an address. Fast if it is near the beginning.
    std::size_t lowerBound(Range range, LineAddress const& address) const noexcept;

    /// The first line in a range that comes after all lines within an address. The range must begin with one
    /// of these lines or after them. Fast if the result is near the beginning.
    std::size_t endOf(Range range, LineAddress const& address) const noexcept;

    /// The lines at or below an address.
    Range within(LineAddress const& address) const noexcept;

    /// The line of exactly this address.
    std::optional<std::size_t> find(LineAddress const& address) const noexcept;

    /// The number of lines that end, including their line ends, before a position.
    std::size_t linesBefore(std::size_t offset) const noexcept;

    /// Passes on the children of an address of this depth. @param below the lines strictly below the address.
    void children(Range below, std::size_t depth, ChildSink& children) const;

    /// Adds a line, which must come after all lines added before. @param start the position of its first
    /// byte.
    void addLine(std::size_t start) { starts_.add(start); }

    void reserve(std::size_t lines) { starts_.reserve(lines); }

    /// Truncates the bytes to a size. @return the rest.
    std::string cutAt(std::size_t size);

    /// True if there is nothing between the lines.
    bool isGapless() const noexcept { return isGapless_; }

    void setGapless(bool isGapless) noexcept { isGapless_ = isGapless; }

private:
    friend class BodyWriter;

    /// Where the previous search ended. Visits of a tree search in the order of the lines, so the next search
    /// begins there; a wrong hint only costs time.
    class Hint {
    public:
        Hint() = default;

        Hint(Hint const& other) noexcept : line_(other.get()) {}

        Hint& operator=(Hint const& other) noexcept {
            set(other.get());
            return *this;
        }

        std::size_t get() const noexcept { return line_.load(std::memory_order_relaxed); }

        void set(std::size_t line) noexcept { line_.store(line, std::memory_order_relaxed); }

    private:
        std::atomic<std::size_t> line_ = 0;
    };

    std::string bytes_;
    mutable Hint lastFound_; ///< several threads may search
    LineStarts starts_;
    bool isGapless_ = false;
};

/// Builds a new canonical body from runs of lines of an old body and from new lines.
class BodyWriter {
public:
    /// @param old must outlive the writer. @param added the expected size of the new lines in bytes.
    BodyWriter(TextBody const& old, std::size_t added);

    /// Copies lines of the old body.
    void copy(TextBody::Range run);

    /// @param line without its end.
    void add(std::string_view line);

    TextBody finish() &&;

private:
    TextBody const& old_;
    TextBody written_;
};

} // namespace project::stores
