#pragma once

#include <ostream>
#include <string>
#include <vector>

#include "stores/merge_matrix/SampleProject.hpp"

namespace project::test {

/// A change as people make it, by the name that tables of tests call it.
struct NamedChange {
    std::string name;
    Action make;

    friend void PrintTo(NamedChange const& change, std::ostream* out) { *out << change.name; }
};

/// Makes the project that all changes start from.
void makeCommonProject(ProjectManager& project, TemporaryFolder const& folder);

/// Every kind of change. Whatever comes into being has the same UUID each time.
std::vector<NamedChange> const& projectChanges();

} // namespace project::test
