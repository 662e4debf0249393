#include <map>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include <pybind11/stl.h>

#include "Bindings.hpp"
#include "project/stores/DefinitionChange.hpp"
#include "project/stores/TextMerge.hpp"

namespace project::python {

namespace py = pybind11;

namespace {

using stores::DefinitionChange;
using stores::MergeConflict;
using stores::MergeSide;
using stores::TextMerge;

using Renames = std::map<std::u16string, std::u16string>;

template <typename Call>
auto withoutGil(Call const& call) {
    WithoutGil const released;
    return call();
}

std::unique_ptr<TextMerge> merge(std::string const& base, std::string const& ours, std::string const& theirs,
                                 Renames const& ourRenames, Renames const& theirRenames) {
    return withoutGil([&] {
        return std::make_unique<TextMerge>(
            stores::mergeTexts(base, ours, theirs, {ourRenames, {}}, {theirRenames, {}}));
    });
}

/// (kind, address, nested steps, key, side that removed something, values). The address is a list of steps,
/// each of which is a pair; a nested step is (type, key, value).
py::tuple toPython(MergeConflict const& conflict) {
    py::list address;
    for (auto const& step : conflict.address.getPath()) {
        address.append(py::make_tuple(step.getType(), step.getLocation()));
    }
    py::list nested;
    for (auto const& step : conflict.nested) {
        nested.append(py::make_tuple(step.type, step.key, step.value));
    }
    auto const removedBy =
        conflict.removedBy ? std::optional(static_cast<int>(*conflict.removedBy)) : std::nullopt;
    auto const& [base, ours, theirs] = conflict.values;
    return py::make_tuple(static_cast<int>(conflict.kind), address, nested, conflict.key, removedBy,
                          py::make_tuple(base, ours, theirs));
}

py::list conflicts(TextMerge const& merge) {
    py::list result;
    for (auto const& conflict : merge.conflicts()) {
        result.append(toPython(conflict));
    }
    return result;
}

py::bytes text(TextMerge const& merge, std::vector<int> const& choices) {
    std::vector<MergeSide> sides;
    sides.reserve(choices.size());
    for (auto const choice : choices) {
        sides.push_back(static_cast<MergeSide>(choice));
    }
    return withoutGil([&] { return merge.text(sides); });
}

/// (subject, kind, name, earlier, category, label, is folder, is with folder, values), where a value is (key,
/// before, after).
py::tuple toPython(DefinitionChange const& change) {
    py::list values;
    for (auto const& value : change.values) {
        values.append(py::make_tuple(value.key, value.before, value.after));
    }
    return py::make_tuple(static_cast<int>(change.subject), static_cast<int>(change.kind), change.name,
                          change.earlier, change.category, change.label, change.isFolder, change.isWithFolder,
                          values);
}

py::list differences(std::string const& before, std::string const& after, Renames const& renames) {
    auto const changes = withoutGil([&] { return stores::changesBetween(before, after, renames); });
    py::list result;
    for (auto const& change : changes) {
        result.append(toPython(change));
    }
    return result;
}

} // namespace

void bindTexts(py::module_& module) {
    py::class_<TextMerge>(module, "TextMerge", "Two versions of a project's text, merged.")
        .def("conflicts", &conflicts)
        .def("text", &text, py::arg("choices"))
        .def("text_with_markers", [](TextMerge const& merge) {
            return py::bytes(withoutGil([&] { return merge.textWithMarkers(); }));
        });
    module.def("merge_texts", &merge, py::arg("base"), py::arg("ours"), py::arg("theirs"),
               py::arg("our_renames"), py::arg("their_renames"));
    module.def("differences", &differences, py::arg("before"), py::arg("after"), py::arg("renames"));
}

} // namespace project::python
