#pragma once

#include "fl/filesystem/Path.hpp"

namespace projectctl {

using fl::filesystem::Path;

// The store's .gitattributes name a merge driver for the project's text. What that driver is, each clone of a
// repository has to be told.

enum class MergeSetup {
    NoRepository, ///< the folder lies in none, or there is no git to ask
    Missing,      ///< git merges the text line by line
    Done,
};

MergeSetup lookForMergeSetup(Path const& folder);

/// Tells the repository that a folder lies in to merge projects' texts by this tool.
/// @throws Failure when git refuses.
void setUpMerge(Path const& folder);

} // namespace projectctl
