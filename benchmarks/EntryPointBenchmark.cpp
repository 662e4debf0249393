#include <benchmark/benchmark.h>

#include "GeneratedTree.hpp"
#include "TemporaryPeer.hpp"
#include "project/core/EntryPointManager.hpp"
#include "project/core/FileManager.hpp"
#include "project/entrypoints/EntryPoint.hpp"
#include "project/metadata/MetadataFunctions.hpp"

// 1,000 entry points in a project of 100,000 files: listing them, and removing a folder of twenty files
// together with their entry points.

namespace project::benchmarks {
namespace {

using fl::filesystem::Path;
using management::EntryPointDefinition;
using management::ProjectManager;

constexpr std::size_t entryPoints = 1'000;

/// Every hundredth file: one file in every fifth folder.
std::vector<Path> entryFiles(GeneratedTree const& tree) {
    std::vector<Path> result;
    auto const step = tree.files().size() / entryPoints;
    for (std::size_t index = 0; result.size() < entryPoints; index += step) {
        result.push_back(tree.files()[index]);
    }
    return result;
}

std::string rowOf(GeneratedTree const& tree, Path const& file) {
    return fl::filesystem::toSystem(file).lexically_relative(tree.onDisk()).string();
}

std::vector<std::string> rowsOf(GeneratedTree const& tree, std::vector<Path> const& files) {
    std::vector<std::string> result;
    result.reserve(files.size());
    for (auto const& file : files) {
        result.push_back(rowOf(tree, file));
    }
    return result;
}

/// Opens the project of the tree, adds the entry points, and reads it once.
std::unique_ptr<ProjectManager> openWithEntries(GeneratedTree const& tree) {
    tree.fillProject();
    auto const store = tree.openStore();
    auto project = std::make_unique<management::ProjectManagerBase>(tree.root(), store);
    auto transaction = store->transaction();
    for (auto const& file : entryFiles(tree)) {
        EntryPointDefinition entry(file);
        project->getEntryPointManager().setEntryPoint(entry);
    }
    transaction.commit();
    benchmark::DoNotOptimize(project->getFileManager().getProjectFiles().size());
    return project;
}

void removeEntries(GeneratedTree const& tree, ProjectManager& project) {
    for (auto const& file : entryFiles(tree)) {
        project.getEntryPointManager().removeEntryPoint(file);
    }
}

void listInProject(benchmark::State& state) {
    auto const& tree = GeneratedTree::large();
    auto const project = openWithEntries(tree);
    for (auto _ : state) {
        if (project->getEntryPointManager().getEntryPoints().size() != entryPoints) {
            state.SkipWithError("entry points are missing");
        }
    }
    removeEntries(tree, *project);
}

void listInSqlite(benchmark::State& state) {
    auto const& tree = GeneratedTree::large();
    TemporaryPeer peer;
    peer->insert(rowsOf(tree, tree.files()));
    peer->insertEntries(rowsOf(tree, entryFiles(tree)));
    for (auto _ : state) {
        if (peer->entries() != entryPoints) {
            state.SkipWithError("entry points are missing");
        }
    }
}

/// The files in the first folder of the tree.
std::vector<Path> firstFolder(GeneratedTree const& tree) {
    constexpr std::ptrdiff_t filesInAFolder = 20;
    return {tree.files().begin(), tree.files().begin() + filesInAFolder};
}

void removeInProject(benchmark::State& state) {
    auto const& tree = GeneratedTree::large();
    auto const project = openWithEntries(tree);
    auto const files = firstFolder(tree);
    auto const folder = metadata::getParentFolder(files.front());
    for (auto _ : state) {
        if (project->getFileManager().remove({folder}).size() != files.size() + 1) {
            state.SkipWithError("files are missing");
        }
        state.PauseTiming();
        project->getFileManager().add(files);
        EntryPointDefinition entry(files.front());
        project->getEntryPointManager().setEntryPoint(entry);
        state.ResumeTiming();
    }
    removeEntries(tree, *project);
}

void removeInSqlite(benchmark::State& state) {
    auto const& tree = GeneratedTree::large();
    TemporaryPeer peer;
    peer->insert(rowsOf(tree, tree.files()));
    peer->insertEntries(rowsOf(tree, entryFiles(tree)));
    auto const rows = rowsOf(tree, firstFolder(tree));
    for (auto _ : state) {
        peer->remove(rows);
        state.PauseTiming();
        peer->insert(rows);
        peer->insertEntries({rows.front()});
        state.ResumeTiming();
    }
}

[[maybe_unused]] bool const registered = [] {
    auto const repeat = [](benchmark::internal::Benchmark* made) {
        made->Iterations(20)->UseRealTime()->Unit(benchmark::kMillisecond);
    };
    repeat(benchmark::RegisterBenchmark("entry-points/list/project", listInProject));
    repeat(benchmark::RegisterBenchmark("entry-points/list/sqlite", listInSqlite));
    repeat(benchmark::RegisterBenchmark("entry-points/remove-folder/project", removeInProject));
    repeat(benchmark::RegisterBenchmark("entry-points/remove-folder/sqlite", removeInSqlite));
    return true;
}();

} // namespace
} // namespace project::benchmarks
