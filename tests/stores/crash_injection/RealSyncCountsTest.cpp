#include <ostream>

#include "SystemCalls.hpp"
#include "SystemOperations.hpp"
#include "support/Waiting.hpp"

namespace project::test {

namespace {

/// How often each operation waits for the disk.
struct Syncs {
    std::size_t files;   ///< fdatasync
    std::size_t folders; ///< fsync

    friend bool operator==(Syncs const&, Syncs const&) = default;

    friend void PrintTo(Syncs const& syncs, std::ostream* out) {
        *out << syncs.files << " of files and " << syncs.folders << " of folders";
    }
};

Syncs syncsOf(SystemOperation const& operation) {
    auto const project = projectFor(operation);
    SystemCalls calls;
    calls.syncs = true;
    operation.perform(*project);
    return {calls.counts["fdatasync"], calls.counts["fsync"]};
}

TEST(RealSyncCounts, eachOperationMakesExactlyTheNecessarySyncs) {
    std::map<std::string, Syncs> const expected{
        {"append", {1, 0}},
        {"rewrite", {1, 1}},
        {"create", {4, 3}},  // the root for the folder, the folder for the new store, and for the first batch
        {"recover", {1, 2}}, // the folder before a dead writer's files are deleted
        {"rewrite another owner's text", {1, 1}},
        {"append after others", {1, 0}},
        {"check for changes after others", {0, 0}},
        {"close", {1, 1}},
        {"discard", {0, 0}},
        {"discard creation", {3, 2}},
        {"tidy", {1, 1}},
        {"repair", {2, 2}}, // the damaged lines first
        {"resolve", {1, 1}},
        {"check for changes", {0, 0}},
        {"check", {0, 0}},
    };
    for (auto const& operation : systemOperations()) {
        ASSERT_TRUE(expected.contains(operation.name));
        EXPECT_EQ(expected.at(operation.name), syncsOf(operation)) << operation.name;
    }
}

TEST(RealSyncCounts, aSecondCheckForChangesMakesOneSystemCall) {
    auto const project = projectFor(rewritingOperation()); // which has read
    contentOf(*project->backend);                          // again, because the text was younger than a tick
    auto const text = project->root.onDisk() / ".projectdata/project.jsonl";
    ASSERT_TRUE(comesTrue([&] { return isOlderThan(std::chrono::milliseconds(20), text.c_str()); }));
    contentOf(*project->backend);
    SystemCalls const calls;

    Entered const entered(*project->backend);

    EXPECT_EQ((std::map<std::string, std::size_t, std::less<>>{{"fstatat", 1}}), calls.counts);
}

} // namespace

} // namespace project::test
