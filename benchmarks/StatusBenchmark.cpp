#include <benchmark/benchmark.h>

#include "GeneratedTree.hpp"
#include "Process.hpp"

// The differences between the disk and the definition, or git's index, of 100,000 files without any.

namespace project::benchmarks {
namespace {

void statusOfProject(benchmark::State& state) {
    auto const& tree = GeneratedTree::large();
    tree.fillProject();
    tree.fillRepository();
    for (auto _ : state) {
        runSilently(tree.onDisk(), {PROJECTCTL, "status"});
    }
}

void statusOfGit(benchmark::State& state) {
    auto const& tree = GeneratedTree::large();
    tree.fillProject();
    tree.fillRepository();
    for (auto _ : state) {
        runSilently(tree.onDisk(), {"git", "status", "--porcelain"});
    }
}

[[maybe_unused]] bool const registered = [] {
    auto const repeat = [](benchmark::internal::Benchmark* made) {
        made->Iterations(3)->UseRealTime()->Unit(benchmark::kMillisecond);
    };
    repeat(benchmark::RegisterBenchmark("status/projectctl", statusOfProject));
    repeat(benchmark::RegisterBenchmark("status/git", statusOfGit));
    return true;
}();

} // namespace
} // namespace project::benchmarks
