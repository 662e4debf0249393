#include "Bindings.hpp"
#include "FileObject.hpp"

PYBIND11_MODULE(_core, module) {
    using namespace project::python;
    module.doc() = "The library's operations, as project_management uses them. Not for programs.";
    bindErrors(module);
    bindFileObject(module);
    ProjectClass project(module, "OpenProject", "A project that is open, until it is closed.");
    bindSession(module, project);
    bindGuards(module, project);
    bindFiles(module, project);
    bindFolders(module);
    bindLabels(module, project);
    bindEntryPoints(project);
    bindReferences(project);
    bindScopes(project);
    bindEvents(module, project);
    bindMoves(project);
    bindRenames(project);
    bindSync(project);
    bindTexts(module);
}
