#pragma once

#include <optional>
#include <string>

#include "Target.hpp"
#include "TextContents.hpp"
#include "TextInput.hpp"
#include "project/stores/StoreError.hpp"
#include "project/stores/TextMerge.hpp"

namespace project::fuzz {

/// The common version; without an input there is none, as when both sides created the project.
inline std::string baseOf(std::string_view input) {
    return input.empty() ? std::string() : textOf(input);
}

/// @return nothing if one of the texts cannot be merged.
inline std::optional<stores::TextMerge> merged(std::string const& base, std::string const& ours,
                                               std::string const& theirs) {
    try {
        return stores::mergeTexts(base, ours, theirs);
    } catch (stores::StoreError const&) {
        return std::nullopt;
    }
}

inline void requireSound(std::string const& text) {
    auto const read = readText(text);
    require(read.has_value(), "a merged text can be read");
    requireTidy(*read);
    require(canonicalOf(*read) == text, "a merged text is canonical");
}

} // namespace project::fuzz
