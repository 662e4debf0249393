#pragma once

#include <cstddef>
#include <map>
#include <optional>
#include <string>
#include <vector>

#include "project/stores/Fault.hpp"
#include "text/TextContent.hpp"

namespace project::stores {

/// The result of reading a text.
struct TextReading {
    TextContent content;
    std::string tail;                          ///< the bytes after the body
    std::vector<Fault> faults;                 ///< by line
    std::map<std::size_t, std::string> damage; ///< damaged lines with their ends, by number
    std::string nextAfter;   ///< the `after` of the next batch; empty if it was not computed
    bool isCanonical = true; ///< of the body
};

/// Reads a text. Checks its first and last line, stores the positions of the lines that are canonical and in
/// order, and puts all other lines and the tail into the overlay.
/// @param file the name of the file in errors.
/// @return nothing if the text is incomplete.
/// @throws StoreError if the file is not a project's text, or if it has a later format.
std::optional<TextReading> readText(std::string bytes, std::string const& file);

} // namespace project::stores
