#pragma once

#include <set>
#include <vector>

#include "project/session.hpp"

namespace project::session {

/// Lets the references and the project paths of other projects follow moves: of those that a project
/// references, and of those that lie in a folder that has moved, whose relative references change with their
/// place.
///
/// A project that cannot be written stays as it is; `projectctl check` reports its references.
class OtherProjects {
public:
    /// @param root of the project that the moves belong to; borrowed. @param options for the other projects.
    OtherProjects(Path const& root, Options options) : root_(root), options_(options) {}

    /// @param moves that were made on disk. @param referenced the folders of referenced projects, absolute.
    /// @param isRepeated whether the references may have followed already, before a crash. A reference that
    ///        leads somewhere stays as it is then.
    void follow(std::vector<Move> const& moves, std::vector<Path> const& referenced,
                bool isRepeated) const noexcept;

private:
    void followIn(Path const& project, std::vector<Move> const& moves, bool isRepeated) const;

    Path const& root_;
    Options options_;
};

} // namespace project::session
