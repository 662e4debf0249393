#include "OpenProject.hpp"

#include <string_view>
#include <utility>

#include "project/metadata/MetadataFunctions.hpp"

namespace project::python {

namespace py = pybind11;

namespace {

/// A path with "." and ".." resolved as text, and with single separators. @param path absolute.
std::u16string normalized(std::u16string_view path) {
    std::u16string result;
    while (!path.empty()) {
        auto const name = path.substr(0, path.find(u'/'));
        path.remove_prefix(std::min(path.size(), name.size() + 1));
        if (name == u"..") {
            result.erase(std::min(result.size(), result.rfind(u'/')));
        } else if (!name.empty() && name != u".") {
            result.append(u"/").append(name);
        }
    }
    return result.empty() ? u"/" : result;
}

bool isWithin(std::u16string_view path, std::u16string_view root) {
    return path.starts_with(root) && (path.size() == root.size() || path[root.size()] == u'/');
}

} // namespace

OpenProject::OpenProject(Session session)
    : session_(std::make_shared<Session>(std::move(session))), root_(session_->root()) {
}

void OpenProject::close() {
    WithoutGil const withoutGil;
    std::shared_ptr<Session> closed; // destroyed outside the mutex
    std::lock_guard const lock(mutex_);
    closed.swap(session_);
}

bool OpenProject::isClosed() const {
    std::lock_guard const lock(mutex_);
    return session_ == nullptr;
}

std::shared_ptr<Session> OpenProject::session() const {
    std::lock_guard const lock(mutex_);
    if (!session_) {
        throw ClosedError();
    }
    return session_;
}

Path OpenProject::absolute(py::handle path) const {
    auto const given = toPath(path);
    auto const& text = given.native();
    if (text.starts_with(u'/')) {
        return inFormOfRoot(normalized(text));
    }
    return normalized(root_.native() + u"/" + text);
}

std::vector<Path> OpenProject::absolutes(py::iterable const& paths) const {
    std::vector<Path> result;
    result.reserve(py::len_hint(paths));
    for (auto const path : paths) {
        result.push_back(absolute(path));
    }
    return result;
}

py::str OpenProject::relative(Path const& path) const {
    std::u16string_view const text = path.native();
    if (!isWithin(text, root_.native())) {
        return fromPath(text);
    }
    return text.size() == root_.native().size() ? py::str(".")
                                                : fromPath(text.substr(root_.native().size() + 1));
}

py::list OpenProject::relatives(std::vector<Path> const& paths) const {
    py::list result(paths.size());
    for (std::size_t i = 0; i < paths.size(); ++i) {
        PyList_SET_ITEM(result.ptr(), static_cast<py::ssize_t>(i), relative(paths[i]).release().ptr());
    }
    return result;
}

py::list OpenProject::relatives(std::vector<session::Move> const& moves) const {
    py::list result(moves.size());
    for (std::size_t i = 0; i < moves.size(); ++i) {
        result[i] = py::make_tuple(relative(moves[i].from), relative(moves[i].to));
    }
    return result;
}

/// A path that leads to the root through a symbolic link, in the form of the root. Links within the project
/// are files of it and stay.
Path OpenProject::inFormOfRoot(std::u16string path) const {
    if (isWithin(path, root_.native())) {
        return path;
    }
    WithoutGil const withoutGil; // what follows asks the disk
    try {
        auto const folder = fl::filesystem::canonical(metadata::getParentFolder(Path(path)), Path());
        auto const name = path.substr(path.rfind(u'/') + 1);
        auto found = folder / Path(name);
        if (isWithin(found.native(), root_.native())) {
            return found;
        }
        auto whole = fl::filesystem::canonical(Path(path), Path());
        return whole == root_ ? whole : Path(std::move(path));
    } catch (std::filesystem::filesystem_error const&) {
        return Path(std::move(path));
    }
}

} // namespace project::python
