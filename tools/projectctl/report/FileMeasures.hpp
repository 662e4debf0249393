#pragma once

#include <cstdint>
#include <vector>

#include "output/Progress.hpp"
#include "report/Definition.hpp"

namespace projectctl {

/// The size of a file on disk and the number of its lines.
struct FileMeasure {
    std::uint64_t size = 0;
    std::uint64_t lines = 0; ///< 0 for a file that is not text: one with a zero byte near its beginning
};

/// Measures the files of a project on disk. Folders, files that are not on disk, and everything that is not a
/// regular file have no size. No symbolic link is followed, so that nothing outside the project is read.
/// @return one for each entry, in their order.
std::vector<FileMeasure> measureFiles(Path const& root, std::vector<Definition::Entry> const& entries,
                                      Progress& progress);

} // namespace projectctl
