#pragma once

#include "references/ReferenceGraph.hpp"

namespace projectctl {

// The forms in which a graph of projects is written to standard output.

/// As a tree, a line for each reference; what a project references is shown where it comes first.
void writeTree(ReferenceGraph const& graph);

/// As a JSON object with the arrays "projects", "references" and "cycles".
void writeJson(ReferenceGraph const& graph);

/// As text for Graphviz.
void writeDot(ReferenceGraph const& graph);

} // namespace projectctl
