#pragma once

#include <memory>
#include <mutex>
#include <stdexcept>
#include <vector>

#include <pybind11/pybind11.h>

#include "Gil.hpp"
#include "Text.hpp"
#include "project/session.hpp"

namespace project::python {

using fl::filesystem::Path;
using session::Session;

/// The project is closed.
class ClosedError : public std::logic_error {
public:
    ClosedError() : std::logic_error("the project is closed") {}
};

/// The session of a project that Python has open. Each call that uses the session shares it, so that a
/// project that is closed meanwhile, by another thread or by a slot, lives until the last call has returned.
class OpenProject {
public:
    explicit OpenProject(Session session);

    ~OpenProject() { close(); }

    OpenProject(OpenProject const&) = delete;
    OpenProject& operator=(OpenProject const&) = delete;

    /// Does nothing if it is closed already.
    void close();

    bool isClosed() const;

    /// @throws ClosedError
    std::shared_ptr<Session> session() const;

    Path const& root() const noexcept { return root_; }

    /// Calls an operation with the session, without the interpreter. The operation must not use Python.
    template <typename Operation>
    auto run(Operation const& operation) const {
        WithoutGil const withoutGil;
        auto const used = session(); // destroyed before the interpreter is taken again: closing uses the disk
        return operation(*used);
    }

    /// The absolute path for one that a caller gave: relative to the root, with "." and ".." resolved as
    /// text.
    Path absolute(pybind11::handle path) const;

    std::vector<Path> absolutes(pybind11::iterable const& paths) const;

    /// The path of a file of the project relative to the root, as Python's text; "." for the root.
    pybind11::str relative(Path const& path) const;

    pybind11::list relatives(std::vector<Path> const& paths) const;

    /// Pairs of an old and a new path, relative to the root.
    pybind11::list relatives(std::vector<session::Move> const& moves) const;

private:
    Path inFormOfRoot(std::u16string path) const;

    std::shared_ptr<Session> session_;
    mutable std::mutex mutex_; ///< of the pointer
    Path root_;
};

} // namespace project::python
