#include <fstream>

#include <benchmark/benchmark.h>

#include "GeneratedTree.hpp"
#include "Process.hpp"
#include "project/session.hpp"

// The cost of source control and events compared with the managers alone, in a git repository: adding one
// file to a project of 100,000, and adding all 100,000.

namespace project::benchmarks {
namespace {

using fl::filesystem::Path;
using session::Options;
using session::Session;
using session::SourceControl;

/// Creates a repository in the tree, with an empty index.
void createEmptyRepository(GeneratedTree const& tree) {
    std::filesystem::remove_all(tree.onDisk() / ".git");
    runSilently(tree.onDisk(), {"git", "init", "-q"});
}

void removeRepository(GeneratedTree const& tree) {
    std::filesystem::remove_all(tree.onDisk() / ".git");
}

void addAllInSession(benchmark::State& state) {
    auto const& tree = GeneratedTree::large();
    for (auto _ : state) {
        state.PauseTiming();
        tree.removeProject();
        createEmptyRepository(tree);
        auto session = Session::create(tree.root(), u"benchmark");
        state.ResumeTiming();
        session.project().getFileManager().add(tree.files());
    }
    removeRepository(tree);
}

void addAllBare(benchmark::State& state) {
    auto const& tree = GeneratedTree::large();
    for (auto _ : state) {
        state.PauseTiming();
        tree.removeProject();
        auto const project = tree.openProject();
        project->create(u"benchmark");
        state.ResumeTiming();
        project->getFileManager().add(tree.files());
    }
}

void addAllByGit(benchmark::State& state) {
    auto const& tree = GeneratedTree::large();
    tree.removeProject();
    for (auto _ : state) {
        state.PauseTiming();
        createEmptyRepository(tree);
        state.ResumeTiming();
        runSilently(tree.onDisk(), {"git", "add", "."});
    }
    removeRepository(tree);
}

std::vector<Path> freshFiles(benchmark::State const& state, std::string const& name) {
    std::vector<Path> result;
    for (benchmark::IterationCount number = 0; number < state.max_iterations; ++number) {
        result.push_back(GeneratedTree::large().createFile(name + std::to_string(number)));
    }
    return result;
}

void removeFiles(management::ProjectManager& project, std::vector<Path> const& files) {
    project.getFileManager().remove(files);
    for (auto const& file : files) {
        std::filesystem::remove(fl::filesystem::toSystem(file));
    }
}

/// Adds one file in a repository that tracks all files and the project's text.
void addOneInSession(benchmark::State& state, SourceControl sourceControl) {
    auto const& tree = GeneratedTree::large();
    tree.fillProject();
    createEmptyRepository(tree);
    runSilently(tree.onDisk(), {"git", "add", "."});
    Options options;
    options.sourceControl = sourceControl;
    auto session = Session::open(tree.root(), options);
    auto const files = freshFiles(state, "layers");
    session.project().setName(u"benchmark");
    std::size_t next = 0;
    for (auto _ : state) {
        session.project().getFileManager().add({files[next++]});
    }
    removeFiles(session.project(), files);
    removeRepository(tree);
}

/// The same with `git add`: the file, and a changed text of the same size as the project's text.
void addOneByGit(benchmark::State& state) {
    auto const& tree = GeneratedTree::large();
    tree.fillProject();
    createEmptyRepository(tree);
    runSilently(tree.onDisk(), {"git", "add", "."});
    auto const files = freshFiles(state, "git");
    auto const text = tree.onDisk() / ".projectdata" / "project.jsonl";
    std::size_t next = 0;
    for (auto _ : state) {
        state.PauseTiming();
        std::ofstream(text, std::ios::app) << next;
        state.ResumeTiming();
        runSilently(tree.onDisk(),
                    {"git", "add", fl::filesystem::toSystem(files[next++]).string(), text.string()});
    }
    for (auto const& file : files) {
        std::filesystem::remove(fl::filesystem::toSystem(file));
    }
    removeRepository(tree);
    tree.removeProject();
}

void addOneBare(benchmark::State& state) {
    auto const& tree = GeneratedTree::large();
    tree.fillProject();
    auto const project = tree.openProject();
    auto const files = freshFiles(state, "bare");
    project->setName(u"benchmark");
    std::size_t next = 0;
    for (auto _ : state) {
        project->getFileManager().add({files[next++]});
    }
    removeFiles(*project, files);
}

[[maybe_unused]] bool const registered = [] {
    auto const once = [](benchmark::internal::Benchmark* made) {
        made->Iterations(1)->UseRealTime()->Unit(benchmark::kMillisecond);
    };
    auto const often = [](benchmark::internal::Benchmark* made) {
        made->Iterations(20)->UseRealTime()->Unit(benchmark::kMillisecond);
    };
    once(benchmark::RegisterBenchmark("layers/add-all/session", addAllInSession));
    once(benchmark::RegisterBenchmark("layers/add-all/bare", addAllBare));
    once(benchmark::RegisterBenchmark("layers/add-all/git-add", addAllByGit));
    often(benchmark::RegisterBenchmark("layers/add-one/session", addOneInSession, SourceControl::EachChange));
    often(benchmark::RegisterBenchmark("layers/add-one/text-when-asked", addOneInSession,
                                       SourceControl::WhenAsked));
    often(benchmark::RegisterBenchmark("layers/add-one/off", addOneInSession, SourceControl::Off));
    often(benchmark::RegisterBenchmark("layers/add-one/bare", addOneBare));
    often(benchmark::RegisterBenchmark("layers/add-one/git-add", addOneByGit));
    return true;
}();

} // namespace
} // namespace project::benchmarks
