#include <map>
#include <memory>
#include <optional>
#include <string>
#include <tuple>
#include <utility>
#include <vector>

#include <pybind11/stl.h>

#include "Bindings.hpp"
#include "project/core/EntryPointManager.hpp"
#include "project/entrypoints/EntryPoint.hpp"

namespace project::python {

namespace py = pybind11;

namespace {

using management::EntryPoint;
using management::EntryPointDefinition;
using management::EntryPointGroupDefinition;
using management::EntryPointManager;

/// UUID and name.
using GroupValues = std::pair<std::u16string, std::u16string>;

/// The file relative to the root, UUID, name, the type's name, whether it is visible, the group, the
/// extension data.
using EntryValues = std::tuple<py::str, std::u16string, std::u16string, std::u16string, bool,
                               std::optional<GroupValues>, std::map<std::u16string, std::u16string>>;

EntryPointManager& entriesOf(Session& session) {
    return session.project().getEntryPointManager();
}

EntryValues valuesOf(OpenProject const& project, EntryPoint const& entry) {
    std::optional<GroupValues> group;
    if (auto const stored = entry.getGroup()) {
        group.emplace(stored->getUUID(), stored->getName());
    }
    std::map<std::u16string, std::u16string> extensions;
    for (auto const& key : entry.getExtensionKeys()) {
        extensions.emplace(key, entry.getExtensionData(key).value_or(u""));
    }
    return {project.relative(entry.getFile()),
            entry.getUUID(),
            entry.getName(),
            toString(entry.getType()),
            entry.isVisible(),
            group,
            extensions};
}

std::vector<EntryValues> entryPoints(OpenProject const& project) {
    auto const entries = project.run([](Session& session) { return entriesOf(session).getEntryPoints(); });
    std::vector<EntryValues> result;
    result.reserve(entries.size());
    for (auto const& entry : entries) {
        result.push_back(valuesOf(project, *entry));
    }
    return result;
}

/// @return nothing if the file has no entry point.
std::optional<EntryValues> entryPoint(OpenProject const& project, py::handle path) {
    auto const file = project.absolute(path);
    auto const entry = project.run([&](Session& session) { return entriesOf(session).getEntryPoint(file); });
    return entry && !entry->getUUID().empty() ? std::optional(valuesOf(project, *entry)) : std::nullopt;
}

std::u16string setEntryPoint(OpenProject const& project, py::handle path, std::u16string const& uuid,
                             std::optional<std::u16string> const& name, std::u16string const& type,
                             bool isVisible, std::optional<GroupValues> const& group,
                             std::map<std::u16string, std::u16string> const& extensions) {
    EntryPointDefinition entry(project.absolute(path));
    entry.setUUID(uuid).setType(management::getFromName(type)).setVisible(isVisible);
    if (name) {
        entry.setName(*name);
    }
    if (group) {
        EntryPointGroupDefinition definition(group->second, group->first);
        entry.setGroup(definition);
    }
    for (auto const& [key, value] : extensions) {
        entry.setExtensionData(key, value);
    }
    return project.run([&](Session& session) {
        entriesOf(session).setEntryPoint(entry);
        auto const stored = entriesOf(session).getEntryPoint(entry.getFile());
        return stored ? stored->getUUID() : std::u16string();
    });
}

void removeEntryPoint(OpenProject const& project, py::handle path) {
    auto const file = project.absolute(path);
    project.run([&](Session& session) { entriesOf(session).removeEntryPoint(file); });
}

std::vector<GroupValues> groups(OpenProject const& project) {
    return project.run([](Session& session) {
        std::vector<GroupValues> result;
        for (auto const& group : entriesOf(session).getEntryPointGroups()) {
            result.emplace_back(group->getUUID(), group->getName());
        }
        return result;
    });
}

GroupValues createGroup(OpenProject const& project, std::u16string const& name, std::u16string const& uuid) {
    EntryPointGroupDefinition group(name, uuid);
    group.generateUUIDIfNotSet();
    project.run([&](Session& session) { entriesOf(session).createEntryPointGroup(group); });
    return {group.getUUID(), group.getName()};
}

} // namespace

void bindEntryPoints(ProjectClass& project) {
    project.def("entry_points", &entryPoints);
    project.def("entry_point", &entryPoint, py::arg("path"));
    project.def("set_entry_point", &setEntryPoint, py::arg("path"), py::arg("uuid"), py::arg("name"),
                py::arg("type"), py::arg("visible"), py::arg("group"), py::arg("extensions"));
    project.def("remove_entry_point", &removeEntryPoint, py::arg("path"));
    project.def("groups", &groups);
    project.def("create_group", &createGroup, py::arg("name"), py::arg("uuid"));
    project.def(
        "rename_group",
        [](OpenProject const& open, GroupValues const& group, std::u16string const& name) {
            open.run([&](Session& session) {
                entriesOf(session).renameEntryPointGroup(EntryPointGroupDefinition(group.second, group.first),
                                                         name);
            });
        },
        py::arg("group"), py::arg("name"));
    project.def(
        "delete_group",
        [](OpenProject const& open, GroupValues const& group) {
            open.run([&](Session& session) {
                entriesOf(session).deleteEntryPointGroup(
                    EntryPointGroupDefinition(group.second, group.first));
            });
        },
        py::arg("group"));
}

} // namespace project::python
