#include <benchmark/benchmark.h>

#include "GeneratedTree.hpp"
#include "Process.hpp"
#include "Ratios.hpp"
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
        made->Iterations(3)->Repetitions(5)->UseRealTime()->Unit(benchmark::kMillisecond);
    };
    repeat(benchmark::RegisterBenchmark("list/project", listProject));
    repeat(benchmark::RegisterBenchmark("list/projectctl", listByProcess));
    repeat(benchmark::RegisterBenchmark("list/git-ls-files", listByGit));
    repeat(benchmark::RegisterBenchmark("list/directory-iterator", walkTheDisk));
    Ratios::compare("listing 100,000 files by a new projectctl to git ls-files", "list/projectctl",
                    {"list/git-ls-files"});
    Ratios::compare("  by a project that was just opened to git ls-files", "list/project",
                    {"list/git-ls-files"});
    Ratios::compare("  by a project that was just opened to a walk of the disk", "list/project",
                    {"list/directory-iterator"});
    return true;
}();

} // namespace
} // namespace project::benchmarks
