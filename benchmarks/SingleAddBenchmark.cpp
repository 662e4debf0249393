#include <benchmark/benchmark.h>

#include <array>
#include <stdexcept>

#include <fcntl.h>
#include <unistd.h>

#include "GeneratedTree.hpp"
#include "project/core/FileManager.hpp"

// One durable add into a large project, compared with the minimum cost of a durable change on the same disk.

namespace project::benchmarks {
namespace {

void addOne(benchmark::State& state, GeneratedTree const& tree, std::string const& name) {
    tree.fillProject();
    auto const project = tree.openProject();
    std::vector<fl::filesystem::Path> extra;
    for (auto number = 0; number < state.max_iterations; ++number) {
        extra.push_back(tree.createFile(name + std::to_string(number)));
    }
    benchmark::DoNotOptimize(project->getFileManager().isFileInProject(extra[0]));
    std::size_t next = 0;
    for (auto _ : state) {
        project->getFileManager().add({extra[next++]});
    }
    project->getFileManager().remove(extra);
    for (auto const& file : extra) {
        std::filesystem::remove(fl::filesystem::toSystem(file));
    }
}

void addOneToLarge(benchmark::State& state) {
    addOne(state, GeneratedTree::large(), "large");
}

void addOneToSmall(benchmark::State& state) {
    static GeneratedTree const small(10'000);
    addOne(state, small, "small");
}

/// A hundred calls of add, each with one file, in one transaction.
void addHundredInATransaction(benchmark::State& state) {
    constexpr int count = 100;
    auto const& tree = GeneratedTree::large();
    tree.fillProject();
    auto const store = tree.openStore();
    management::ProjectManagerBase project(tree.root(), store);
    std::vector<fl::filesystem::Path> extra;
    for (int number = 0; number < count; ++number) {
        extra.push_back(tree.createFile("hundred" + std::to_string(number)));
    }
    benchmark::DoNotOptimize(project.getFileManager().isFileInProject(extra[0]));
    for (auto _ : state) {
        auto transaction = store->transaction();
        for (auto const& file : extra) {
            project.getFileManager().add({file});
        }
        transaction.commit();
        state.PauseTiming();
        project.getFileManager().remove(extra);
        state.ResumeTiming();
    }
    for (auto const& file : extra) {
        std::filesystem::remove(fl::filesystem::toSystem(file));
    }
}

void appendAndSync(benchmark::State& state) {
    auto const file = GeneratedTree::large().onDisk() / ".append";
    int const descriptor = open(file.c_str(), O_WRONLY | O_CREAT | O_APPEND | O_CLOEXEC, 0600);
    std::array<char, 4096> const block{};
    for (auto _ : state) {
        if (write(descriptor, block.data(), block.size()) != static_cast<ssize_t>(block.size()) ||
            fdatasync(descriptor) != 0) {
            state.SkipWithError("the disk failed");
        }
    }
    close(descriptor);
    std::filesystem::remove(file);
}

[[maybe_unused]] bool const registered = [] {
    auto const repeat = [](benchmark::internal::Benchmark* made) {
        made->Iterations(200)->UseRealTime()->Unit(benchmark::kMicrosecond);
    };
    repeat(benchmark::RegisterBenchmark("add-one/project-of-100000", addOneToLarge));
    repeat(benchmark::RegisterBenchmark("add-one/project-of-10000", addOneToSmall));
    benchmark::RegisterBenchmark("add-one/hundred-in-a-transaction", addHundredInATransaction)
        ->Iterations(20)
        ->UseRealTime()
        ->Unit(benchmark::kMicrosecond);
    repeat(benchmark::RegisterBenchmark("add-one/append-4KiB-and-sync", appendAndSync));
    return true;
}();

} // namespace
} // namespace project::benchmarks
