#pragma once

#include "output/JsonRows.hpp"
#include "project/OpenProject.hpp"
#include "project/entrypoints/EntryPoint.hpp"

namespace projectctl {

/// Writes entry points with all their data to standard output, as a JSON array of objects.
class EntryRows {
public:
    /// @param root of the project, borrowed. Paths are relative to it.
    explicit EntryRows(Path const& root) : root_(root) {}

    void add(project::management::EntryPoint const& entry);

    /// Ends the output. Call it once, after the last entry point.
    void finish() { rows_.finish(); }

private:
    Path const& root_;
    JsonRows rows_{json::entryList, "entryPoints"};
};

} // namespace projectctl
