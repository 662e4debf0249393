#pragma once

#include "completion/Candidates.hpp"
#include "project/OpenProject.hpp"

namespace projectctl {

// Paths are offered one level at a time: those in the folder that was typed. A folder ends with a slash.

/// Offers files and folders of the project.
void addProjectPaths(Candidates& candidates, OpenProject& project);

/// Offers files on disk that are not in the project, and folders that may contain some.
void addNewPaths(Candidates& candidates, OpenProject& project);

enum class DiskPaths { All, Folders };

/// Offers files and folders on disk. Names that begin with a dot are offered when the dot was typed.
void addDiskPaths(Candidates& candidates, DiskPaths which);

} // namespace projectctl
