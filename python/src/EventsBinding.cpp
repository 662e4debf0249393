#include <functional>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include <pybind11/stl.h>

#include "Bindings.hpp"
#include "project/decorators/DispatchableProjectEventBroadcaster.hpp"
#include "project/labels/CategoryIdentifier.hpp"
#include "project/labels/Label.hpp"

namespace project::python {

namespace py = pybind11;

namespace {

using Broadcaster = management::DispatchableProjectEventBroadcaster;
using Connection = management::ProjectEventBroadcaster::Connection;

/// A function of Python that any thread may copy and destroy.
using SharedFunction = std::shared_ptr<PyObject>;

SharedFunction shared(py::handle function) {
    return {function.inc_ref().ptr(), [](PyObject* object) {
                WithGil const withGil;
                Py_DECREF(object);
            }};
}

/// Calls a function of Python. An exception propagates to the caller of the operation that raised the event.
template <typename... Arguments>
void call(SharedFunction const& function, Arguments&&... arguments) {
    py::handle(function.get())(std::forward<Arguments>(arguments)...);
}

auto withoutArguments(SharedFunction function) {
    return [function = std::move(function)] {
        WithGil const withGil;
        call(function);
    };
}

auto withFiles(SharedFunction function, Path root) {
    return [function = std::move(function), root = std::move(root)](std::vector<Path> const& files) {
        WithGil const withGil;
        py::list paths;
        for (auto const& file : files) {
            paths.append(fromPath(file.native()));
        }
        call(function, paths);
    };
}

py::tuple valuesOf(management::CategoryIdentifier const& category) {
    return py::make_tuple(category.getUUID(), category.getName(), category.isReadOnly(),
                          category.isSingleValued(), category.getDataType());
}

auto withCategory(SharedFunction function) {
    return [function = std::move(function)](management::CategoryIdentifier const& category) {
        WithGil const withGil;
        call(function, valuesOf(category));
    };
}

auto withLabel(SharedFunction function) {
    return [function = std::move(function)](management::Label const& label) {
        WithGil const withGil;
        auto const& identifier = label.getLabelIdentifier();
        call(function, valuesOf(label.getCategory()),
             py::make_tuple(identifier.getUUID(), identifier.getName(),
                            static_cast<int>(identifier.isReadOnly())));
    };
}

/// Connects a function to an event. It gets the absolute paths of the files, or the category, or the category
/// and the label, as the event has them.
Connection connect(OpenProject const& project, bool isPersonal, std::string const& event,
                   py::handle function) {
    auto const session = project.session();
    Broadcaster& events = isPersonal ? *session->personal().events() : *session->events();
    auto const slot = shared(function);
    if (event == "files_changed") {
        return events.onFileListUpdate(withFiles(slot, project.root()));
    }
    if (event == "file_labels_changed") {
        return events.onFileLabelsChanged(withFiles(slot, project.root()));
    }
    if (event == "label_modified") {
        return events.onLabelModified(withLabel(slot));
    }
    if (event == "category_added") {
        return events.onCategoryAdded(withCategory(slot));
    }
    if (event == "category_deleted") {
        return events.onCategoryDeleted(withCategory(slot));
    }
    if (event == "category_renamed") {
        return events.onCategoryRenamed(withCategory(slot));
    }
    if (event == "entry_points_changed") {
        return events.onEntryPointsChanged(withoutArguments(slot));
    }
    if (event == "name_changed") {
        return events.onNameChanged(withoutArguments(slot));
    }
    if (event == "path_changed") {
        return events.onPathChanged(withoutArguments(slot));
    }
    if (event == "references_changed") {
        return events.onReferencesChanged(withoutArguments(slot));
    }
    if (event == "metadata_changed") {
        return events.onMetadataChange(withoutArguments(slot));
    }
    throw py::value_error("unknown event: " + event);
}

} // namespace

void bindEvents(py::module_& module, ProjectClass& project) {
    py::class_<Connection>(module, "Connection", "The connection of a function to an event.")
        .def("disconnect",
             [](Connection const& connection) {
                 WithoutGil const withoutGil;
                 connection.disconnect();
             })
        .def_property_readonly("is_connected",
                               [](Connection const& connection) { return connection.connected(); });
    project.def("connect", &connect, py::arg("personal"), py::arg("event"), py::arg("function"));
    project.def("raise_metadata_changed", [](OpenProject const& open) {
        open.run([](Session& session) { session.events()->dispatchMetadataChange(); });
    });
}

} // namespace project::python
