#include "completion/ArgumentCandidates.hpp"

#include <algorithm>
#include <cstddef>

#include "cli/CommonOptions.hpp"
#include "cli/Completes.hpp"
#include "cli/DeclaredTool.hpp"
#include "cli/VerbDescription.hpp"
#include "cli/VerbTree.hpp"
#include "cli/WorkingFolder.hpp"
#include "completion/NameCandidates.hpp"
#include "completion/PathCandidates.hpp"
#include "completion/TypedPlace.hpp"
#include "output/Failure.hpp"

namespace projectctl {

namespace {

/// The first sentence of a description.
std::string shortened(std::string const& description) {
    return description.substr(
        0, std::min({description.find(". "), description.find("; "), description.find(": ")}));
}

void addMembers(Candidates& candidates, CLI::App& group) {
    for (auto const* member : membersOf(group)) {
        if (!isHidden(*member)) {
            candidates.add(member->get_name(), shortened(summaryOf(*member)));
        }
    }
}

/// Adds the options of a command, and those that every command accepts.
void addOptions(Candidates& candidates, CLI::App& command, CLI::App& tool) {
    auto const add = [&candidates](CLI::Option const& option, CLI::App const& verb) {
        candidates.add(option.get_name(), shortened(descriptionOf(option, verb)));
    };
    for (auto const* option : command.get_options([](auto* each) { return !each->get_positional(); })) {
        add(*option, command);
    }
    if (&command != &tool) {
        for (auto const* option :
             tool.get_options([](auto* each) { return isCommonOption(each->get_name()); })) {
            add(*option, tool);
        }
    }
}

/// The category whose labels are offered.
std::string typedCategory(TypedPlace const& place) {
    if (completedBy(*place.option) == Completes::LabelChoices) {
        return place.values.at(place.option).back();
    }
    for (auto* const argument : place.command->get_options([](auto*) { return true; })) {
        auto const found = place.values.find(argument);
        if (completedBy(*argument) == Completes::Categories && found != place.values.end() &&
            !found->second.empty()) {
            return found->second.back();
        }
    }
    throw Failure(Message("CompletionNeedsCategory"));
}

/// In the form CATEGORY=LABEL, the label is what is being typed.
Completes thingsAt(TypedPlace& place) {
    auto const things = completedBy(*place.option);
    std::size_t const equals = place.word.find('=');
    if (things != Completes::LabelChoices || equals == std::string::npos) {
        return things;
    }
    place.values[place.option].push_back(place.word.substr(0, equals));
    place.before += place.word.substr(0, equals + 1);
    place.word.erase(0, equals + 1);
    return Completes::Labels;
}

void addOfProject(Candidates& candidates, Completes things, TypedPlace const& place) {
    auto project = OpenProject::ofWorkingFolder();
    switch (things) {
    case Completes::Categories:
    case Completes::LabelChoices:
        return addCategories(candidates, project);
    case Completes::Labels:
        return addLabels(candidates, project, typedCategory(place));
    case Completes::ProjectPaths:
        return addProjectPaths(candidates, project);
    case Completes::NewPaths:
        return addNewPaths(candidates, project);
    case Completes::EntryPoints:
        return addEntryPoints(candidates, project);
    case Completes::EntryPointGroups:
        return addEntryPointGroups(candidates, project);
    case Completes::PathFolders:
        return addReferences(candidates, project, projectPath());
    case Completes::References:
        return addReferences(candidates, project, projectReferences());
    default:
        return;
    }
}

void addValues(Candidates& candidates, Completes things, TypedPlace const& place) {
    switch (things) {
    case Completes::Nothing:
        return;
    case Completes::Files:
        return addDiskPaths(candidates, DiskPaths::All);
    case Completes::Folders:
        return addDiskPaths(candidates, DiskPaths::Folders);
    case Completes::Kinds:
        return addKinds(candidates);
    case Completes::ColorUses:
        return addColorUses(candidates);
    case Completes::EntryPointTypes:
        return addEntryPointTypes(candidates);
    case Completes::DataTypes:
        return addDataTypes(candidates);
    default:
        return addOfProject(candidates, things, place);
    }
}

void enterFolders(TypedPlace const& place, CLI::App& tool) {
    auto const folders = place.values.find(tool.get_option("-C"));
    if (folders != place.values.end()) {
        std::ranges::for_each(folders->second, enterFolder);
    }
}

} // namespace

std::vector<Candidate> candidatesFor(std::vector<std::string> const& arguments, CommandList const& commands) {
    DeclaredTool declared(commands);
    auto& tool = declared.parser();
    auto place = placeOfLast(arguments, tool);
    enterFolders(place, tool);
    auto const things = place.option != nullptr ? thingsAt(place) : Completes::Nothing;
    Candidates candidates(place.word);
    if (place.option != nullptr) {
        addValues(candidates, things, place);
    } else if (!place.optionsEnded && place.word.starts_with('-')) {
        addOptions(candidates, *place.command, tool);
    } else {
        addMembers(candidates, *place.command);
    }
    auto result = candidates.all();
    std::ranges::for_each(result, [&place](Candidate& each) { each.value.insert(0, place.before); });
    return result;
}

} // namespace projectctl
