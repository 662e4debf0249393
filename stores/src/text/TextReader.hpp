#pragma once

#include <cstddef>
#include <map>
#include <optional>
#include <string>
#include <vector>

#include "project/stores/Fault.hpp"
#include "text/TextContent.hpp"

namespace project::stores {

/// Everything that is known of a text once it was read.
struct TextReading {
    TextContent content;
    std::string tail;                          ///< the bytes behind the body, as they are
    std::vector<Fault> faults;                 ///< by line
    std::map<std::size_t, std::string> damage; ///< damaged lines with their ends, by number
    std::string anchor;    ///< the sum that the next batch has to name; empty if never asked for
    bool canonical = true; ///< the body is written as a writer would write it
    bool torn = false;     ///< the tail ends in a batch that does not count
};

/// Reads a text: checks its frame, notes where its lines begin while they are canonical and in order, lays
/// everything else over them, and then the tail.
/// @param file how to name the file in errors.
/// @return nothing when the text is incomplete.
/// @throws StoreError when it is not a project's text at all or of a later format.
std::optional<TextReading> readText(std::string bytes, std::string const& file);

} // namespace project::stores
