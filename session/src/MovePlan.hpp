#pragma once

#include <functional>
#include <vector>

#include "project/session/Move.hpp"

namespace project::session {

using fl::filesystem::Path;

/// Finds out which files and folders a move gives which paths, and refuses one that is not possible, before
/// anything changes.
class MovePlan {
public:
    using IsInProject = std::function<bool(Path const&)>;

    /// @param root of the project. @param storeFolder below it. All borrowed.
    MovePlan(Path const& root, Path const& storeFolder, IsInProject const& isInProject)
        : root_(root), storeFolder_(storeFolder), isInProject_(isInProject) {}

    /// The moves of files and folders to a new path, or into a folder. A file that is there already does not
    /// move.
    /// @throws MoveError or FileNotInProject.
    std::vector<Move> onDisk(std::vector<Path> const& sources, Path const& destination) const;

    /// Checks moves that another program has made on disk.
    /// @return those that change a path.
    /// @throws MoveError or FileNotInProject.
    std::vector<Move> made(std::vector<Move> const& moves) const;

private:
    void requireSource(Path const& source, Path const& destination) const;
    void requireInside(Move const& move) const;
    void requireFolder(Move const& move) const;

    Path const& root_;
    Path const& storeFolder_;
    IsInProject const& isInProject_;
};

} // namespace project::session
