#pragma once

#include <vector>

#include "checks/Finding.hpp"
#include "cli/ShownPaths.hpp"
#include "project/OpenProject.hpp"
#include "references/ReferenceLists.hpp"

namespace projectctl {

/// Finds references to folders that do not exist on this machine, and references of a type that their list
/// does not support.
class ReferenceCheck {
public:
    /// @param shown for the paths in findings, borrowed.
    ReferenceCheck(OpenProject& project, ShownPaths& shown) : project_(project), shown_(shown) {}

    /// The caller holds a guard of the store.
    Findings run();

private:
    using References = std::vector<project::management::FolderReference>; ///< that the list reads

    void checkForms(ReferenceList const& list, References const& references);
    void checkTargets(ReferenceList const& list, References const& references);

    OpenProject& project_;
    ShownPaths& shown_;
    Findings findings_;
};

} // namespace projectctl
