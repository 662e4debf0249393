#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

#include <pybind11/pybind11.h>

#include "OpenProject.hpp"

namespace project::python {

/// Adds the type FileBase: a file of a project as a Python object of three fields. A list of a whole project
/// has one for each file, and pybind11's objects take several times as long to create.
void bindFileObject(pybind11::module_& module);

/// Files that were found, by their paths relative to the root. All paths share one piece of memory: a list of
/// a whole project has too many of them for one piece each.
class FileList {
public:
    void add(std::u16string_view path, session::FileKind kind) {
        paths_ += path;
        entries_.push_back({paths_.size(), kind});
    }

    std::size_t size() const noexcept { return entries_.size(); }

    /// Calls a visitor with the path and the kind of each file, in the order in which they were added.
    template <typename Visitor>
    void visit(Visitor const& visitor) const {
        std::size_t begin = 0;
        for (auto const& [end, kind] : entries_) {
            visitor(std::u16string_view(paths_).substr(begin, end - begin), kind);
            begin = end;
        }
    }

private:
    struct Entry {
        std::size_t end; ///< of the path, in all paths
        session::FileKind kind;
    };

    std::u16string paths_;
    std::vector<Entry> entries_;
};

/// Creates the objects of files.
class FileObjects {
public:
    /// @param type a subclass of FileBase without fields of its own.
    /// @param project the first field of each file.
    FileObjects(OpenProject const& open, pybind11::handle type, pybind11::handle project);

    pybind11::list of(std::vector<session::FoundFile> const& files) const;

    pybind11::list of(FileList const& files) const;

private:
    pybind11::object create(pybind11::str path, session::FileKind kind) const;

    OpenProject const& open_;
    PyTypeObject* type_;
    pybind11::handle project_;
};

} // namespace project::python
