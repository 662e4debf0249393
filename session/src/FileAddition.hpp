#pragma once

#include <vector>

#include "project/core/FileManager.hpp"

namespace project::session {

using fl::filesystem::Path;

/// Adds files and folders, and keeps the labels of the folders above them. The file manager would drop those.
/// Call it in a transaction.
/// @param added those of them that are in the project already are added again, without their labels.
void addBelowLabelledFolders(std::vector<Path> const& added, management::FileManager& files);

} // namespace project::session
