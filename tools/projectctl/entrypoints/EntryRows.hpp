#pragma once

#include "output/JsonRows.hpp"
#include "project/OpenProject.hpp"
#include "project/entrypoints/EntryPoint.hpp"

namespace projectctl {

/// Entry points as a JSON array of objects on standard output, with everything that is stored of each.
class EntryRows {
public:
    /// @param root of the project, borrowed. Paths are relative to it.
    explicit EntryRows(Path const& root) : root_(root) {}

    void add(project::management::EntryPoint const& entry);

    /// Ends the output. To be called once, after the last entry point.
    void finish() { rows_.finishOutput(); }

private:
    Path const& root_;
    JsonRows rows_;
};

} // namespace projectctl
