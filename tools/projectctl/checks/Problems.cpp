#include "checks/Problems.hpp"

#include "checks/EntryPointCheck.hpp"
#include "checks/LabelCheck.hpp"
#include "checks/NameCheck.hpp"
#include "checks/ReferenceCheck.hpp"
#include "project/FileList.hpp"

namespace projectctl {

Findings findProblems(OpenProject& project) {
    Findings result;
    FileList const list(project);
    LabelCheck const labels(project.store());
    list.visit(project.root(), [&](FileList::File const& file) {
        checkName(file.path, result);
        labels.check(file.path, file.node, result);
    });
    append(result, EntryPointCheck(project).run());
    append(result, ReferenceCheck(project).run());
    return result;
}

} // namespace projectctl
