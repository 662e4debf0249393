#pragma once

#include <pybind11/pybind11.h>

#include "OpenProject.hpp"

namespace project::python {

/// The class of an open project. Each subject adds its methods; the modules of the Python package give them
/// the form that Python programs use.
using ProjectClass = pybind11::class_<OpenProject>;

void bindErrors(pybind11::module_& module);
void bindSession(pybind11::module_& module, ProjectClass& project);
void bindGuards(pybind11::module_& module, ProjectClass& project);
void bindFiles(pybind11::module_& module, ProjectClass& project);
void bindFolders(pybind11::module_& module);
void bindLabels(pybind11::module_& module, ProjectClass& project);
void bindEntryPoints(ProjectClass& project);
void bindReferences(ProjectClass& project);
void bindScopes(ProjectClass& project);
void bindEvents(pybind11::module_& module, ProjectClass& project);
void bindMoves(ProjectClass& project);
void bindRenames(ProjectClass& project);
void bindSync(ProjectClass& project);
void bindTexts(pybind11::module_& module);

} // namespace project::python
