#include "sync/PlanJson.hpp"

#include "output/JsonDocument.hpp"
#include "output/JsonRows.hpp"
#include "project/metadata/MetadataFunctions.hpp"
#include "sync/Losses.hpp"

namespace projectctl {

using project::session::FoundFile;
using project::session::SyncPlan;

namespace {

void addFile(JsonRows& rows, FoundFile const& file, OpenProject& project) {
    rows.begin();
    rows.addFile(project::metadata::getRelativePath(project.root(), file.path), file.kind);
}

} // namespace

void writeAsJson(SyncPlan const& plan, bool isApplied, OpenProject& project) {
    JsonDocument document(json::sync);
    document.addFlag("applied", isApplied);
    document.addKey("renamed");
    JsonRows moves;
    for (auto const& move : plan.renamed) {
        moves.begin();
        moves.addText("from", project::metadata::getRelativePath(project.root(), move.from));
        moves.addText("to", project::metadata::getRelativePath(project.root(), move.to));
    }
    moves.finish();
    document.addKey("added");
    JsonRows added;
    for (auto const& file : plan.added) {
        addFile(added, file, project);
    }
    added.finish();
    document.addKey("removed");
    Losses const losses(project, plan);
    JsonRows removed;
    for (auto const& each : plan.removed) {
        addFile(removed, each.file, project);
        removed.addList("labels", losses.labelsOf(each));
        removed.addList("entryPoints", each.entryPoints);
    }
    removed.finish();
    document.finish();
}

} // namespace projectctl
