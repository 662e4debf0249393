#include "report/ReportFindings.hpp"

#include <algorithm>
#include <functional>
#include <map>
#include <set>
#include <utility>

#include "checks/DefinitionFindings.hpp"
#include "checks/Problems.hpp"
#include "checks/StatusScan.hpp"
#include "files/DiskFolder.hpp"
#include "output/Output.hpp"
#include "project/metadata/MetadataFunctions.hpp"

namespace projectctl {

namespace {

constexpr std::size_t mostFindings = 1000; ///< of each code

class FindingCollection {
public:
    explicit FindingCollection(Path root) : root_(std::move(root)) {}

    void add(std::string_view source, Findings findings) {
        for (auto& finding : findings) {
            if (seen_.emplace(finding.code, finding.text).second) {
                add({source, finding.code, finding.isFault(), std::move(finding.text),
                     std::move(finding.path)});
            }
        }
    }

    void addDifferences(std::string_view code, std::vector<StatusScan::File> const& files, Path const& page) {
        for (auto const& file : files) {
            if (!(file.path == page)) {
                add({"status", code, false, {}, project::metadata::getRelativePath(root_, file.path)});
            }
        }
    }

    ReportFindings take() {
        std::ranges::stable_sort(result_.findings, std::ranges::greater(), &ReportFinding::isFault);
        return std::move(result_);
    }

private:
    void add(ReportFinding finding) {
        if (++counts_[finding.code] > mostFindings) {
            ++result_.omitted;
        } else {
            result_.findings.push_back(std::move(finding));
        }
    }

    Path root_;
    std::map<std::string_view, std::size_t> counts_; ///< by code
    std::set<std::pair<std::string_view, std::string>> seen_;
    ReportFindings result_;
};

} // namespace

ReportFindings collectFindings(OpenProject& project, Path const& page, Progress& progress) {
    auto const shown = ShownPaths::fromRoot(project.root());
    FindingCollection result(project.root());
    result.add("check", findingsOf(faultsOfDefinition(project), project, shown));
    StatusScan scan(project);
    scan.run(progress);
    for (auto const& folder : scan.unreadable()) {
        printWarning(Message("AsReported", problemOf(folder)));
    }
    result.addDifferences("gone", scan.gone(), page);
    result.addDifferences("new", scan.added(), page);
    result.add("status", findProblems(project, shown));
    return result.take();
}

} // namespace projectctl
