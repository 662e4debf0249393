#pragma once

#include <ostream>
#include <string>
#include <vector>

#include "stores/merge_matrix/SampleProject.hpp"

namespace project::test {

/// A change through the managers, with the name that the tables use.
struct NamedChange {
    std::string name;
    Action make;

    friend void PrintTo(NamedChange const& change, std::ostream* out) { *out << change.name; }
};

/// Creates the project that all changes start from.
void makeCommonProject(ProjectManager& project, TemporaryFolder const& folder);

/// Every kind of change. New objects have the same UUID each time.
std::vector<NamedChange> const& projectChanges();

} // namespace project::test
