#include "labels/LabelRemoval.hpp"

#include "changes/UndoHint.hpp"
#include "project/FileList.hpp"
#include "project/ProjectTransaction.hpp"

namespace projectctl {

void changeLabels(OpenProject& project, LabelLayer const& layer, std::function<void()> const& change) {
    if (layer.isPersonal()) {
        LabelLayer::Guard const guard(layer);
        change();
    } else {
        ProjectTransaction transaction(project);
        change();
        transaction.commit();
    }
}

void noteRemoval(OpenProject& project, LabelLayer const& layer, project::session::LabelChoice const& labels) {
    if (layer.isPersonal() || !wantsUndoHint(project)) {
        return;
    }
    project::session::Query query;
    query.labels.push_back(labels);
    query.layers = project::session::Layers::Project;
    FileList(project).visit(query, [&project](auto const&) { ++project.changedFiles().labelled; });
    noteUndoHint(project);
}

} // namespace projectctl
