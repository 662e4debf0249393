#pragma once

#include <vector>

#include "project/session/Renames.hpp"

namespace projectctl {

using project::session::AmbiguousRename;
using project::session::Rename;

/// The result of a search for renames.
struct Renames : project::session::RenamesFound {
    /// Files that were in the project and whose personal labels are hidden, with the files of the project
    /// that they have become.
    std::vector<Rename> personal;

    bool isEmpty() const noexcept { return RenamesFound::isEmpty() && personal.empty(); }
};

} // namespace projectctl
