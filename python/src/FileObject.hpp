#pragma once

#include <string_view>
#include <vector>

#include <pybind11/pybind11.h>

#include "OpenProject.hpp"

namespace project::python {

/// Adds the type FileBase: a file of a project as a Python object of three fields. A list of a whole project
/// has one for each file, and pybind11's objects take several times as long to create.
void bindFileObject(pybind11::module_& module);

/// Creates the objects of files.
class FileObjects {
public:
    /// @param type a subclass of FileBase without fields of its own.
    /// @param project the first field of each file.
    FileObjects(OpenProject const& open, pybind11::handle type, pybind11::handle project);

    pybind11::list of(std::vector<session::FoundFile> const& files) const;

private:
    pybind11::object create(session::FoundFile const& file) const;

    OpenProject const& open_;
    PyTypeObject* type_;
    pybind11::handle project_;
};

} // namespace project::python
