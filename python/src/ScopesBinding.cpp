#include <map>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include <pybind11/stl.h>

#include "Bindings.hpp"
#include "project/core/FileManager.hpp"
#include "project/files/FileMetadataManager.hpp"
#include "project/metadata/MetadataNodeSpecification.hpp"

namespace project::python {

namespace py = pybind11;

namespace {

using metadata::MetadataNode;
using metadata::MetadataNodeSpecification;

/// A node as (type, values, nested nodes).
py::tuple toPython(MetadataNode const& node) {
    py::dict values;
    for (auto const& key : node.getKeys()) {
        values[fromUtf16(key)] = fromUtf16(node.get(key));
    }
    py::list children;
    for (auto const& child : node.getChildren()) {
        children.append(toPython(*child));
    }
    return py::make_tuple(fromUtf16(node.getType()), values, children);
}

void fill(MetadataNode& node, py::tuple const& content) {
    for (auto const& [key, value] : content[1].cast<std::map<std::u16string, std::u16string>>()) {
        node.put(key, value);
    }
    for (auto const child : content[2]) {
        auto const nested = py::reinterpret_borrow<py::tuple>(child);
        fill(*node.addChild(nested[0].cast<std::u16string>()), nested);
    }
}

std::shared_ptr<MetadataNode> fromPython(py::tuple const& content) {
    auto node = std::make_shared<MetadataNodeSpecification>(content[0].cast<std::u16string>());
    fill(*node, content);
    return node;
}

/// Calls an operation with the manager of a scope.
template <typename Operation>
auto inScope(OpenProject const& project, std::u16string const& scope, Operation const& operation) {
    return project.run([&](Session& session) {
        return operation(*session.project().getFileManager().getFileMetadataManagerFor(scope));
    });
}

using Manager = management::FileMetadataManager;

py::list filesOf(OpenProject const& project, std::u16string const& scope) {
    auto const nodes = inScope(project, scope, [](Manager& manager) { return manager.getAllFileNodes(); });
    py::list result;
    for (auto const& [path, node] : nodes) {
        result.append(py::make_tuple(project.relative(path), toPython(*node)));
    }
    return result;
}

py::object nodeOf(OpenProject const& project, std::u16string const& scope, py::handle path) {
    auto const file = project.absolute(path);
    auto const node = inScope(project, scope, [&](Manager& manager) {
        return manager.hasFileNode(file) ? manager.getFileNode(file) : nullptr;
    });
    return node ? toPython(*node) : py::object(py::none());
}

void setNodes(OpenProject const& project, std::u16string const& scope, py::list const& nodes) {
    std::map<Path, std::shared_ptr<MetadataNode>> files;
    for (auto const item : nodes) {
        auto const pair = py::reinterpret_borrow<py::tuple>(item);
        files.insert_or_assign(project.absolute(pair[0]), fromPython(pair[1]));
    }
    inScope(project, scope, [&](Manager& manager) { manager.setFileNodes(files); });
}

void removeNodes(OpenProject const& project, std::u16string const& scope, py::iterable const& paths) {
    auto const files = project.absolutes(paths);
    inScope(project, scope, [&](Manager& manager) { manager.removeFileNodes(files); });
}

} // namespace

void bindScopes(ProjectClass& project) {
    project.def("scope_nodes", &filesOf, py::arg("scope"));
    project.def("scope_node", &nodeOf, py::arg("scope"), py::arg("path"));
    project.def("set_scope_nodes", &setNodes, py::arg("scope"), py::arg("nodes"));
    project.def("remove_scope_nodes", &removeNodes, py::arg("scope"), py::arg("paths"));
}

} // namespace project::python
