#pragma once

#include "fl/filesystem/Path.hpp"

namespace projectctl {

using fl::filesystem::Path;

// The store's .gitattributes assigns a merge driver to the project's text. The command behind that driver is
// in git's configuration, which is not part of the repository: each clone needs it once.

/// How git merges the text of the project in a folder.
enum class MergeSetup {
    NoRepository,   ///< the folder is not in a repository, or git is not installed
    NotAssigned,    ///< git's attributes do not assign the driver to the text: git merges it line by line
    Missing,        ///< the driver is not configured: git merges the text line by line
    OtherCommand,   ///< the driver is configured, but not as setUpMerge does
    ProgramMissing, ///< the driver calls a program that is not there any more, or that cannot be run
    Works,
};

MergeSetup mergeSetupOf(Path const& folder);

/// Configures the repository of a folder to merge projects' texts with this program, by its absolute path.
///
/// Where the program cannot be run or fails, the configured command has git merge the text line by line, so
/// that the text contains both sides or markers around them in every case.
/// @throws Failure when git refuses.
void setUpMerge(Path const& folder);

} // namespace projectctl
