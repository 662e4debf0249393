#pragma once

#include "fl/filesystem/Path.hpp"

namespace projectctl {

using fl::filesystem::Path;

/// The parts of a project that a folder contains.
enum class ProjectTrace {
    None,        ///< no store; an interrupted `init` can leave an empty folder with the store's name
    TextMissing, ///< a store without its text
    Text,        ///< a store with its text, in any state, or with the location of a server
};

ProjectTrace findProjectIn(Path const& folder);

/// True if the project with this root is stored by a server.
/// @throws StoreError if the file that says so is unreadable.
bool isShared(Path const& root);

/// The same, after another process has finished with the store: until then, a store without its text may
/// belong to a project that is being created.
/// @throws StoreError if the process takes too long.
ProjectTrace findFinishedProjectIn(Path const& folder);

/// The root of the project that contains a folder: the nearest folder upwards with a project's text.
/// @param folder canonical.
/// @throws Failure when there is none; StoreError when a store on the way has no text: its files must not be
///         mistaken for files of a project further up.
Path findProjectRoot(Path const& folder);

} // namespace projectctl
