#pragma once

#include <map>
#include <string>
#include <vector>

#include <benchmark/benchmark.h>

namespace project::benchmarks {

/// Shows results as usual and keeps the times, so that the ratios can be printed at the end: machines differ
/// and are noisy, and only what ran side by side can be compared.
class Ratios : public benchmark::ConsoleReporter {
public:
    /// Registers a ratio of one benchmark's time to the sum of its peers' times.
    static void compare(std::string what, std::string benchmark, std::vector<std::string> peers);

    void ReportRuns(std::vector<Run> const& runs) override;

    /// Prints every ratio of which all benchmarks ran.
    void print() const;

private:
    std::map<std::string, double> times_;
};

} // namespace project::benchmarks
