#pragma once

#include <string>

#include "completion/Candidates.hpp"
#include "project/OpenProject.hpp"
#include "references/ReferenceLists.hpp"

namespace projectctl {

// Things that a project defines. One whose name does not identify it is offered by its UUID.

void addCategories(Candidates& candidates, OpenProject& project);

/// @param category the name or UUID of the category whose labels are offered.
void addLabels(Candidates& candidates, OpenProject& project, std::string const& category);

void addEntryPointGroups(Candidates& candidates, OpenProject& project);

/// Offers the files that are entry points.
void addEntryPoints(Candidates& candidates, OpenProject& project);

void addReferences(Candidates& candidates, OpenProject& project, ReferenceList const& list);

// Things that every project knows.

void addKinds(Candidates& candidates);

void addColorUses(Candidates& candidates);

void addEntryPointTypes(Candidates& candidates);

/// Offers the types of the data of labels.
void addDataTypes(Candidates& candidates);

} // namespace projectctl
