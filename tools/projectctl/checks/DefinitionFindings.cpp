#include "checks/DefinitionFindings.hpp"

#include <string_view>

#include "checks/FindingForms.hpp"
#include "checks/MergeSetupCheck.hpp"
#include "checks/SyncCheck.hpp"
#include "checks/TreeCheck.hpp"
#include "output/NameForms.hpp"
#include "project/stores/PersonalText.hpp"
#include "texts/Message.hpp"

namespace projectctl {

using project::stores::Fault;

namespace {

std::string_view codeOf(Fault::Kind kind) {
    switch (kind) {
    case Fault::Kind::Damage:
        return code::textDamaged;
    case Fault::Kind::Conflict:
        return code::textConflict;
    case Fault::Kind::Irregular:
        return code::textIrregular;
    case Fault::Kind::TornTail:
        return code::textTornTail;
    case Fault::Kind::Displaced:
        break;
    }
    return code::textDisplaced;
}

/// The faults of the personal text. Their lines are not those of the project's text.
Findings personalFindings(OpenProject& project) {
    auto const file = shown(project::stores::PersonalText::path(project.root()));
    Findings result;
    for (auto const& fault : project.access().personalText().check()) {
        Message const message = fault.line > 0 ? Message("PersonalFaultAt", file, fault.line, fault.problem)
                                               : Message("PersonalFault", file, fault.problem);
        result.push_back(Finding::fault(codeOf(fault.kind), message));
    }
    return result;
}

} // namespace

std::vector<Fault> faultsOfDefinition(OpenProject& project) {
    return project.log() == nullptr ? project.faults() : project.log()->check();
}

Findings findingsOf(std::vector<Fault> const& faults, OpenProject& project, ShownPaths const& shown) {
    Findings result;
    for (auto const& fault : faults) {
        result.push_back({Finding::Weight::Fault, codeOf(fault.kind), fault.problem});
        result.back().line = fault.line;
    }
    append(result, TreeCheck(project, shown).run());
    append(result, findOutOfDate(project, shown));
    placeInText(result, project);
    if (!project.isInTransaction()) { // otherwise it has been read already
        append(result, personalFindings(project));
    }
    if (project.log() == nullptr) { // git merges no log
        checkMergeSetup(project.root(), result);
    }
    sortByWeight(result);
    return result;
}

} // namespace projectctl
