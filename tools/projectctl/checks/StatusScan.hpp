#pragma once

#include <vector>

#include "output/Progress.hpp"
#include "project/OpenProject.hpp"

namespace projectctl {

/// Compares the file list with the disk.
class StatusScan {
public:
    using File = project::session::FoundFile;

    explicit StatusScan(OpenProject& project) : project_(project) {}

    /// Makes the comparison. Call it once.
    void run(Progress& progress);

    /// The files and folders that are on disk but not in the project. A folder without any files in the
    /// project is listed without its contents.
    std::vector<File> const& added() const noexcept { return found_.added; }

    /// The files and folders that are in the project but not on disk.
    std::vector<File> const& gone() const noexcept { return found_.gone; }

    /// The folders that could not be read.
    std::vector<project::session::UnreadableFolder> const& unreadable() const noexcept {
        return found_.unreadable;
    }

private:
    OpenProject& project_;
    project::session::DiskDifferences found_;
};

} // namespace projectctl
