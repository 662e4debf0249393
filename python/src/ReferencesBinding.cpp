#include <string>
#include <tuple>
#include <utility>
#include <vector>

#include <pybind11/stl.h>

#include "Bindings.hpp"
#include "project/core/FolderReferenceManager.hpp"
#include "project/core/ProjectPathManager.hpp"
#include "project/core/ProjectReferenceManager.hpp"
#include "project/references/FolderReference.hpp"

namespace project::python {

namespace py = pybind11;

namespace {

using management::FolderReference;

/// UUID, the folder on this machine, the type, and the stored path.
using ReferenceValues = std::tuple<std::u16string, Path, std::u16string, std::u16string>;

management::FolderReferenceManager& listOf(Session& session, bool isPath) {
    return isPath ? session.project().getProjectPathManager().getFolderReferenceManager()
                  : session.project().getProjectReferenceManager().getFolderReferenceManager();
}

ReferenceValues valuesOf(FolderReference const& reference) {
    return {reference.getUUID(), reference.getLocation(), reference.getType(), reference.getStoredPath()};
}

FolderReference referenceOf(ReferenceValues const& values) {
    auto const& [uuid, location, type, storedPath] = values;
    return {location, type, storedPath, uuid};
}

std::vector<ReferenceValues> references(OpenProject const& project, bool isPath) {
    return project.run([&](Session& session) {
        std::vector<ReferenceValues> result;
        for (auto const& reference : listOf(session, isPath).getReferences()) {
            result.push_back(valuesOf(reference));
        }
        return result;
    });
}

std::vector<ReferenceValues> addReferences(OpenProject const& project, bool isPath,
                                           py::iterable const& targets, bool isAbsolute) {
    auto const folders = project.absolutes(targets);
    return project.run([&](Session& session) {
        std::vector<FolderReference> added;
        added.reserve(folders.size());
        for (auto const& folder : folders) {
            added.push_back(isAbsolute ? management::absoluteFolderReference(folder)
                                       : management::relativeFolderReference(folder, session.root()));
        }
        listOf(session, isPath).addReferences(added);
        std::vector<ReferenceValues> result;
        result.reserve(added.size());
        for (auto const& reference : added) {
            result.push_back(valuesOf(reference));
        }
        return result;
    });
}

} // namespace

void bindReferences(ProjectClass& project) {
    project.def("references", &references, py::arg("is_path"));
    project.def("add_references", &addReferences, py::arg("is_path"), py::arg("targets"),
                py::arg("absolute"));
    project.def(
        "remove_references",
        [](OpenProject const& open, bool isPath, std::vector<ReferenceValues> const& removed) {
            std::vector<FolderReference> references;
            references.reserve(removed.size());
            for (auto const& values : removed) {
                references.push_back(referenceOf(values));
            }
            open.run([&](Session& session) { listOf(session, isPath).removeReferences(references); });
        },
        py::arg("is_path"), py::arg("references"));
    project.def(
        "root_reference",
        [](OpenProject const& open, bool isPath, py::handle path) -> py::object {
            auto const file = open.absolute(path);
            auto const found =
                open.run([&](Session& session) { return listOf(session, isPath).getRootReferenceFor(file); });
            return found ? py::cast(valuesOf(*found)) : py::object(py::none());
        },
        py::arg("is_path"), py::arg("path"));
}

} // namespace project::python
