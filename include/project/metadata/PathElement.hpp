#pragma once

#include <string>
#include <string_view>
#include <utility>

namespace project::metadata {

/// A step of an address in the metadata tree: a type and a location.
class PathElement {
public:
    /// A step with this type and this location.
    PathElement(std::u16string type, std::u16string location)
        : type_(std::move(type)), location_(std::move(location)) {}

    /// Returns the type, which is the same for all things of one kind, for example "File" or "Category".
    std::u16string const& getType() const noexcept { return type_; }

    /// Returns the location, which distinguishes the step from its siblings: a file's name, a UUID, or a
    /// constant such as "Root".
    std::u16string const& getLocation() const noexcept { return location_; }

    /// Replaces both. Reuses the memory of the earlier ones.
    void assign(std::u16string_view type, std::u16string_view location) {
        if (type_ != type) {
            type_ = type;
        }
        location_ = location;
    }

    friend bool operator==(PathElement const&, PathElement const&) = default;

    /// Orders by type, then by location, each by code units.
    friend bool operator<(PathElement const& left, PathElement const& right) noexcept {
        int const types = left.type_.compare(right.type_);
        return types < 0 || (types == 0 && left.location_ < right.location_);
    }

private:
    std::u16string type_;
    std::u16string location_;
};

} // namespace project::metadata
