#pragma once

#include <optional>
#include <string>
#include <vector>

#include "references/ReferenceGraph.hpp"
#include "report/Comparison.hpp"
#include "report/Definition.hpp"
#include "report/FileMeasures.hpp"
#include "report/History.hpp"
#include "report/ReportFindings.hpp"

namespace projectctl {

/// Everything that a report shows.
struct ReportData {
    Path root;
    Definition definition;
    std::vector<FileMeasure> measures; ///< one for each entry of the definition
    std::optional<LoggedCommit> lastChange;
    ReportFindings findings;
    std::vector<ReferenceGraph::Node> projects; ///< the first one is this project
    History history;
    std::optional<Comparison> comparison;
};

/// The data in the form that the page reads: compact JSON, in which no text contains "<". The same data give
/// the same bytes.
std::string jsonOf(ReportData const& data);

} // namespace projectctl
