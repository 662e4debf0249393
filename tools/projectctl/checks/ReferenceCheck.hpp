#pragma once

#include <vector>

#include "checks/Finding.hpp"
#include "project/OpenProject.hpp"
#include "references/ReferenceLists.hpp"

namespace projectctl {

/// What is stored of folder references and leads nowhere on this machine, or is in a form that the list does
/// not read.
class ReferenceCheck {
public:
    explicit ReferenceCheck(OpenProject& project) : project_(project) {}

    /// The caller holds a guard of the store.
    Findings run();

private:
    using References = std::vector<project::management::FolderReference>; ///< that the list reads

    void checkForms(ReferenceList const& list, References const& references);
    void checkTargets(ReferenceList const& list, References const& references);

    OpenProject& project_;
    Findings findings_;
};

} // namespace projectctl
