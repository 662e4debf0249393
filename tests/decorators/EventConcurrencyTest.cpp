#include <atomic>
#include <chrono>
#include <future>
#include <thread>

#include <gmock/gmock.h>

#include "project/management.hpp"
#include "project/stores/MemoryBackend.hpp"
#include "project/stores/TreeMetadataManager.hpp"

// Events and several threads: the guarantees for slots, and the operations that may run at the same time.

namespace project::management {
namespace {

using namespace std::chrono_literals;
using testing::Each;

/// A limit that only a deadlock reaches.
constexpr auto patience = 30s;

class EventConcurrencyTest : public testing::Test {
protected:
    std::shared_ptr<stores::TreeMetadataManager> store = std::make_shared<stores::TreeMetadataManager>(
        std::make_unique<stores::MemoryBackend>(), u"/project/.projectdata");
    std::shared_ptr<DispatchableProjectEventBroadcaster> broadcaster =
        std::make_shared<DispatchableProjectEventBroadcaster>();
    EventBroadcastingProjectManager project{std::make_unique<ProjectManagerBase>(u"/project", store),
                                            broadcaster};
    std::future<void> other; // outlives the slots that start it
};

TEST_F(EventConcurrencyTest, anotherThreadCanWriteWhileASlotRuns) {
    auto outcome = std::future_status::deferred;
    broadcaster->onNameChanged([&] {
        other = std::async(std::launch::async, [&] { project.setDescription(u"Two strokes"); });
        outcome = other.wait_for(patience);
    });
    project.setName(u"Engine");
    EXPECT_EQ(outcome, std::future_status::ready);
    EXPECT_EQ(project.getDescription(), u"Two strokes");
}

TEST_F(EventConcurrencyTest, anotherThreadCanTakeTheStoresLockWhileASlotOfAnyManagerRuns) {
    std::vector<std::future_status> outcomes;
    auto const takeTheLock = [&](auto const&...) {
        other = std::async(std::launch::async, [&] { auto const guard = store->acquireWriteLock(); });
        outcomes.push_back(other.wait_for(patience));
    };
    broadcaster->onFileListUpdate(takeTheLock);
    broadcaster->onFileLabelsChanged(takeTheLock);
    broadcaster->onCategoryAdded(takeTheLock);
    broadcaster->onEntryPointsChanged(takeTheLock);
    broadcaster->onPathChanged(takeTheLock);
    project.getFileManager().add({});
    project.getFileManager().remove({});
    project.getFileManager().addLabels({}, {});
    project.getLabelManager().createCategory(CategoryDefinition(u"Kind"));
    project.getEntryPointManager().createEntryPointGroup(EntryPointGroupDefinition(u"Tools"));
    project.getProjectPathManager().getFolderReferenceManager().addReferences({});
    EXPECT_EQ(outcomes.size(), 6U);
    EXPECT_THAT(outcomes, Each(std::future_status::ready));
}

TEST_F(EventConcurrencyTest, anotherThreadCanConnectAndDispatchWhileASlotRuns) {
    std::atomic<bool> isNested = false;
    auto outcome = std::future_status::deferred;
    broadcaster->onNameChanged([&] {
        if (isNested.exchange(true)) {
            return;
        }
        other = std::async(std::launch::async, [&] {
            broadcaster->onNameChanged([] {}).disconnect();
            broadcaster->dispatchNameChanged();
        });
        outcome = other.wait_for(patience);
    });
    broadcaster->dispatchNameChanged();
    EXPECT_EQ(outcome, std::future_status::ready);
}

TEST_F(EventConcurrencyTest, threadsConnectDispatchAndDisconnectAtTheSameTime) {
    constexpr int threads = 4;
    constexpr int rounds = 200;
    std::atomic<int> heard = 0;
    broadcaster->onNameChanged([&] { ++heard; });
    std::vector<std::thread> running;
    running.reserve(threads);
    for (int thread = 0; thread < threads; ++thread) {
        running.emplace_back([&] {
            for (int round = 0; round < rounds; ++round) {
                // Shared, since another thread may be about to call the slot when it is disconnected.
                auto const own = std::make_shared<std::atomic<int>>(0);
                auto const connection = broadcaster->onNameChanged([own, at = std::this_thread::get_id()] {
                    *own += at == std::this_thread::get_id() ? 1 : 0;
                });
                broadcaster->dispatchNameChanged();
                connection.disconnect();
                EXPECT_EQ(*own, 1);
            }
        });
    }
    for (auto& thread : running) {
        thread.join();
    }
    EXPECT_EQ(heard, threads * rounds);
}

TEST_F(EventConcurrencyTest, everyChangeOfEveryThreadRaisesOneEvent) {
    constexpr int threads = 4;
    constexpr int rounds = 50;
    std::atomic<int> heard = 0;
    broadcaster->onNameChanged([&] {
        ++heard;
        EXPECT_FALSE(project.getName().empty());
    });
    std::vector<std::thread> running;
    running.reserve(threads);
    for (int thread = 0; thread < threads; ++thread) {
        running.emplace_back([&] {
            for (int round = 0; round < rounds; ++round) {
                project.setName(u"Engine");
            }
        });
    }
    for (auto& thread : running) {
        thread.join();
    }
    EXPECT_EQ(heard, threads * rounds);
}

} // namespace
} // namespace project::management
