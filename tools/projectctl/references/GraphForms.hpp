#pragma once

#include "references/ReferenceGraph.hpp"

namespace projectctl {

// Writers of a graph of projects to standard output.

/// As a tree, one line per reference. The references of a project are shown where it appears first.
void writeTree(ReferenceGraph const& graph);

/// As a JSON object with the arrays "projects", "references" and "cycles".
void writeJson(ReferenceGraph const& graph);

/// As text for Graphviz.
void writeDot(ReferenceGraph const& graph);

} // namespace projectctl
