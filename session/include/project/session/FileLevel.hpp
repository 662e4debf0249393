#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

#include "project/session/FileKind.hpp"
#include "project/stores/Node.hpp"

namespace project::session {

/// The content of one address of the file list.
struct FileLevel {
    /// An entry directly below the address.
    struct Entry {
        std::size_t nameBegin;  ///< in the names of its level
        std::size_t nameLength; ///< in code units
        stores::Node node;      ///< null if the entry is not in the project; nor is anything below it, then
        bool hasChildren;       ///< whether there is an address below it
    };

    FileKind kind = FileKind::File; ///< of the entry at the address
    std::u16string names;           ///< the names of all entries, one after the other
    std::vector<Entry> files;       ///< by name, in code units

    /// Returns the name of an entry.
    std::u16string_view nameOf(Entry const& file) const {
        return std::u16string_view(names).substr(file.nameBegin, file.nameLength);
    }
};

} // namespace project::session
