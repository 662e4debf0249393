#include <benchmark/benchmark.h>

#include <map>

#include "GeneratedTree.hpp"
#include "project/core/FileManager.hpp"

// Cost against size: growth/<work>/<shape>/<files>.

namespace project::benchmarks {
namespace {

using Shape = GeneratedTree::Shape;

constexpr std::size_t stride = 7919; // a prime, so that look-ups are spread over the whole tree

/// The tree of a shape and size. Only one is kept, since a large one takes much of the disk's time and space.
GeneratedTree const& treeOf(Shape shape, std::size_t files) {
    static std::pair<Shape, std::size_t> current;
    static std::unique_ptr<GeneratedTree> tree;
    if (!tree || current != std::pair(shape, files)) {
        tree.reset();
        tree = std::make_unique<GeneratedTree>(files, shape);
        current = {shape, files};
    }
    return *tree;
}

/// An open project whose levels are all loaded: the first visit of a level is the cost of opening.
std::unique_ptr<management::ProjectManager> openAndVisit(GeneratedTree const& tree) {
    auto project = tree.openProject();
    benchmark::DoNotOptimize(project->getFileManager().getProjectFiles().size());
    return project;
}

void addAll(benchmark::State& state, Shape shape, std::size_t files) {
    auto const& tree = treeOf(shape, files);
    for (auto _ : state) {
        state.PauseTiming();
        tree.removeProject();
        auto const project = tree.openProject();
        state.ResumeTiming();
        project->getFileManager().add(tree.files());
    }
}

void open(benchmark::State& state, Shape shape, std::size_t files) {
    auto const& tree = treeOf(shape, files);
    tree.fillProject();
    for (auto _ : state) {
        auto const project = tree.openProject();
        benchmark::DoNotOptimize(project->getFileManager().isFileInProject(tree.files().back()));
    }
}

void list(benchmark::State& state, Shape shape, std::size_t files) {
    auto const& tree = treeOf(shape, files);
    tree.fillProject();
    auto const project = tree.openProject();
    for (auto _ : state) {
        benchmark::DoNotOptimize(project->getFileManager().getProjectFiles().size());
    }
}

void lookUp(benchmark::State& state, Shape shape, std::size_t files) {
    auto const& tree = treeOf(shape, files);
    tree.fillProject();
    auto const project = openAndVisit(tree);
    std::size_t next = 0;
    for (auto _ : state) {
        benchmark::DoNotOptimize(project->getFileManager().isFileInProject(tree.files()[next]));
        next = (next + stride) % tree.files().size();
    }
}

void addOne(benchmark::State& state, Shape shape, std::size_t files) {
    auto const& tree = treeOf(shape, files);
    tree.fillProject();
    auto const project = openAndVisit(tree);
    auto const extra = tree.createFile("extra");
    for (auto _ : state) {
        project->getFileManager().add({extra});
        state.PauseTiming();
        project->getFileManager().remove({extra});
        state.ResumeTiming();
    }
    std::filesystem::remove(fl::filesystem::toSystem(extra));
}

[[maybe_unused]] bool const registered = [] {
    using Work = void (*)(benchmark::State&, Shape, std::size_t);
    std::map<std::string, std::pair<Work, benchmark::IterationCount>> const works{
        {"add-all", {addAll, 1}},     {"open", {open, 3}},       {"list", {list, 3}},
        {"look-up", {lookUp, 2'000}}, {"add-one", {addOne, 50}},
    };
    std::map<std::string, Shape> const shapes{
        {"wide", Shape::Wide}, {"flat", Shape::Flat}, {"deep", Shape::Deep}, {"real", Shape::Real}};
    for (auto const& [shapeName, shape] : shapes) {
        for (std::size_t const files : {1'000, 10'000, 100'000, 1'000'000}) {
            for (auto const& [workName, work] : works) {
                auto const name = "growth/" + workName + "/" + shapeName + "/" + std::to_string(files);
                benchmark::RegisterBenchmark(name.c_str(), work.first, shape, files)
                    ->Iterations(work.second)
                    ->UseRealTime()
                    ->Unit(benchmark::kMillisecond);
            }
        }
    }
    return true;
}();

} // namespace
} // namespace project::benchmarks
