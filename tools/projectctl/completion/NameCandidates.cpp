#include "completion/NameCandidates.hpp"

#include <algorithm>
#include <iterator>
#include <utility>
#include <vector>

#include "cli/Choice.hpp"
#include "cli/ShownPaths.hpp"
#include "entrypoints/EntryTypes.hpp"
#include "entrypoints/Groups.hpp"
#include "output/NameForms.hpp"
#include "project/LabelLayer.hpp"
#include "project/LabelNames.hpp"
#include "project/entrypoints/EntryPoint.hpp"
#include "project/entrypoints/EntryPointType.hpp"
#include "project/labels/LabelDataValidators.hpp"
#include "project/references/FolderReference.hpp"

namespace projectctl {

namespace {

/// A name that is not unique does not identify its thing, and one that begins with a dash would be an option.
bool isUsable(std::u16string const& name, std::vector<Named> const& things) {
    return !name.empty() && !name.starts_with(u'-') && std::ranges::count(things, name, &Named::name) == 1;
}

void addNamed(Candidates& candidates, std::vector<Named> const& things, char const* message) {
    auto const kind = Message(message).text();
    for (auto const& [name, uuid] : things) {
        if (isUsable(name, things)) {
            candidates.add(bytesOf(name), kind);
        } else {
            candidates.add(bytesOf(uuid), withoutControls(kind + ' ' + inQuotes(name), false));
        }
    }
}

std::vector<Named> sorted(std::vector<Named> things) {
    std::ranges::stable_sort(things, {}, &Named::name);
    return things;
}

} // namespace

void addCategories(Candidates& candidates, OpenProject& project) {
    auto categories = namesOf(project.manager().getLabelManager().getAllCategories());
    std::ranges::move(namesOf(project.personal().getLabelManager().getAllCategories()),
                      std::back_inserter(categories));
    addNamed(candidates, sorted(std::move(categories)), "CompletesCategory");
}

void addLabels(Candidates& candidates, OpenProject& project, std::string const& category) {
    auto const guard = project.store().acquireReadLock();
    LabelLayer const personal(project, true);
    auto& labels = LabelLayer(project, personal.hasCategory(category)).labels();
    addNamed(candidates, sorted(namesOf(labels.getLabels(LabelNames(labels).category(category)))),
             "CompletesLabel");
}

void addEntryPointGroups(Candidates& candidates, OpenProject& project) {
    addNamed(candidates, Groups(project.manager().getEntryPointManager()).names(), "CompletesGroup");
}

void addEntryPoints(Candidates& candidates, OpenProject& project) {
    ShownPaths shown(project.root());
    for (auto const& entry : project.manager().getEntryPointManager().getEntryPoints()) {
        candidates.add(bytesOf(shown.ofAbsolute(entry->getFile())),
                       withoutControls(bytesOf(toString(entry->getType())), false));
    }
}

void addReferences(Candidates& candidates, OpenProject& project, ReferenceList const& list) {
    ShownPaths shown(project.root());
    for (auto const& reference : list.manager(project).getReferences()) {
        candidates.add(bytesOf(shown.of(reference.getStoredPath())), Message("CompletesFolder").text());
    }
}

void addKinds(Candidates& candidates) {
    candidates.add("file", "");
    candidates.add("folder", "");
}

void addColorUses(Candidates& candidates) {
    for (auto const* const use : {"auto", "always", "never"}) {
        candidates.add(use, "");
    }
}

void addEntryPointTypes(Candidates& candidates) {
    for (auto const& name : entryTypeNames()) {
        candidates.add(bytesOf(name), Message("CompletesEntryType").text());
    }
}

void addDataTypes(Candidates& candidates) {
    project::management::LabelDataValidators().getValidator([&candidates](auto& validator) {
        candidates.add(bytesOf(validator.getDataType()), Message("CompletesDataType").text());
        return false; // all of them
    });
}

} // namespace projectctl
