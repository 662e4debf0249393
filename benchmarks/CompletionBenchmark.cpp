#include <string>

#include <benchmark/benchmark.h>

#include "GeneratedTree.hpp"
#include "Process.hpp"

namespace project::benchmarks {
namespace {

/// The folder of a file, with a slash, as a person types it.
std::string oneFolder(GeneratedTree const& tree) {
    auto const folder = fl::filesystem::toSystem(tree.files()[tree.files().size() / 2]).parent_path();
    return folder.lexically_relative(tree.onDisk()).string() + '/';
}

/// As a shell does when a person types the folder and a tab.
void completePath(benchmark::State& state) {
    auto const& tree = GeneratedTree::large();
    tree.fillProject();
    for (auto _ : state) {
        runSilently(tree.onDisk(), {PROJECTCTL, "__complete", "--", "list", oneFolder(tree)});
    }
}

/// The question that completions of git ask.
void listFolderByGit(benchmark::State& state) {
    auto const& tree = GeneratedTree::large();
    tree.fillRepository();
    for (auto _ : state) {
        runSilently(tree.onDisk(), {"git", "ls-files", "--", oneFolder(tree)});
    }
}

[[maybe_unused]] bool const registered = [] {
    auto const repeat = [](benchmark::internal::Benchmark* made) {
        made->Iterations(5)->UseRealTime()->Unit(benchmark::kMillisecond);
    };
    repeat(benchmark::RegisterBenchmark("complete/path", completePath));
    repeat(benchmark::RegisterBenchmark("complete/git-ls-files", listFolderByGit));
    return true;
}();

} // namespace
} // namespace project::benchmarks
