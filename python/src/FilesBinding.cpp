#include <map>
#include <optional>
#include <set>
#include <string>
#include <tuple>
#include <utility>
#include <vector>

#include <pybind11/stl.h>

#include "Bindings.hpp"
#include "FileObject.hpp"
#include "project/core/FileManager.hpp"
#include "project/git/GitAdapter.hpp"
#include "project/session/DiskFolder.hpp"
#include "project/session/ToolAccess.hpp"

namespace project::python {

namespace py = pybind11;

namespace {

using session::LabelChoice;
using session::Query;
using session::VisitedFile;

management::FileManager& filesOf(Session& session) {
    return session.project().getFileManager();
}

/// Adds files that are not in the project yet. The folders above them keep their labels.
std::size_t addNew(Session& session, std::vector<Path> const& paths) {
    auto transaction = session.transaction();
    std::vector<Path> added;
    for (auto const& path : paths) {
        if (!filesOf(session).isFileInProject(path)) {
            added.push_back(path);
        }
    }
    if (!added.empty()) {
        session::ToolAccess(session).addBelowLabelledFolders(added);
    }
    transaction.commit();
    return added.size();
}

std::size_t add(OpenProject const& project, py::iterable const& paths, bool anew) {
    auto const files = project.absolutes(paths);
    return project.run([&](Session& session) {
        if (!anew) {
            return addNew(session, files);
        }
        filesOf(session).add(files);
        return files.size();
    });
}

py::list remove(OpenProject const& project, py::iterable const& paths) {
    auto const files = project.absolutes(paths);
    return project.relatives(project.run([&](Session& session) { return filesOf(session).remove(files); }));
}

bool contains(OpenProject const& project, py::handle path) {
    auto const file = project.absolute(path);
    return project.run([&](Session& session) { return filesOf(session).isFileInProject(file); });
}

/// One alternative of a search: the labels that a file has, and those that it does not have. A label is the
/// UUID of its category and its own; without that, it is any label of the category.
using LabelNames = std::vector<std::pair<std::u16string, std::u16string>>;
using Alternative = std::pair<LabelNames, LabelNames>;

std::vector<LabelChoice> choicesOf(LabelNames const& labels) {
    std::vector<LabelChoice> result;
    for (auto const& [category, label] : labels) {
        result.push_back({category, label});
    }
    return result;
}

/// The files of any of the queries, in one state of the project.
FileList findAny(Session& session, std::vector<Query> const& queries) {
    auto const guard = session.store().acquireReadLock();
    session::ToolAccess access(session);
    FileList result;
    if (queries.size() == 1) {
        access.visit(queries.front(), [&](VisitedFile const& file) { result.add(file.path, file.kind); });
        return result;
    }
    std::map<Path, session::FileKind> found;
    for (auto const& query : queries) {
        access.visit(query, [&](VisitedFile const& file) { found.emplace(file.path, file.kind); });
    }
    for (auto const& [path, kind] : found) {
        result.add(path.native(), kind);
    }
    return result;
}

std::size_t count(OpenProject const& project) {
    return project.run([](Session& session) {
        auto const guard = session.store().acquireReadLock();
        std::size_t result = 0;
        session::ToolAccess(session).visit({}, [&](VisitedFile const& /*file*/) { ++result; });
        return result;
    });
}

py::list find(OpenProject const& project, py::handle type, py::handle owner,
              std::vector<Alternative> const& alternatives, py::iterable const& below,
              std::optional<Path> const& glob, std::optional<int> kind, bool isEntryPoint, bool isUnlabelled,
              int layers) {
    Query query;
    query.paths = project.absolutes(below);
    if (glob) {
        query.glob = glob->native();
    }
    if (kind) {
        query.kind = static_cast<session::FileKind>(*kind);
    }
    query.isEntryPoint = isEntryPoint;
    query.isUnlabelled = isUnlabelled;
    query.layers = static_cast<session::Layers>(layers);
    std::vector<Query> queries;
    for (auto const& [labels, absent] : alternatives) {
        queries.push_back(query);
        queries.back().labels = choicesOf(labels);
        queries.back().absentLabels = choicesOf(absent);
    }
    auto const files = project.run([&](Session& session) { return findAny(session, queries); });
    return FileObjects(project, type, owner).of(files);
}

py::list children(OpenProject const& project, py::handle path) {
    auto const folder = project.absolute(path);
    return project.relatives(
        project.run([&](Session& session) { return filesOf(session).getChildProjectFiles(folder); }));
}

py::list readFolder(Path const& folder) {
    std::vector<session::DiskEntry> entries;
    {
        WithoutGil const withoutGil;
        entries = session::readDiskFolder(folder);
    }
    py::list result;
    for (auto const& entry : entries) {
        result.append(py::make_tuple(fromPath(entry.name), entry.kind == session::FileKind::Folder));
    }
    return result;
}

py::set gitIgnored(Path const& folder, std::vector<Path> const& names) {
    std::set<Path> ignored;
    {
        WithoutGil const withoutGil;
        auto const base = fl::filesystem::canonical(folder, Path());
        std::vector<Path> paths;
        paths.reserve(names.size());
        for (auto const& name : names) {
            paths.push_back(base / name);
        }
        ignored = git::GitAdapter(base).ignored(paths);
    }
    py::set result;
    for (auto const& path : ignored) {
        result.add(fromPath(std::u16string_view(path.native()).substr(path.native().rfind(u'/') + 1)));
    }
    return result;
}

} // namespace

void bindFiles(py::module_& /*module*/, ProjectClass& project) {
    project.def("add_files", &add, py::arg("paths"), py::arg("anew"));
    project.def("remove_files", &remove, py::arg("paths"));
    project.def("has_file", &contains, py::arg("path"));
    project.def("count_files", &count);
    project.def("find", &find, py::arg("type"), py::arg("owner"), py::arg("alternatives"), py::arg("below"),
                py::arg("glob"), py::arg("kind"), py::arg("is_entry_point"), py::arg("is_unlabelled"),
                py::arg("layers"));
    project.def("children", &children, py::arg("path"));
    project.def(
        "relative",
        [](OpenProject const& open, py::handle path) { return open.relative(open.absolute(path)); },
        py::arg("path"));
    project.def(
        "absolute", [](OpenProject const& open, py::handle path) { return open.absolute(path); },
        py::arg("path"));
}

void bindFolders(py::module_& module) {
    module.def(
        "read_folder", &readFolder, py::arg("folder"),
        "The entries of a folder on disk that a project can contain: names, and whether they are folders.");
    module.def("git_ignored", &gitIgnored, py::arg("folder"), py::arg("names"));
}

} // namespace project::python
