#pragma once

#include "fl/filesystem/Path.hpp"

namespace projectctl {

using fl::filesystem::Path;

/// What a folder holds of a project.
enum class ProjectTrace {
    None,        ///< no project's store; an empty folder of that name is what a broken off start leaves
    TextMissing, ///< a store whose text is gone
    Text,        ///< a store with its text, whatever state that is in
};

ProjectTrace lookForProject(Path const& folder);

/// The root of the project that a folder lies in: the nearest folder upwards that holds a project's text.
/// @param folder canonical.
/// @throws Failure when there is none, or when a store on the way has lost its text: that must not be taken
///         for a project further up.
Path findProjectRoot(Path const& folder);

} // namespace projectctl
