#pragma once

#include <string>
#include <utility>

namespace project::metadata {

/// One step of an address in the metadata tree: what kind of thing it leads to, and which one of them.
class PathElement {
public:
    PathElement(std::u16string type, std::u16string location)
        : type_(std::move(type)), location_(std::move(location)) {}

    /// What kind of thing the step leads to, for instance "File" or "Category".
    std::u16string const& getType() const noexcept { return type_; }

    /// What tells that thing apart from its siblings: a file's name, a UUID, or a constant such as "Root".
    std::u16string const& getLocation() const noexcept { return location_; }

    friend bool operator==(PathElement const&, PathElement const&) = default;

    /// By type, then by location, each by code units.
    friend bool operator<(PathElement const& left, PathElement const& right) noexcept {
        int const types = left.type_.compare(right.type_);
        return types < 0 || (types == 0 && left.location_ < right.location_);
    }

private:
    std::u16string type_;
    std::u16string location_;
};

} // namespace project::metadata
