#include <sys/stat.h>

#include <benchmark/benchmark.h>

#include "GeneratedTree.hpp"
#include "LmdbPeer.hpp"
#include "Process.hpp"
#include "SqlitePeer.hpp"
#include "project/core/FileManager.hpp"

// Looking up one file in a project of 100,000.

namespace project::benchmarks {
namespace {

constexpr std::size_t stride = 7919; // a prime, so that look-ups are spread over the whole tree

void lookUpInProject(benchmark::State& state) {
    auto const& tree = GeneratedTree::large();
    tree.fillProject();
    auto const project = tree.openProject();
    auto const& files = project->getFileManager();
    benchmark::DoNotOptimize(files.getProjectFiles().size());
    std::size_t next = 0;
    for (auto _ : state) {
        benchmark::DoNotOptimize(files.isFileInProject(tree.files()[next]));
        next = (next + stride) % tree.files().size();
    }
}

void lookUpUnderAGuard(benchmark::State& state) {
    auto const& tree = GeneratedTree::large();
    tree.fillProject();
    auto const store = tree.openStore();
    management::ProjectManagerBase project(tree.root(), store);
    auto const& files = project.getFileManager();
    auto const guard = store->acquireReadLock();
    benchmark::DoNotOptimize(files.getProjectFiles().size());
    std::size_t next = 0;
    for (auto _ : state) {
        benchmark::DoNotOptimize(files.isFileInProject(tree.files()[next]));
        next = (next + stride) % tree.files().size();
    }
}

void statOnce(benchmark::State& state) {
    auto const& tree = GeneratedTree::large();
    tree.fillProject();
    auto const text = tree.text();
    for (auto _ : state) {
        struct stat found;
        benchmark::DoNotOptimize(::stat(text.c_str(), &found));
    }
}

void nameByProcess(benchmark::State& state) {
    auto const& tree = GeneratedTree::large();
    tree.fillProject();
    for (auto _ : state) {
        runSilently(tree.onDisk(), {PROJECTCTL, "name"});
    }
}

std::vector<std::string> relativeFiles(GeneratedTree const& tree) {
    std::vector<std::string> paths;
    for (auto const& file : tree.files()) {
        paths.push_back(fl::filesystem::toSystem(file).lexically_relative(tree.onDisk()).string());
    }
    return paths;
}

template <typename Peer>
void lookUpInPeer(benchmark::State& state, char const* name) {
    auto const& tree = GeneratedTree::large();
    auto const paths = relativeFiles(tree);
    Peer peer(tree.onDisk() / name);
    peer.insert(paths);
    std::size_t next = 0;
    for (auto _ : state) {
        benchmark::DoNotOptimize(peer.contains(paths[next]));
        next = (next + stride) % paths.size();
    }
}

std::string oneFile(GeneratedTree const& tree) {
    return fl::filesystem::toSystem(tree.files()[stride]).string();
}

void lookUpByProcess(benchmark::State& state) {
    auto const& tree = GeneratedTree::large();
    tree.fillProject();
    for (auto _ : state) {
        runSilently(tree.onDisk(), {PROJECTCTL, "list", oneFile(tree)});
    }
}

void lookUpByGit(benchmark::State& state) {
    auto const& tree = GeneratedTree::large();
    tree.fillRepository();
    for (auto _ : state) {
        runSilently(tree.onDisk(), {"git", "ls-files", "--error-unmatch", "--", oneFile(tree)});
    }
}

[[maybe_unused]] bool const registered = [] {
    benchmark::RegisterBenchmark("lookup/project", lookUpInProject)->UseRealTime();
    benchmark::RegisterBenchmark("lookup/under-a-guard", lookUpUnderAGuard)->UseRealTime();
    benchmark::RegisterBenchmark("lookup/stat", statOnce)->UseRealTime();
    benchmark::RegisterBenchmark("lookup/sqlite", lookUpInPeer<SqlitePeer>, ".lookup.db")->UseRealTime();
    benchmark::RegisterBenchmark("lookup/lmdb", lookUpInPeer<LmdbPeer>, ".lookup.lmdb")->UseRealTime();
    auto const repeat = [](benchmark::internal::Benchmark* made) {
        made->Iterations(5)->UseRealTime()->Unit(benchmark::kMillisecond);
    };
    repeat(benchmark::RegisterBenchmark("name/projectctl", nameByProcess));
    repeat(benchmark::RegisterBenchmark("lookup/projectctl", lookUpByProcess));
    repeat(benchmark::RegisterBenchmark("lookup/git-ls-files", lookUpByGit));
    return true;
}();

} // namespace
} // namespace project::benchmarks
