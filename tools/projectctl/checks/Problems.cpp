#include "checks/Problems.hpp"

#include "FileList.hpp"
#include "checks/LabelCheck.hpp"

namespace projectctl {

Findings findProblems(OpenProject& project) {
    Findings result;
    FileList const list(project);
    LabelCheck const labels(project.store());
    list.visit(project.root(),
               [&](FileList::File const& file) { labels.check(file.path, file.node, result); });
    return result;
}

} // namespace projectctl
