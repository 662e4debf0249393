#include <benchmark/benchmark.h>

#include <map>

#include "GeneratedTree.hpp"
#include "project/core/FileManager.hpp"
#include "project/metadata/MetadataNodeSpecification.hpp"

// The store alone: one durable setNodes of all files and folders.

namespace project::benchmarks {
namespace {

using metadata::MetadataNode;
using metadata::MetadataPath;
using Nodes = std::map<MetadataPath, std::shared_ptr<MetadataNode>>;

/// Everything below an address, with its nodes.
void collect(metadata::MetadataManager& store, MetadataPath const& from, Nodes& nodes) {
    for (auto const& child : store.getChildNodes(from)) {
        if (auto node = store.getNode(child)) {
            nodes.emplace_hint(nodes.end(), child, std::move(node));
        }
        collect(store, child, nodes);
    }
}

void setAllNodes(benchmark::State& state) {
    auto const& tree = GeneratedTree::large();
    tree.fillProject();
    Nodes nodes;
    {
        auto const store = tree.openStore();
        auto const guard = store->acquireReadLock();
        collect(*store, MetadataPath::root(), nodes);
    }
    for (auto _ : state) {
        state.PauseTiming();
        tree.removeProject();
        auto const store = tree.openStore();
        state.ResumeTiming();
        store->setNodes(nodes);
    }
}

[[maybe_unused]] bool const registered = [] {
    benchmark::RegisterBenchmark("store/set-nodes", setAllNodes)
        ->Iterations(1)
        ->UseRealTime()
        ->Unit(benchmark::kMillisecond);
    return true;
}();

} // namespace
} // namespace project::benchmarks
