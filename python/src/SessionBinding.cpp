#include <chrono>
#include <filesystem>
#include <optional>
#include <string>

#include <pybind11/stl.h>

#include "Bindings.hpp"
#include "project/stores/SharedLocation.hpp"
#include "project/stores/TextBackend.hpp"

namespace project::python {

namespace py = pybind11;

namespace {

using session::Options;

std::chrono::milliseconds milliseconds(double seconds) {
    return std::chrono::milliseconds(static_cast<std::int64_t>(seconds * 1000));
}

Options optionsOf(int sourceControl, bool honoursEnvironment, double freshness, bool readsLastState) {
    return {static_cast<session::SourceControl>(sourceControl), honoursEnvironment, milliseconds(freshness),
            readsLastState};
}

template <typename Open>
std::unique_ptr<OpenProject> opened(Open const& open) {
    std::optional<Session> session;
    {
        WithoutGil const withoutGil;
        session.emplace(open());
    }
    return std::make_unique<OpenProject>(*std::move(session));
}

std::unique_ptr<OpenProject> open(Path const& root, std::optional<std::u16string> const& createAs,
                                  int sourceControl, bool honoursEnvironment, double freshness,
                                  bool readsLastState) {
    auto const options = optionsOf(sourceControl, honoursEnvironment, freshness, readsLastState);
    return opened([&] {
        return createAs ? Session::openOrCreate(root, *createAs, options) : Session::open(root, options);
    });
}

std::unique_ptr<OpenProject> createShared(Path const& root, std::u16string const& name,
                                          std::string const& service, std::string const& reader,
                                          std::string const& writer, std::string const& kind,
                                          int sourceControl, bool honoursEnvironment, double freshness,
                                          bool readsLastState) {
    auto const options = optionsOf(sourceControl, honoursEnvironment, freshness, readsLastState);
    return opened([&] {
        return Session::createShared(root, name, {service, reader, writer, kind}, options);
    });
}

bool exists(Path const& path) {
    std::error_code error;
    auto const status = std::filesystem::symlink_status(fl::filesystem::toSystem(path), error);
    return status.type() != std::filesystem::file_type::not_found;
}

bool isProject(Path const& root) {
    WithoutGil const withoutGil;
    auto const folder = root / stores::TextBackend::folderName;
    return exists(stores::TextBackend::textPath(root)) || exists(folder / stores::SharedLocation::fileName);
}

/// Waits in short pieces, so that a signal such as that of Ctrl-C is handled meanwhile.
bool watch(OpenProject const& project, double seconds) {
    using Clock = std::chrono::steady_clock;
    constexpr std::chrono::milliseconds piece(200);
    auto const end = Clock::now() + milliseconds(seconds);
    for (;;) {
        auto const rest = std::chrono::duration_cast<std::chrono::milliseconds>(end - Clock::now());
        auto const time = std::clamp(rest, std::chrono::milliseconds(0), piece);
        if (project.run([time](Session& session) { return session.watch(time); })) {
            return true;
        }
        if (PyErr_CheckSignals() != 0) {
            throw py::error_already_set();
        }
        if (rest <= piece) {
            return false;
        }
    }
}

} // namespace

void bindSession(py::module_& module, ProjectClass& project) {
    module.def("open", &open, py::arg("root"), py::arg("create_as"), py::arg("source_control"),
               py::arg("honours_environment"), py::arg("freshness"), py::arg("reads_last_state"),
               "Opens a project, or creates it if a name is given and there is none.");
    module.def("create_shared", &createShared, py::arg("root"), py::arg("name"), py::arg("service"),
               py::arg("reader"), py::arg("writer"), py::arg("kind"), py::arg("source_control"),
               py::arg("honours_environment"), py::arg("freshness"), py::arg("reads_last_state"),
               "Creates a project on a server.");
    module.def("is_project", &isProject, py::arg("root"), "Whether a folder contains a project.");
    project.def("close", &OpenProject::close, "Closes the project when the last running call has returned.");
    project.def_property_readonly("is_closed", &OpenProject::isClosed);
    project.def_property_readonly("root", [](OpenProject const& open) { return open.root(); });
    project.def("name", [](OpenProject const& open) {
        return open.run([](Session& session) { return session.project().getName(); });
    });
    project.def(
        "set_name",
        [](OpenProject const& open, std::u16string const& name) {
            open.run([&](Session& session) { session.project().setName(name); });
        },
        py::arg("name"));
    project.def("description", [](OpenProject const& open) {
        return open.run([](Session& session) { return session.project().getDescription(); });
    });
    project.def(
        "set_description",
        [](OpenProject const& open, std::u16string const& text) {
            open.run([&](Session& session) { session.project().setDescription(text); });
        },
        py::arg("text"));
    project.def("refresh", [](OpenProject const& open) {
        return open.run([](Session& session) { return session.refresh(); });
    });
    project.def("watch", &watch, py::arg("seconds"));
    project.def("wake", [](OpenProject const& open) { open.run([](Session& session) { session.wake(); }); });
    project.def("stage",
                [](OpenProject const& open) { open.run([](Session& session) { session.stage(); }); });
    project.def("is_shared", [](OpenProject const& open) {
        return open.run([](Session& session) { return session.isShared(); });
    });
    project.def("take_history_loss", [](OpenProject const& open) -> py::object {
        auto const loss = open.run([](Session& session) { return session.takeHistoryLoss(); });
        return loss ? py::make_tuple(static_cast<int>(loss->kind), loss->seen, loss->found)
                    : py::object(py::none());
    });
}

} // namespace project::python
