#pragma once

#include <compare>
#include <cstddef>
#include <string>
#include <string_view>

#include "project/stores/Node.hpp"

namespace project::stores {

/// More steps than this no address may have: every operation that follows an address down stays bounded.
inline constexpr std::size_t deepestAddress = 4096;

/// An address as a line of the text writes it, canonically; a view of that line.
///
/// A file's address, ("Files","Root") and then names, is written as Names: they are joined by "/", which
/// makes a path. The marker of a folder below it is that path with a "/" behind it. Everything else is
/// written as Steps: types and locations in turn, each in quotes, with commas between. Addresses are compared
/// as they are written, without decoding them.
struct LineAddress {
    enum class Form : unsigned char { Names, Steps };

    Form form;
    /// A path's content without its quotes; or the list without its brackets, in which case anything may
    /// follow behind the closing bracket.
    std::string_view text;
};

/// Walks down the steps of an address in a line.
class LineSteps {
public:
    explicit LineSteps(LineAddress const& address) noexcept;

    /// Goes one step down. @return false, with type and location unchanged, below the last one.
    bool next() noexcept;

    /// Content of the step's type.
    std::string_view type() const noexcept { return type_; }

    /// Content of the step's location.
    std::string_view location() const noexcept { return location_; }

    /// The address that ends with this step. Not always in its canonical form, but good for isWithin.
    LineAddress prefix() const noexcept;

private:
    bool nextName() noexcept;
    bool nextPair() noexcept;
    std::string_view quoted() noexcept;

    LineAddress address_;
    std::string_view type_;
    std::string_view location_;
    std::size_t at_ = 0;
    std::size_t depth_ = 0;
};

/// The order of addresses, step by step from the root; an address comes before what lies below it.
std::strong_ordering compare(LineAddress const& left, LineAddress const& right) noexcept;

/// True when the address is the other one or lies below it.
bool isWithin(LineAddress const& address, LineAddress const& other) noexcept;

metadata::PathElement toElement(LineSteps const& step);

Address toAddress(LineAddress const& address);

/// True for the content of a path: names that are not empty, joined by "/", perhaps with one at the end.
bool isPathContent(std::string_view content) noexcept;

/// True when the steps of a list are those of a path, which is then how they have to be written.
bool isWrittenAsPath(Address const& address) noexcept;
bool isWrittenAsPath(LineAddress const& steps) noexcept;

/// An address written canonically.
class AddressText {
public:
    explicit AddressText(Address const& address);

    LineAddress view() const noexcept { return {form_, text_}; }

private:
    std::string text_;
    LineAddress::Form form_;
};

} // namespace project::stores
