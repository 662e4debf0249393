#pragma once

#include <optional>
#include <string>

#include "fl/filesystem/Path.hpp"
#include "project/stores/MergeConflict.hpp"

namespace projectctl {

/// The states of a repository that git merges, each as the name of a commit or tree.
struct MergedStates {
    project::stores::ThreeWay<std::string> trees;
    /// Whether git merges the commits of ours and theirs, and not the change between two commits into a third
    /// one, as it does in a rebase, a cherry-pick, a revert and a stash.
    bool isOfBranches;
};

/// Finds out which states git is merging, from the versions of one file: git does not say so to a merge
/// driver. Looks at the branches that git names in the environment, then at the commits that an unfinished
/// rebase, cherry-pick, revert or stash names, and then for any commit that changed the file as theirs did.
/// @param folder in the repository. @param file its path from the top of the work tree. @param versions the
/// ids of its contents.
/// @return nothing if no states have these versions.
std::optional<MergedStates> findMergedStates(fl::filesystem::Path const& folder, std::string const& file,
                                             project::stores::ThreeWay<std::string> const& versions);

} // namespace projectctl
