#pragma once

#include "OpenProject.hpp"
#include "checks/Finding.hpp"
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
    void checkForms(ReferenceList const& list);
    void checkTargets(ReferenceList const& list);

    OpenProject& project_;
    Findings findings_;
};

} // namespace projectctl
