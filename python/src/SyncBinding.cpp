#include <set>
#include <string>
#include <utility>
#include <vector>

#include <pybind11/stl.h>

#include "Bindings.hpp"
#include "FileObject.hpp"
#include "project/session/Sync.hpp"

namespace project::python {

namespace py = pybind11;

namespace {

/// Patterns for paths, which convert as paths do.
using Patterns = std::set<Path>;

std::set<std::u16string> textsOf(Patterns const& patterns) {
    std::set<std::u16string> result;
    for (auto const& pattern : patterns) {
        result.insert(pattern.native());
    }
    return result;
}

Patterns patternsOf(std::set<std::u16string> const& texts) {
    return {texts.begin(), texts.end()};
}

/// A plan as (renamed, added, removed, missing, absent, unreadable). A removed file has its labels, as pairs
/// of UUIDs, and the names of its entry points.
py::tuple toPython(OpenProject const& project, session::SyncPlan const& plan, py::handle type,
                   py::handle owner) {
    FileObjects const files(project, type, owner);
    py::list removed;
    for (auto const& each : plan.removed) {
        py::list labels;
        for (auto const& label : each.labels) {
            labels.append(py::make_tuple(label.categoryUUID, label.labelUUID));
        }
        removed.append(py::make_tuple(files.of({each.file})[0], labels, each.entryPoints));
    }
    py::list unreadable;
    for (auto const& each : plan.unreadable) {
        unreadable.append(py::make_tuple(project.relative(each.folder), each.problem.value()));
    }
    return py::make_tuple(project.relatives(plan.renamed), files.of(plan.added), removed,
                          project.relatives(plan.missing), project.relatives(plan.absent), unreadable);
}

py::list rules(OpenProject const& project) {
    auto const rules = project.run([](Session& session) { return session.syncRules(); });
    py::list result;
    for (auto const& rule : rules) {
        result.append(py::make_tuple(project.relative(rule.folder), patternsOf(rule.included),
                                     patternsOf(rule.excluded), rule.usesGitIgnore));
    }
    return result;
}

void setRule(OpenProject const& project, py::handle folder, Patterns const& included,
             Patterns const& excluded, bool usesGitIgnore) {
    session::SyncRule const rule{project.absolute(folder), textsOf(included), textsOf(excluded),
                                 usesGitIgnore};
    project.run([&](Session& session) { session.setSyncRule(rule); });
}

bool removeRule(OpenProject const& project, py::handle folder) {
    auto const path = project.absolute(folder);
    return project.run([&](Session& session) { return session.removeSyncRule(path); });
}

py::tuple plan(OpenProject const& project, py::handle type, py::handle owner) {
    return toPython(project, project.run([](Session& session) { return session.planSync(); }), type, owner);
}

py::tuple sync(OpenProject const& project, py::handle type, py::handle owner, bool removesMissingFolders,
               bool followsRenames, int similarity) {
    session::SyncOptions const options{.removesMissingFolders = removesMissingFolders,
                                       .followsRenames = followsRenames,
                                       .similarity = similarity};
    auto const done = project.run([&](Session& session) { return session.sync(options); });
    return toPython(project, done, type, owner);
}

} // namespace

void bindSync(ProjectClass& project) {
    project.def("sync_rules", &rules);
    project.def("set_sync_rule", &setRule, py::arg("folder"), py::arg("included"), py::arg("excluded"),
                py::arg("uses_git_ignore"));
    project.def("remove_sync_rule", &removeRule, py::arg("folder"));
    project.def("plan_sync", &plan, py::arg("type"), py::arg("owner"));
    project.def("sync", &sync, py::arg("type"), py::arg("owner"), py::arg("removes_missing_folders"),
                py::arg("follows_renames"), py::arg("similarity"));
}

} // namespace project::python
