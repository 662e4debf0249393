#pragma once

#include <string>
#include <vector>

#include "project/session/FileKind.hpp"

namespace project::session {

/// The similarity from which two files are a pair, unless the caller chooses another one, in percent.
constexpr int usualSimilarity = 50;

/// How Session::findRenames searches.
struct RenameOptions {
    /// From which two contents are similar, in percent, from 1 to 100.
    int similarity = usualSimilarity;

    /// Whether git decides in a repository. Otherwise the names alone do, as they do outside a repository.
    bool usesGit = true;
};

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
    std::u16string to;   ///< relative to the project's root
    FileKind kind;       ///< a file or a folder
    Evidence evidence;   ///< the reason for the pair
    int similarity;      ///< in percent; 0 if the contents are unknown

    friend bool operator==(Rename const&, Rename const&) = default;
};

/// Files of which each of the earlier paths may have become each of the later ones.
struct AmbiguousRename {
    std::vector<std::u16string> from; ///< relative to the project's root, sorted
    std::vector<std::u16string> to;   ///< sorted

    friend bool operator==(AmbiguousRename const&, AmbiguousRename const&) = default;
};

/// The result of a search for renames.
struct RenamesFound {
    std::vector<Rename> pairs;              ///< sorted by the earlier path; a folder precedes its contents
    std::vector<AmbiguousRename> ambiguous; ///< not among the pairs

    /// Returns true if nothing was found.
    bool isEmpty() const noexcept { return pairs.empty() && ambiguous.empty(); }
};

} // namespace project::session
