#include <ostream>
#include <thread>

#include "SystemCalls.hpp"
#include "SystemDeeds.hpp"

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

Syncs syncsOf(SystemDeed const& deed) {
    auto const project = projectFor(deed);
    SystemCalls calls;
    calls.syncs = true;
    deed.perform(*project);
    return {calls.counts["fdatasync"], calls.counts["fsync"]};
}

TEST(RealSyncCounts, eachOperationSyncsAsOftenAsItMustAndNotMore) {
    std::map<std::string, Syncs> const expected{
        {"append", {1, 0}},
        {"rewrite", {1, 1}},
        {"create", {4, 3}},  // the root for the folder, the folder for the new store, and for the first batch
        {"recover", {1, 2}}, // the folder before a dead writer's files go
        {"rewrite somebody else's text", {1, 1}},
        {"append after others", {1, 0}},
        {"look after others", {0, 0}},
        {"close", {1, 1}},
        {"discard", {0, 0}},
        {"discard creation", {3, 2}},
        {"tidy", {1, 1}},
        {"repair", {2, 2}}, // the damaged lines first
        {"settle", {1, 1}},
        {"look", {0, 0}},
        {"check", {0, 0}},
    };
    for (auto const& deed : systemDeeds()) {
        ASSERT_TRUE(expected.contains(deed.name));
        EXPECT_EQ(expected.at(deed.name), syncsOf(deed)) << deed.name;
    }
}

TEST(RealSyncCounts, aSecondLookAsksTheSystemOnceAndOpensNothing) {
    auto const project = projectFor(rewritingDeed()); // which has read
    contentOf(*project->backend);                     // and once more while the text was young
    std::this_thread::sleep_for(std::chrono::milliseconds(50));
    contentOf(*project->backend);
    SystemCalls const calls;

    Entered const entered(*project->backend);

    EXPECT_EQ((std::map<std::string, std::size_t, std::less<>>{{"fstatat", 1}}), calls.counts);
}

} // namespace

} // namespace project::test
