#include <sys/stat.h>

#include <benchmark/benchmark.h>

#include "GeneratedTree.hpp"
#include "Process.hpp"
#include "SqlitePeer.hpp"
#include "project/core/FileManager.hpp"

// Listing 100,000 files in 5,000 folders, by an object that was just opened and by a new process.

namespace project::benchmarks {
namespace {

void listProject(benchmark::State& state) {
    auto const& tree = GeneratedTree::large();
    tree.fillProject();
    for (auto _ : state) {
        auto project = tree.openProject();
        auto files = project->getFileManager().getProjectFiles();
        state.PauseTiming(); // the peers have no objects to destroy
        if (files.size() < tree.files().size()) {
            state.SkipWithError("files are missing");
        }
        project.reset();
        files = {};
        state.ResumeTiming();
    }
}

void listWarm(benchmark::State& state) {
    auto const& tree = GeneratedTree::large();
    tree.fillProject();
    auto const project = tree.openProject();
    benchmark::DoNotOptimize(project->getFileManager().getProjectFiles().size());
    for (auto _ : state) {
        benchmark::DoNotOptimize(project->getFileManager().getProjectFiles().size());
    }
}

/// What the guards of a list must do: one check for changes for each file and folder.
void statForEachEntry(benchmark::State& state) {
    auto const& tree = GeneratedTree::large();
    tree.fillProject();
    auto const entries = tree.openProject()->getFileManager().getProjectFiles().size();
    auto const text = tree.text();
    for (auto _ : state) {
        for (std::size_t entry = 0; entry < entries; ++entry) {
            struct stat found;
            benchmark::DoNotOptimize(::stat(text.c_str(), &found));
        }
    }
}

void listByProcess(benchmark::State& state) {
    auto const& tree = GeneratedTree::large();
    tree.fillProject();
    for (auto _ : state) {
        runSilently(tree.onDisk(), {PROJECTCTL, "list"});
    }
}

void listByGit(benchmark::State& state) {
    auto const& tree = GeneratedTree::large();
    tree.fillRepository();
    for (auto _ : state) {
        runSilently(tree.onDisk(), {"git", "ls-files"});
    }
}

void walkTheDisk(benchmark::State& state) {
    auto const& tree = GeneratedTree::large();
    for (auto _ : state) {
        std::vector<std::filesystem::path> found;
        for (auto entry = std::filesystem::recursive_directory_iterator(tree.onDisk());
             entry != std::filesystem::recursive_directory_iterator(); ++entry) {
            if (entry->path().filename() == ".git") {
                entry.disable_recursion_pending();
            }
            found.push_back(entry->path());
        }
        benchmark::DoNotOptimize(found.data());
    }
}

[[maybe_unused]] bool const registered = [] {
    auto const repeat = [](benchmark::internal::Benchmark* made) {
        made->Iterations(3)->UseRealTime()->Unit(benchmark::kMillisecond);
    };
    repeat(benchmark::RegisterBenchmark("list/project", listProject));
    repeat(benchmark::RegisterBenchmark("list/warm", listWarm));
    repeat(benchmark::RegisterBenchmark("list/stat-for-each-entry", statForEachEntry));
    repeat(benchmark::RegisterBenchmark("list/projectctl", listByProcess));
    repeat(benchmark::RegisterBenchmark("list/git-ls-files", listByGit));
    repeat(benchmark::RegisterBenchmark("list/directory-iterator", walkTheDisk));
    return true;
}();

} // namespace
} // namespace project::benchmarks
