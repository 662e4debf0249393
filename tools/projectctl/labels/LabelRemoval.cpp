#include "labels/LabelRemoval.hpp"

#include "changes/UndoHint.hpp"
#include "project/FileList.hpp"

namespace projectctl {

void noteRemoval(OpenProject& project, project::session::LabelChoice const& labels) {
    if (!wantsUndoHint(project)) {
        return;
    }
    project::session::Query query;
    query.labels.push_back(labels);
    FileList(project).visit(query, [&project](auto const&) { ++project.changedFiles().labelled; });
    noteUndoHint(project);
}

} // namespace projectctl
