#include <benchmark/benchmark.h>

#include "GeneratedTree.hpp"
#include "LmdbPeer.hpp"
#include "SqlitePeer.hpp"
#include "project/core/FileManager.hpp"
#include "project/metadata/MetadataFunctions.hpp"

// Adding 100,000 files in 5,000 folders durably, in one call.

namespace project::benchmarks {
namespace {

std::vector<std::string> rows(GeneratedTree const& tree) {
    std::vector<std::string> result;
    std::filesystem::path folder;
    for (auto const& file : tree.files()) {
        auto const path = fl::filesystem::toSystem(file).lexically_relative(tree.onDisk());
        if (path.parent_path() != folder) {
            folder = path.parent_path();
            result.push_back(folder.string());
        }
        result.push_back(path.string());
    }
    return result;
}

void addToProject(benchmark::State& state) {
    auto const& tree = GeneratedTree::large();
    for (auto _ : state) {
        state.PauseTiming();
        tree.removeProject();
        auto const project = tree.openProject();
        state.ResumeTiming();
        project->getFileManager().add(tree.files());
    }
}

void addToSqlite(benchmark::State& state) {
    auto const& tree = GeneratedTree::large();
    auto const paths = rows(tree);
    auto const file = tree.onDisk() / ".peer.db";
    for (auto _ : state) {
        state.PauseTiming();
        for (auto const* suffix : {"", "-wal", "-shm"}) {
            std::filesystem::remove(file.string() + suffix);
        }
        auto peer = std::make_unique<SqlitePeer>(file);
        state.ResumeTiming();
        peer->insert(paths);
        state.PauseTiming();
        peer.reset();
        state.ResumeTiming();
    }
}

void addToLmdb(benchmark::State& state) {
    auto const& tree = GeneratedTree::large();
    auto const paths = rows(tree);
    auto const folder = tree.onDisk() / ".peer.lmdb";
    for (auto _ : state) {
        state.PauseTiming();
        std::filesystem::remove_all(folder);
        auto peer = std::make_unique<LmdbPeer>(folder);
        state.ResumeTiming();
        peer->insert(paths);
        state.PauseTiming();
        peer.reset();
        state.ResumeTiming();
    }
}

void statTwice(benchmark::State& state) {
    auto const& tree = GeneratedTree::large();
    for (auto _ : state) {
        for (auto const& file : tree.files()) {
            benchmark::DoNotOptimize(metadata::exists(file));
            benchmark::DoNotOptimize(metadata::is_directory(file));
        }
    }
}

[[maybe_unused]] bool const registered = [] {
    auto const repeat = [](benchmark::internal::Benchmark* made) {
        made->Iterations(1)->UseRealTime()->Unit(benchmark::kMillisecond);
    };
    repeat(benchmark::RegisterBenchmark("add/project", addToProject));
    repeat(benchmark::RegisterBenchmark("add/sqlite", addToSqlite));
    repeat(benchmark::RegisterBenchmark("add/lmdb", addToLmdb));
    repeat(benchmark::RegisterBenchmark("add/two-stats-a-file", statTwice));
    return true;
}();

} // namespace
} // namespace project::benchmarks
