#pragma once

#include <string>

#include "checks/Finding.hpp"
#include "output/JsonObject.hpp"
#include "project/OpenProject.hpp"

namespace projectctl {

/// Fills in the line of each finding that has an address, if a text stores the project.
void placeInText(Findings& findings, OpenProject& project);

/// Puts faults before notes.
void sortByWeight(Findings& findings);

/// The number of faults.
std::size_t countFaults(Findings const& findings);

/// The forms in which findings are written to standard output.
enum class FindingForm {
    Text,   ///< for people
    Gcc,    ///< as a compiler writes them, for editors
    GitHub, ///< commands of a workflow, which annotate a change
};

/// Writes one line for each finding, in the form Gcc or GitHub.
/// @param file the path of the definition, relative to the current folder.
void write(Findings const& findings, FindingForm form, std::string const& file);

/// Writes them as the member "findings".
void addFindings(JsonObject& object, Findings const& findings);

} // namespace projectctl
