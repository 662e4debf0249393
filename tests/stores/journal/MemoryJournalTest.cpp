#include <thread>

#include "support/JournalStore.hpp"

namespace project::test {

namespace {

using stores::Journal;
using stores::NewJournalEntry;

/// The journal of the other tests itself: it must fail in the ways that they assume.
class MemoryJournalTest : public JournalStore {
protected:
    static NewJournalEntry body(std::uint64_t version, std::string id, std::string_view after) {
        return {.position = {version, std::move(id), "sum" + std::to_string(version)},
                .isBody = true,
                .after = after,
                .lines = {},
                .body = "body"};
    }

    MemoryJournal journal_{server};
    MemoryJournal other_{server, "other"};
};

TEST_F(MemoryJournalTest, anEntryIsStoredOnceHoweverOftenItIsSent) {
    EXPECT_EQ(journal_.append(body(1, "one", "")), Journal::Appended::Stored);
    EXPECT_EQ(journal_.append(body(1, "one", "")), Journal::Appended::Stored);
    EXPECT_EQ(server->entries().size(), 1U);
    EXPECT_EQ(journal_.body(server->entry(1).read.position), "body");
}

TEST_F(MemoryJournalTest, anEntryThatDoesNotFollowTheNewestIsSuperseded) {
    journal_.append(body(1, "one", ""));
    EXPECT_EQ(journal_.append(body(1, "two", "")), Journal::Appended::Superseded);
    EXPECT_EQ(journal_.append(body(2, "two", "other")), Journal::Appended::Superseded);
    EXPECT_EQ(journal_.append(body(3, "two", "sum1")), Journal::Appended::Superseded);
    EXPECT_EQ(journal_.append(body(2, "two", "sum1")), Journal::Appended::Stored);
}

TEST_F(MemoryJournalTest, aLookBeginsWithTheEntryThatWasSeenOrWithTheNewestBody) {
    journal_.append(body(1, "one", ""));
    journal_.append(body(2, "two", "sum1"));
    EXPECT_EQ(journal_.look(1).entries.size(), 2U);
    EXPECT_EQ(journal_.look(3).entries.size(), 0U);
    auto const newest = journal_.look(std::nullopt);
    EXPECT_EQ(newest.entries.size(), 1U);
    EXPECT_EQ(newest.body, "body");
}

TEST_F(MemoryJournalTest, theLockExcludesOthersUntilItIsReleasedOrTheConnectionIsLost) {
    using std::chrono::milliseconds;
    journal_.lock(milliseconds(0), std::nullopt);
    journal_.lock(milliseconds(0), std::nullopt);
    EXPECT_EQ(errorOf([&] { other_.lock(milliseconds(1), std::nullopt); }).kind(), StoreError::Kind::Busy);
    journal_.unlock();
    other_.lock(milliseconds(0), std::nullopt);
    server->dropConnections();
    journal_.lock(milliseconds(0), std::nullopt);
}

TEST_F(MemoryJournalTest, aClientThatDiedReleasesItsLockAndDoesNothingMore) {
    journal_.lock(std::chrono::milliseconds(0), std::nullopt);
    server->plan(Fault::DiesBefore, 0);
    EXPECT_THROW(journal_.append(body(1, "one", "")), ProcessDied);
    server->cancelPlan();
    EXPECT_THROW(journal_.look(std::nullopt), ProcessDied);
    other_.lock(std::chrono::milliseconds(0), std::nullopt);
    EXPECT_TRUE(server->entries().empty());
}

TEST_F(MemoryJournalTest, anAppendOfAnotherClientWakesAWaitingOneAndSoDoesWake) {
    using std::chrono::milliseconds;
    EXPECT_FALSE(journal_.awaitChange(milliseconds(1)));
    other_.append(body(1, "one", ""));
    EXPECT_TRUE(journal_.awaitChange(milliseconds(0)));
    EXPECT_FALSE(journal_.awaitChange(milliseconds(1)));
    std::thread waker([&] { journal_.wake(); });
    EXPECT_TRUE(journal_.awaitChange(std::chrono::minutes(1)));
    waker.join();
}

} // namespace

} // namespace project::test
