#pragma once

#include <compare>
#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

#include "project/stores/Node.hpp"

namespace project::stores {

/// The maximum number of steps of an address. It bounds every operation that walks down an address.
inline constexpr std::size_t deepestAddress = 4096;

/// An address in the canonical form of a line; a view of that line.
///
/// A file's address, ("Files","Root") and then names, has the form Names: the names joined by "/", a path.
/// The marker below a folder is the folder's path with a "/" at the end. Every other address has the form
/// Steps: types and locations in turn, each in quotes, separated by commas. Addresses are compared in this
/// form, without decoding them.
struct LineAddress {
    enum class Form : unsigned char { Names, Steps };

    Form form;
    /// Names: the path without its quotes. Steps: the list without its opening bracket; anything may follow
    /// its closing bracket.
    std::string_view text;
};

/// Walks down the steps of an address in a line.
class LineSteps {
public:
    explicit LineSteps(LineAddress const& address) noexcept;

    /// Advances by one step. @return false, with type and location unchanged, after the last step.
    bool next() noexcept;

    /// The content of the step's type.
    std::string_view type() const noexcept { return type_; }

    /// The content of the step's location.
    std::string_view location() const noexcept { return location_; }

    /// These steps in another line, whose address begins with the same text.
    LineSteps continuedIn(LineAddress const& address) const noexcept {
        LineSteps result = *this;
        result.address_ = address;
        return result;
    }

    /// The address that ends with this step. It may not be canonical, but isWithin accepts it.
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

/// The order of addresses, step by step from the root. An address comes before the addresses below it.
std::strong_ordering compare(LineAddress const& left, LineAddress const& right) noexcept;

/// True if the address is the other one or lies below it.
bool isWithin(LineAddress const& address, LineAddress const& other) noexcept;

metadata::PathElement toElement(LineSteps const& step);

Address toAddress(LineAddress const& address);

/// True for the content of a path: non-empty names joined by "/", possibly with a "/" at the end.
bool isPathContent(std::string_view content) noexcept;

/// True if an address must be written as a path.
bool isWrittenAsPath(Address const& address) noexcept;
bool isWrittenAsPath(LineAddress const& steps) noexcept;

/// An address in canonical form, with its text.
class AddressText {
public:
    explicit AddressText(Address const& address) { assign(address); }

    /// Replaces the address. Uses the memory of the earlier one again.
    void assign(Address const& address);

    LineAddress view() const noexcept { return {form_, text_}; }

private:
    std::string text_;
    std::vector<metadata::PathElement const*> steps_; ///< of the address, while it is assigned
    LineAddress::Form form_ = LineAddress::Form::Steps;
};

} // namespace project::stores
