#pragma once

#include <cstddef>
#include <string>
#include <vector>

#include "output/Kind.hpp"

namespace projectctl {

/// A file or folder of the project that has another path on disk now.
struct Rename {
    /// The reason for pairing the two paths.
    enum class Evidence {
        Content,    ///< the same content
        Similarity, ///< a similar content
        Folder,     ///< everything in the folder has moved into the other one
        Name,       ///< the same name only: a guess
    };

    std::u16string from; ///< relative to the project's root
    std::u16string to;
    Kind kind;
    Evidence evidence;
    int similarity; ///< in percent; 0 if the contents are unknown

    friend bool operator==(Rename const&, Rename const&) = default;
};

/// Files of which each of the earlier paths may have become each of the later ones.
struct AmbiguousRename {
    std::vector<std::u16string> from; ///< sorted
    std::vector<std::u16string> to;   ///< sorted

    friend bool operator==(AmbiguousRename const&, AmbiguousRename const&) = default;
};

/// The result of a search for renames.
struct Renames {
    std::vector<Rename> pairs; ///< sorted by the earlier path; a folder precedes its contents
    std::vector<AmbiguousRename> ambiguous;

    /// Files that were in the project and whose personal labels are hidden, with the files of the project
    /// that they have become.
    std::vector<Rename> personal = {};

    bool isEmpty() const noexcept { return pairs.empty() && ambiguous.empty() && personal.empty(); }
};

} // namespace projectctl
