#include <benchmark/benchmark.h>

#include "GeneratedTree.hpp"
#include "Process.hpp"
#include "project/core/EntryPointManager.hpp"
#include "project/core/FileManager.hpp"
#include "project/core/LabelManager.hpp"
#include "project/entrypoints/EntryPoint.hpp"
#include "project/files/FileLabel.hpp"

// Queries on 100,000 files in 5,000 folders, of which one in ten has a label, each by a new process, against
// a plain list of the same project.

namespace project::benchmarks {
namespace {

/// The project with a label on one in ten files and one entry point. The destructor deletes the category.
class LabelledTree {
public:
    LabelledTree() {
        tree_.fillProject();
        auto const project = tree_.openProject();
        management::Label const done(status_, management::LabelDefinition(u"Done"));
        project->getLabelManager().createCategory(status_);
        project->getLabelManager().createLabel(status_, done.getLabelIdentifier());
        std::vector<fl::filesystem::Path> labelled;
        constexpr std::size_t step = 10;
        for (std::size_t index = 0; index < tree_.files().size(); index += step) {
            labelled.push_back(tree_.files()[index]);
        }
        project->getFileManager().addLabels(labelled, {done});
        management::EntryPointDefinition entry(labelled.front());
        project->getEntryPointManager().setEntryPoint(entry);
    }

    ~LabelledTree() {
        auto const project = tree_.openProject();
        project->getEntryPointManager().removeEntryPoint(tree_.files().front());
        project->getLabelManager().deleteCategory(status_);
    }

    LabelledTree(LabelledTree const&) = delete;
    LabelledTree& operator=(LabelledTree const&) = delete;

    std::filesystem::path const& onDisk() const { return tree_.onDisk(); }

private:
    GeneratedTree const& tree_ = GeneratedTree::large();
    management::CategoryDefinition status_{u"Status"};
};

void find(benchmark::State& state, std::vector<std::string> const& conditions) {
    LabelledTree const tree;
    std::vector<std::string> command{PROJECTCTL, "list"};
    command.insert(command.end(), conditions.begin(), conditions.end());
    for (auto _ : state) {
        runSilently(tree.onDisk(), command);
    }
}

void listAll(benchmark::State& state) {
    find(state, {});
}

void findByName(benchmark::State& state) {
    find(state, {"--glob", "**/*1*"});
}

void findByLabel(benchmark::State& state) {
    find(state, {"--label", "Status=Done"});
}

void findByAllConditions(benchmark::State& state) {
    find(state, {"--label", "Status=Done", "--no-label", "Status=Done", "--kind", "file", "--glob", "**/*1*",
                 "--entry-points", "--unlabelled"});
}

[[maybe_unused]] bool const registered = [] {
    auto const repeat = [](benchmark::internal::Benchmark* made) {
        made->Iterations(10)->UseRealTime()->Unit(benchmark::kMillisecond);
    };
    repeat(benchmark::RegisterBenchmark("find/list", listAll));
    repeat(benchmark::RegisterBenchmark("find/glob", findByName));
    repeat(benchmark::RegisterBenchmark("find/label", findByLabel));
    repeat(benchmark::RegisterBenchmark("find/all-conditions", findByAllConditions));
    return true;
}();

} // namespace
} // namespace project::benchmarks
