#pragma once

#include <map>
#include <string>
#include <vector>

#include <benchmark/benchmark.h>

namespace project::benchmarks {

/// Shows results as usual and stores the times, so that print() can show ratios. Machines differ and are
/// noisy: only times that were measured in the same run can be compared.
class Ratios : public benchmark::ConsoleReporter {
public:
    /// Registers the ratio of one benchmark's time to the sum of its peers' times.
    static void compare(std::string title, std::string benchmark, std::vector<std::string> peers);

    void ReportRuns(std::vector<Run> const& runs) override;

    /// Prints each ratio whose benchmarks were all run.
    void print() const;

private:
    std::map<std::string, double> times_;
};

} // namespace project::benchmarks
