#include <benchmark/benchmark.h>

#include "GeneratedTree.hpp"
#include "TemporaryPeer.hpp"
#include "project/core/FileManager.hpp"
#include "project/core/LabelManager.hpp"
#include "project/files/FileLabel.hpp"
#include "project/metadata/MetadataFunctions.hpp"

// Labels on 10,000 files of a project of 100,000: putting one label on all of them in one step, looking up
// the labels of one file, and deleting the category.

namespace project::benchmarks {
namespace {

using management::CategoryDefinition;
using management::Label;
using management::LabelDefinition;
using management::ProjectManager;

constexpr std::size_t labelled = 10'000;
constexpr std::size_t stride = 7919; // a prime, so that look-ups are spread over the labelled files

std::vector<fl::filesystem::Path> labelledFiles(GeneratedTree const& tree) {
    std::vector<fl::filesystem::Path> result;
    auto const step = tree.files().size() / labelled;
    for (std::size_t index = 0; result.size() < labelled; index += step) {
        result.push_back(tree.files()[index]);
    }
    return result;
}

std::vector<std::string> labelledRows(GeneratedTree const& tree) {
    std::vector<std::string> result;
    for (auto const& file : labelledFiles(tree)) {
        result.push_back(fl::filesystem::toSystem(file).lexically_relative(tree.onDisk()).string());
    }
    return result;
}

Label makeLabel(ProjectManager& project) {
    Label const label(CategoryDefinition(u"Status"), LabelDefinition(u"Done"));
    project.getLabelManager().createCategory(label.getCategory());
    project.getLabelManager().createLabel(label.getCategory(), label.getLabelIdentifier());
    return label;
}

/// Opens the project of the tree without categories, and reads it once.
std::unique_ptr<ProjectManager> openRead(GeneratedTree const& tree) {
    tree.fillProject();
    auto project = tree.openProject();
    for (auto const& category : project->getLabelManager().getAllCategories()) {
        project->getLabelManager().deleteCategory(category);
    }
    benchmark::DoNotOptimize(project->getFileManager().getProjectFiles().size());
    return project;
}

void putInProject(benchmark::State& state) {
    auto const& tree = GeneratedTree::large();
    auto const project = openRead(tree);
    auto const files = labelledFiles(tree);
    for (auto _ : state) {
        state.PauseTiming();
        auto const label = makeLabel(*project);
        state.ResumeTiming();
        project->getFileManager().addLabels(files, {label});
        state.PauseTiming();
        project->getLabelManager().deleteCategory(label.getCategory());
        state.ResumeTiming();
    }
}

void deleteInProject(benchmark::State& state) {
    auto const& tree = GeneratedTree::large();
    auto const project = openRead(tree);
    auto const files = labelledFiles(tree);
    for (auto _ : state) {
        state.PauseTiming();
        auto const label = makeLabel(*project);
        project->getFileManager().addLabels(files, {label});
        state.ResumeTiming();
        project->getLabelManager().deleteCategory(label.getCategory());
    }
}

void lookUpInProject(benchmark::State& state) {
    auto const& tree = GeneratedTree::large();
    auto const project = openRead(tree);
    auto const files = labelledFiles(tree);
    auto const label = makeLabel(*project);
    project->getFileManager().addLabels(files, {label});
    std::size_t next = 0;
    for (auto _ : state) {
        if (project->getFileManager().getLabels(files[next]).size() != 1) {
            state.SkipWithError("the label is missing");
        }
        next = (next + stride) % files.size();
    }
    project->getLabelManager().deleteCategory(label.getCategory());
}

void putInSqlite(benchmark::State& state) {
    auto const rows = labelledRows(GeneratedTree::large());
    TemporaryPeer peer;
    for (auto _ : state) {
        peer->putLabel(rows, "Status", "Done");
        state.PauseTiming();
        peer->deleteCategory("Status");
        state.ResumeTiming();
    }
}

void deleteInSqlite(benchmark::State& state) {
    auto const rows = labelledRows(GeneratedTree::large());
    TemporaryPeer peer;
    for (auto _ : state) {
        state.PauseTiming();
        peer->putLabel(rows, "Status", "Done");
        state.ResumeTiming();
        peer->deleteCategory("Status");
    }
}

void lookUpInSqlite(benchmark::State& state) {
    auto const rows = labelledRows(GeneratedTree::large());
    TemporaryPeer peer;
    peer->putLabel(rows, "Status", "Done");
    std::size_t next = 0;
    for (auto _ : state) {
        if (peer->labelsOn(rows[next]) != 1) {
            state.SkipWithError("the label is missing");
        }
        next = (next + stride) % rows.size();
    }
}

void statEach(benchmark::State& state, std::vector<fl::filesystem::Path> const& files) {
    for (auto _ : state) {
        for (auto const& file : files) {
            benchmark::DoNotOptimize(metadata::is_directory(file));
        }
    }
}

void statLabelled(benchmark::State& state) {
    statEach(state, labelledFiles(GeneratedTree::large()));
}

void statAll(benchmark::State& state) {
    statEach(state, GeneratedTree::large().files());
}

[[maybe_unused]] bool const registered = [] {
    auto const repeat = [](benchmark::internal::Benchmark* made) {
        made->Iterations(1)->UseRealTime()->Unit(benchmark::kMillisecond);
    };
    repeat(benchmark::RegisterBenchmark("labels/put-on-10000/project", putInProject));
    repeat(benchmark::RegisterBenchmark("labels/put-on-10000/sqlite", putInSqlite));
    repeat(benchmark::RegisterBenchmark("labels/delete-category/project", deleteInProject));
    repeat(benchmark::RegisterBenchmark("labels/delete-category/sqlite", deleteInSqlite));
    repeat(benchmark::RegisterBenchmark("labels/put-on-10000/stat", statLabelled));
    repeat(benchmark::RegisterBenchmark("labels/delete-category/stat", statAll));
    benchmark::RegisterBenchmark("labels/of-one-file/project", lookUpInProject)->UseRealTime();
    benchmark::RegisterBenchmark("labels/of-one-file/sqlite", lookUpInSqlite)->UseRealTime();
    return true;
}();

} // namespace
} // namespace project::benchmarks
