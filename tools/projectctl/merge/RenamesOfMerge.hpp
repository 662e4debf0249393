#pragma once

#include <string>
#include <utility>
#include <vector>

#include "fl/filesystem/Path.hpp"
#include "project/stores/MergeConflict.hpp"
#include "project/stores/TextMerge.hpp"

namespace projectctl {

/// The renames in a merge by git.
struct RenamesOfMerge {
    project::stores::SideRenames ours;
    project::stores::SideRenames theirs;

    /// Files whose new place git only suggests, with it: git reports a conflict for each of them. They are
    /// among the relocated ones.
    std::vector<std::pair<std::u16string, std::u16string>> suggested;
};

/// Asks git which files each side of the current merge has renamed, and where git puts the files that one
/// side added to a folder that the other one renamed. Git's settings for renames in merges apply.
/// @param folder in the repository. @param text the path of the project's text from the top of the work tree.
/// @param versions the ids of the contents of the text.
/// @return no renames if git does not know, or is not installed.
RenamesOfMerge renamesOfMerge(fl::filesystem::Path const& folder, std::string const& text,
                              project::stores::ThreeWay<std::string> const& versions);

} // namespace projectctl
