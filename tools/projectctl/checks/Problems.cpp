#include "checks/Problems.hpp"

#include "checks/EntryPointCheck.hpp"
#include "checks/LabelCheck.hpp"
#include "checks/NameCheck.hpp"
#include "checks/ReferenceCheck.hpp"
#include "project/FileList.hpp"

namespace projectctl {

Findings findProblems(OpenProject& project, ShownPaths shown) {
    Findings result;
    FileList const list(project);
    LabelCheck const labels(project.store());
    list.visit(project.root(), [&](FileList::File const& file) {
        CheckedFile const subject{file.path,
                                  [&] { return list.addressOf(project.root() / Path(file.path)); }};
        checkName(subject, shown, result);
        labels.check(subject, file.node, shown, result);
    });
    append(result, EntryPointCheck(project, shown).run());
    append(result, ReferenceCheck(project, shown).run());
    return result;
}

} // namespace projectctl
