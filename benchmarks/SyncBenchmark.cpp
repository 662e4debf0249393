#include <benchmark/benchmark.h>

#include "GeneratedTree.hpp"
#include "Process.hpp"
#include "project/session.hpp"

// A folder of 100,000 files that keeps itself up to date, of which none has changed.

namespace project::benchmarks {
namespace {

session::Session openWithRule(GeneratedTree const& tree) {
    tree.fillProject();
    tree.fillRepository();
    auto session = session::Session::open(tree.root());
    if (session.syncRules().empty()) {
        session.setSyncRule({tree.root()});
        session.sync();
    }
    return session;
}

void syncOfSession(benchmark::State& state) {
    auto session = openWithRule(GeneratedTree::large());
    for (auto _ : state) {
        if (!session.sync().isEmpty()) {
            state.SkipWithError("a file has changed");
        }
    }
}

void syncOfNewSession(benchmark::State& state) {
    auto const& tree = GeneratedTree::large();
    openWithRule(tree);
    for (auto _ : state) {
        session::Session::open(tree.root()).sync();
    }
}

void statusOfGit(benchmark::State& state) {
    auto const& tree = GeneratedTree::large();
    openWithRule(tree);
    for (auto _ : state) {
        runSilently(tree.onDisk(), {"git", "status", "--porcelain"});
    }
}

[[maybe_unused]] bool const registered = [] {
    auto const repeat = [](benchmark::internal::Benchmark* made) {
        made->Iterations(3)->UseRealTime()->Unit(benchmark::kMillisecond);
    };
    repeat(benchmark::RegisterBenchmark("sync/session", syncOfSession));
    repeat(benchmark::RegisterBenchmark("sync/new-session", syncOfNewSession));
    repeat(benchmark::RegisterBenchmark("sync/git", statusOfGit));
    return true;
}();

} // namespace
} // namespace project::benchmarks
