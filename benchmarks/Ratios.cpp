#include "Ratios.hpp"

#include <algorithm>
#include <cstdio>
#include <utility>

namespace project::benchmarks {

namespace {

struct Comparison {
    std::string title;
    std::string benchmark;
    std::vector<std::string> peers;
};

std::vector<Comparison>& comparisons() {
    static std::vector<Comparison> all;
    return all;
}

/// The name without the suffixes of Google Benchmark: "add/project/iterations:3" is "add/project".
std::string plainName(std::string const& name) {
    auto const end = std::min(name.find("/iterations"), name.find("/real_time"));
    return name.substr(0, end);
}

} // namespace

void Ratios::compare(std::string title, std::string benchmark, std::vector<std::string> peers) {
    comparisons().push_back({std::move(title), std::move(benchmark), std::move(peers)});
}

void Ratios::ReportRuns(std::vector<Run> const& runs) {
    ConsoleReporter::ReportRuns(runs);
    for (auto const& run : runs) {
        if (!run.error_occurred && run.run_type == Run::RT_Iteration) {
            // The fastest repetition counts: noise can only add time.
            auto const seconds = run.real_accumulated_time / static_cast<double>(run.iterations);
            auto const [time, isNew] = times_.try_emplace(plainName(run.run_name.str()), seconds);
            time->second = isNew ? seconds : std::min(time->second, seconds);
        }
    }
}

void Ratios::print() const {
    std::printf("\n%-78s %8s\n", "ratio", "");
    for (auto const& [title, benchmark, peers] : comparisons()) {
        auto const known = [&](std::string const& name) { return times_.contains(name); };
        if (!known(benchmark) || !std::all_of(peers.begin(), peers.end(), known)) {
            continue;
        }
        double sum = 0;
        for (auto const& peer : peers) {
            sum += times_.at(peer);
        }
        std::printf("%-78s %8.2f\n", title.c_str(), times_.at(benchmark) / sum);
    }
}

} // namespace project::benchmarks
