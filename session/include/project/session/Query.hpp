#pragma once

#include <optional>
#include <string>
#include <vector>

#include "fl/filesystem/Path.hpp"
#include "project/session/FileKind.hpp"

namespace project::session {

/// A label, or any label of a category.
struct LabelChoice {
    std::u16string categoryUUID; ///< of the category
    std::u16string labelUUID;    ///< empty for any label of the category
};

/// The labels that conditions concern: those of the project, personal ones, or both.
enum class Layers { Both, Project, Personal };

/// A question about the file list: which files and folders meet all of these conditions? A query without
/// conditions asks for all of them. Every member has a value, so that a query can name only its conditions:
/// `session.find({.glob = u"**/*.cpp", .isUnlabelled = true})`.
struct Query {
    /// These files and folders, and everything below them; absolute. Empty for the whole project. A path that
    /// is not in the project has nothing below it.
    std::vector<fl::filesystem::Path> paths = {};

    /// The file has each of these labels. Labels and categories that were deleted count too.
    std::vector<LabelChoice> labels = {};

    /// The file has none of these labels.
    std::vector<LabelChoice> absentLabels = {};

    /// The entry is a file, or is a folder.
    std::optional<FileKind> kind = {};

    /// A pattern for the whole path, relative to the root. Elements of the path are separated by `/`:
    ///
    ///     ?        any character           [a-z]  one of these characters     \x  the character x
    ///     *        any characters          [!a-z] any other character
    ///     **       as a whole element: any number of elements, also none
    ///
    /// Nothing but `**` crosses a `/`: `*.cpp` finds files in the root only, `**/*.cpp` finds them
    /// everywhere, and `src/**` finds everything below `src` but not `src` itself. Upper and lower case
    /// differ, a name that begins with a dot is a name like any other, and a `[` without its `]` means
    /// itself.
    std::optional<std::u16string> glob = {};

    /// The file has an entry point.
    bool isEntryPoint = false;

    /// The file has no label of any category.
    bool isUnlabelled = false;

    /// The labels that the conditions above concern.
    Layers layers = Layers::Both;
};

/// A file or folder that a query has found.
struct FoundFile {
    fl::filesystem::Path path; ///< absolute
    FileKind kind;             ///< a file or a folder

    friend bool operator==(FoundFile const&, FoundFile const&) = default;
};

} // namespace project::session
