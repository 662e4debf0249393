#pragma once

#include <string>
#include <string_view>

#include "project/stores/SharedLocation.hpp"

namespace project::stores {

/// The file that leads to a shared project, and the file for source control beside it.
struct LocationFile {
    static constexpr char const* name = "store.json";
    static constexpr char const* temporary = "store.json.tmp";

    static constexpr char const* ignored = ".gitignore";
    static constexpr std::string_view ignoredOfLocation = "/cache/\n/store.json.tmp\n/*.old*\n";

    /// With the folder of a person's own text.
    static constexpr std::string_view ignoredContent = "/cache/\n/store.json.tmp\n/*.old*\n/local/\n";

    static std::string contentOf(SharedLocation const& location);
};

} // namespace project::stores
