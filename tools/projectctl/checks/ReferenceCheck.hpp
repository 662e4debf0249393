#pragma once

#include <vector>

#include "checks/Finding.hpp"
#include "cli/ShownPaths.hpp"
#include "project/OpenProject.hpp"
#include "references/ReferenceLists.hpp"

namespace projectctl {

/// What is stored of folder references and leads nowhere on this machine, or is in a form that the list does
/// not read.
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
