#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "line/LineAddress.hpp"
#include "project/stores/Node.hpp"

namespace project::stores {

/// The bytes of a body, and where those of its lines begin that are canonical and in order: strictly sorted,
/// so that an address is found by bisection. Lines are compared where they stand; nothing is kept of them.
class TextBody {
public:
    /// Lines from one up to, and not with, another.
    struct Range {
        std::size_t begin;
        std::size_t end;

        bool empty() const noexcept { return begin == end; }
    };

    TextBody() = default;

    explicit TextBody(std::string bytes) : bytes_(std::move(bytes)) {}

    std::string const& bytes() const noexcept { return bytes_; }

    /// How many lines can be found; those of the frame do not count.
    std::size_t size() const noexcept { return starts_.size(); }

    Range all() const noexcept { return {0, starts_.size()}; }

    /// A line without its end.
    std::string_view line(std::size_t index) const noexcept;

    LineAddress address(std::size_t index) const noexcept;

    /// The first line in a range that does not come before an address. Fast when it is near the beginning.
    std::size_t lowerBound(Range range, LineAddress const& address) const noexcept;

    /// The first line in a range that comes after all that lies within an address, when the range begins
    /// with such a line or behind them. Fast when it is near the beginning.
    std::size_t endOf(Range range, LineAddress const& address) const noexcept;

    /// The lines whose addresses are an address or lie below it.
    Range within(LineAddress const& address) const noexcept;

    /// The line of exactly this address.
    std::optional<std::size_t> find(LineAddress const& address) const noexcept;

    /// How many lines end, with their line ends, before a byte.
    std::size_t linesBefore(std::size_t offset) const noexcept;

    /// What stands directly below an address of this depth, by the lines strictly below it.
    Children children(Range below, std::size_t depth) const;

    /// Notes a line that comes behind all those noted before, by the offset of its first byte.
    void addLine(std::size_t start) { starts_.push_back(start); }

    void reserve(std::size_t lines) { starts_.reserve(lines); }

    /// Drops what follows the body. @return what followed.
    std::string cutAt(std::size_t size);

    /// True when the lines stand one right behind the other.
    bool isGapless() const noexcept { return gapless_; }

    void setGapless(bool gapless) noexcept { gapless_ = gapless; }

private:
    friend class BodyWriter;

    std::string bytes_;
    std::vector<std::size_t> starts_;
    bool gapless_ = false;
};

/// Puts a new canonical body together, from whole runs of lines of an old one and from new lines.
class BodyWriter {
public:
    /// @param old must outlive the writer. @param added how many bytes of new lines to expect.
    BodyWriter(TextBody const& old, std::size_t added);

    /// Takes over lines as they are.
    void copy(TextBody::Range run);

    /// @param line without its end.
    void add(std::string_view line);

    TextBody finish() &&;

private:
    TextBody const& old_;
    TextBody written_;
};

} // namespace project::stores
