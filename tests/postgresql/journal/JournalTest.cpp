#include <csignal>
#include <future>
#include <string>
#include <thread>

#include <gmock/gmock.h>

#include "postgresql/SharedProjectFixture.hpp"
#include "support/ChildProcess.hpp"
#include "support/Waiting.hpp"

namespace project::postgresql {

namespace {

using std::chrono::seconds;
using ::testing::HasSubstr;
using ::testing::IsEmpty;

class PostgresJournalTest : public SharedProjectTest {
protected:
    void SetUp() override {
        SharedProjectTest::SetUp();
        if (!IsSkipped()) {
            ben = open("ben");
        }
    }

    std::unique_ptr<PostgresJournal> ben;
};

} // namespace

TEST_F(PostgresJournalTest, aNewProjectHasNoEntries) {
    EXPECT_THAT(anna->look(std::nullopt).entries, IsEmpty());
    EXPECT_EQ(anna->look(std::nullopt).body, std::nullopt);
    EXPECT_THAT(anna->look(7).entries, IsEmpty());
}

TEST_F(PostgresJournalTest, theFirstBodyIsReadWithItsBytes) {
    auto const first = body(1, "the text\n");
    ASSERT_EQ(append(*anna, *first), Journal::Appended::Stored);
    auto const look = ben->look(std::nullopt);
    ASSERT_EQ(look.entries.size(), 1);
    EXPECT_EQ(look.entries[0].position, first->entry.position);
    EXPECT_TRUE(look.entries[0].isBody);
    EXPECT_EQ(look.entries[0].after, "");
    EXPECT_EQ(look.entries[0].lines, "");
    EXPECT_EQ(look.body, "the text\n");
}

TEST_F(PostgresJournalTest, aLookSinceAVersionBeginsWithItsIdentityAndHasTheLinesOfLaterEntries) {
    append(*anna, *body(1, "text\n"));
    auto const second = batch(2, "one\n");
    auto const third = batch(3, std::string("two\0\xff\n", 6));
    append(*anna, *second);
    append(*anna, *third);
    auto const look = ben->look(2);
    ASSERT_EQ(look.entries.size(), 2);
    EXPECT_EQ(look.entries[0].position, second->entry.position);
    EXPECT_EQ(look.entries[0].lines, "");
    EXPECT_EQ(look.entries[1].position, third->entry.position);
    EXPECT_FALSE(look.entries[1].isBody);
    EXPECT_EQ(look.entries[1].after, sumOf(2));
    EXPECT_EQ(look.entries[1].lines, third->lines);
    EXPECT_EQ(look.body, std::nullopt);
}

TEST_F(PostgresJournalTest, aLookWithoutAVersionBeginsWithTheNewestBody) {
    append(*anna, *body(1, "old\n"));
    append(*anna, *batch(2));
    auto const newest = body(3, "new\n", "the batch\n");
    append(*anna, *newest);
    append(*anna, *batch(4));
    auto const look = ben->look(std::nullopt);
    ASSERT_EQ(look.entries.size(), 2);
    EXPECT_EQ(look.entries[0].position, newest->entry.position);
    EXPECT_EQ(look.entries[0].lines, "the batch\n");
    EXPECT_EQ(look.entries[1].position.version, 4);
    EXPECT_EQ(look.body, "new\n");
}

TEST_F(PostgresJournalTest, aLookSinceAVersionThatDoesNotExistDoesNotShowIt) {
    append(*anna, *body(1, "text\n"));
    EXPECT_THAT(anna->look(2).entries, IsEmpty());
    append(*anna, *batch(2));
    append(*anna, *body(3, "text\n"));
    sharedServer().query("DELETE FROM pm.entry WHERE version < 3 AND project = '" + project.id + "'");
    ASSERT_EQ(anna->look(1).entries.size(), 1);
    EXPECT_EQ(anna->look(1).entries[0].position.version, 3);
}

TEST_F(PostgresJournalTest, anEntryAfterAnotherStateIsSuperseded) {
    append(*anna, *body(1, "text\n"));
    ASSERT_EQ(append(*ben, *batch(2)), Journal::Appended::Stored);
    EXPECT_EQ(append(*anna, *batch(2)), Journal::Appended::Superseded);
    auto wrongSum = batch(3);
    wrongSum->entry.after = wrongSum->after = sumOf(9);
    EXPECT_EQ(append(*anna, *wrongSum), Journal::Appended::Superseded);
    EXPECT_EQ(append(*anna, *batch(5)), Journal::Appended::Superseded);
    EXPECT_EQ(append(*anna, *body(1, "text\n")), Journal::Appended::Superseded);
    EXPECT_EQ(anna->look(1).entries.size(), 2);
}

TEST_F(PostgresJournalTest, theFirstEntryIsSupersededIfOnlyLaterOnesAreLeft) {
    append(*anna, *body(1, "text\n"));
    append(*anna, *body(2, "text\n"));
    sharedServer().query("DELETE FROM pm.entry WHERE version = 1 AND project = '" + project.id + "'");
    EXPECT_EQ(append(*anna, *body(1, "text\n")), Journal::Appended::Superseded);
}

TEST_F(PostgresJournalTest, anEntryThatIsSentAgainIsStoredOnce) {
    append(*anna, *body(1, "text\n"));
    auto const second = batch(2);
    EXPECT_EQ(append(*anna, *second), Journal::Appended::Stored);
    EXPECT_EQ(append(*anna, *second), Journal::Appended::Stored);
    EXPECT_EQ(anna->look(1).entries.size(), 2);
    EXPECT_EQ(sharedServer().query("SELECT n FROM pm.barrier WHERE project = '" + project.id + "'"), "1");
}

TEST_F(PostgresJournalTest, aBodyOfSeveralPiecesIsTheSameAfterwards) {
    std::string text;
    for (int i = 0; text.size() < 3'500'000; ++i) {
        text += "\"source/file" + std::to_string(i * 7919) + ".cpp\"\n";
    }
    auto const large = body(1, text);
    ASSERT_EQ(append(*anna, *large), Journal::Appended::Stored);
    EXPECT_EQ(sharedServer().query("SELECT count(*) FROM pm.piece WHERE project = '" + project.id + "'"),
              "4");
    EXPECT_TRUE(ben->look(std::nullopt).body == text);
    EXPECT_TRUE(ben->body(large->entry.position) == text);
}

TEST_F(PostgresJournalTest, aSupersededBodyLeavesNoPieces) {
    append(*anna, *body(1, "text\n"));
    append(*anna, *batch(2));
    EXPECT_EQ(append(*anna, *body(2, "other\n")), Journal::Appended::Superseded);
    EXPECT_EQ(sharedServer().query("SELECT count(*) FROM pm.piece WHERE project = '" + project.id + "'"),
              "1");
}

TEST_F(PostgresJournalTest, aBodyWithoutAPieceIsDamaged) {
    auto const first = body(1, std::string(2'500'000, 'x'));
    append(*anna, *first);
    for (auto const* number : {"3", "1"}) {
        sharedServer().query("DELETE FROM pm.piece WHERE number = " + std::string(number) +
                             " AND project = '" + project.id + "'");
        EXPECT_EQ(ben->look(std::nullopt).body, std::nullopt);
        auto const error = errorOf([&] { ben->body(first->entry.position); });
        EXPECT_EQ(error.kind(), StoreError::Kind::Damaged);
        EXPECT_THAT(error.what(), HasSubstr("the body of version 1 is unreadable or incomplete"));
    }
}

TEST_F(PostgresJournalTest, aBodyThatWasDeletedIsReported) {
    append(*anna, *body(1, "text\n"));
    auto const error = errorOf([&] { anna->body({1, newId(), sumOf(1)}); });
    EXPECT_EQ(error.kind(), StoreError::Kind::Damaged);
    EXPECT_THAT(error.what(), HasSubstr("the body of version 1 is not on the server"));
}

TEST_F(PostgresJournalTest, theLockShowsTheStateUnderTheLock) {
    append(*anna, *body(1, "text\n"));
    ben->lock(seconds(5), 1);
    auto waiting = std::async(std::launch::async, [&] { return anna->lock(seconds(20), 1); });
    std::this_thread::sleep_for(milliseconds(100));
    ben->append(batch(2)->entry);
    ben->unlock();
    auto const look = waiting.get();
    ASSERT_EQ(look.entries.size(), 2);
    EXPECT_EQ(look.entries[1].position.version, 2);
    anna->unlock();
}

TEST_F(PostgresJournalTest, theErrorAfterAWaitForTheLockNamesItsHolder) {
    ben->lock(seconds(5), std::nullopt);
    auto const error = errorOf([&] { anna->lock(milliseconds(50), std::nullopt); });
    EXPECT_EQ(error.kind(), StoreError::Kind::Busy);
    EXPECT_THAT(error.what(), HasSubstr("the lock is held by ben"));
    EXPECT_THAT(error.what(), HasSubstr("server process"));
    ben->unlock();
    anna->lock(seconds(5), std::nullopt);
    anna->unlock();
}

TEST_F(PostgresJournalTest, aLockOfAnotherProjectDoesNotExclude) {
    auto const other = createProject(sharedServer());
    PostgresJournal inOther(settingsFor(sharedServer().connection("ben")), other.id);
    inOther.lock(seconds(5), std::nullopt);
    anna->lock(milliseconds(100), std::nullopt);
}

TEST_F(PostgresJournalTest, writersGetTheLockInTheOrderInWhichTheyAsked) {
    anna->lock(seconds(5), std::nullopt);
    std::mutex mutex;
    std::vector<int> order;
    std::vector<std::thread> threads;
    for (int i = 0; i < 4; ++i) {
        threads.emplace_back([&, i] {
            auto const journal = open("ben");
            journal->lock(seconds(30), std::nullopt);
            {
                std::lock_guard const guard(mutex);
                order.push_back(i);
            }
            journal->unlock();
        });
        auto const waiting = std::to_string(i + 1);
        ASSERT_TRUE(test::comesTrue([&] {
            return sharedServer().query(
                       "SELECT count(*) FROM pg_locks WHERE locktype = 'advisory' AND NOT granted") ==
                   waiting;
        }));
    }
    anna->unlock();
    for (auto& thread : threads) {
        thread.join();
    }
    EXPECT_EQ(order, (std::vector<int>{0, 1, 2, 3}));
}

TEST_F(PostgresJournalTest, theServerEndsALockHolderThatIsIdleForTooLong) {
    auto settings = settingsFor(sharedServer().connection("ben"));
    settings.idleLockLimit = milliseconds(200);
    PostgresJournal stopped(settings, project.id);
    stopped.lock(seconds(5), std::nullopt);
    anna->lock(seconds(10), std::nullopt);
    append(*anna, *body(1, "text\n"));
    // The holder that goes on takes the lock again, and its entry is refused, because the state has changed.
    EXPECT_EQ(stopped.append(body(1, "other\n")->entry), Journal::Appended::Superseded);
}

TEST_F(PostgresJournalTest, aProcessThatIsStoppedWithTheLockLosesItAndStoresNothing) {
    auto settings = settingsFor(sharedServer().connection("ben"));
    settings.idleLockLimit = milliseconds(200);
    test::ChildProcess holder([&](test::ChildProcess::Parent const& parent) {
        PostgresJournal journal(settings, project.id);
        journal.lock(seconds(5), std::nullopt);
        parent.say("locked");
        parent.await();
        bool const isStored = journal.append(body(1, "other\n")->entry) == Journal::Appended::Stored;
        parent.say(isStored ? "stored" : "superseded");
    });
    ASSERT_EQ(holder.hear(), "locked");
    ASSERT_EQ(::kill(holder.id(), SIGSTOP), 0);
    ASSERT_EQ(append(*anna, *body(1, "text\n")), Journal::Appended::Stored);
    ASSERT_EQ(::kill(holder.id(), SIGCONT), 0);
    holder.goOn();
    EXPECT_EQ(holder.hear(), "superseded");
    EXPECT_EQ(anna->look(std::nullopt).body, "text\n");
}

TEST_F(PostgresJournalTest, anAppendRequiresTheLock) {
    EXPECT_EQ(errorOf([&] { anna->append(body(1, "text\n")->entry); }).kind(), StoreError::Kind::Refused);
    anna->lock(seconds(5), std::nullopt);
    anna->unlock();
    EXPECT_EQ(errorOf([&] { anna->append(body(1, "text\n")->entry); }).kind(), StoreError::Kind::Refused);
}

TEST_F(PostgresJournalTest, aSessionThatTheServerEndedIsEstablishedAgain) {
    append(*anna, *body(1, "text\n"));
    auto const end = [] {
        sharedServer().query("SELECT pg_terminate_backend(pid) FROM pg_stat_activity WHERE usename = 'anna'");
    };
    end();
    EXPECT_EQ(anna->look(1).entries.size(), 1);
    anna->lock(seconds(5), 1);
    end();
    EXPECT_EQ(anna->append(batch(2)->entry), Journal::Appended::Stored);
    // The lock was taken again.
    EXPECT_EQ(errorOf([&] { ben->lock(milliseconds(50), std::nullopt); }).kind(), StoreError::Kind::Busy);
    anna->unlock();
    ben->lock(seconds(5), std::nullopt);
}

TEST_F(PostgresJournalTest, anEntryByAnotherClientWakesAWaitingOne) {
    EXPECT_TRUE(anna->awaitChange(milliseconds(0))) << "it returns when it has begun to listen";
    EXPECT_FALSE(anna->awaitChange(milliseconds(50)));
    auto woken = std::async(std::launch::async, [&] { return anna->awaitChange(seconds(30)); });
    append(*ben, *body(1, "text\n"));
    EXPECT_TRUE(woken.get());
}

TEST_F(PostgresJournalTest, anEntryOfItsOwnDoesNotWakeAClient) {
    anna->awaitChange(milliseconds(0));
    append(*anna, *body(1, "text\n"));
    anna->look(1); // the notification was sent
    EXPECT_FALSE(anna->awaitChange(milliseconds(100)));
}

TEST_F(PostgresJournalTest, aLostConnectionEndsAWait) {
    anna->awaitChange(milliseconds(0));
    auto woken = std::async(std::launch::async, [&] { return anna->awaitChange(seconds(30)); });
    sharedServer().query("SELECT pg_terminate_backend(pid) FROM pg_stat_activity WHERE usename = 'anna'");
    EXPECT_TRUE(woken.get());
    EXPECT_TRUE(anna->awaitChange(milliseconds(0))) << "it listens again";
    append(*ben, *body(1, "text\n"));
    EXPECT_TRUE(anna->awaitChange(seconds(30)));
}

TEST_F(PostgresJournalTest, anotherThreadWakesAWaitingClient) {
    anna->awaitChange(milliseconds(0));
    auto woken = std::async(std::launch::async, [&] { return anna->awaitChange(seconds(30)); });
    anna->wake();
    EXPECT_TRUE(woken.get());
    anna->wake();
    EXPECT_TRUE(anna->awaitChange(seconds(30))) << "the next wait returns, too";
    EXPECT_FALSE(anna->awaitChange(milliseconds(20)));
}

TEST_F(PostgresJournalTest, recordsSayWhoWroteWhatAndWhen) {
    auto const before = std::chrono::system_clock::now() - seconds(5);
    append(*anna, *body(1, "text\n"));
    append(*ben, *batch(2));
    append(*anna, *batch(3));
    auto const newest = anna->records(std::nullopt, 2);
    ASSERT_EQ(newest.size(), 2);
    EXPECT_EQ(newest[0].position.version, 3);
    EXPECT_EQ(newest[0].author, "anna");
    EXPECT_EQ(newest[1].author, "ben");
    EXPECT_FALSE(newest[1].isBody);
    EXPECT_FALSE(newest[1].host.empty());
    EXPECT_GT(newest[1].time, before);
    EXPECT_LT(newest[1].time, before + std::chrono::minutes(2));
    auto const older = anna->records(2, 10);
    ASSERT_EQ(older.size(), 1);
    EXPECT_EQ(older[0].position.sum, sumOf(1));
    EXPECT_TRUE(older[0].isBody);
}

TEST_F(PostgresJournalTest, theOwnerDeletesEntriesBeforeABody) {
    append(*anna, *body(1, "first\n"));
    append(*anna, *batch(2));
    auto const second = body(3, "second\n");
    append(*anna, *second);
    append(*anna, *batch(4));
    auto const owner = open("owner");
    owner->lock(seconds(5), std::nullopt);
    EXPECT_EQ(owner->deleteBefore(4), 0) << "not a body";
    EXPECT_EQ(owner->deleteBefore(3), 2);
    owner->unlock();
    EXPECT_EQ(anna->look(std::nullopt).entries.size(), 2);
    EXPECT_EQ(anna->body(second->entry.position), "second\n");
    EXPECT_EQ(sharedServer().query("SELECT count(*) FROM pm.piece WHERE project = '" + project.id + "'"),
              "1");
}

TEST_F(PostgresJournalTest, itsNameContainsNoSecret) {
    EXPECT_THAT(anna->name(), HasSubstr(project.id));
    EXPECT_THAT(anna->name(), HasSubstr("projects 127.0.0.1"));
    EXPECT_THAT(anna->name(), ::testing::Not(HasSubstr("secret")));
}

TEST_F(PostgresJournalTest, twoClientsThatWriteInTurnsStoreEachEntryOnce) {
    append(*anna, *body(1, "text\n"));
    auto const write = [&](PostgresJournal& journal) {
        for (int i = 0; i < 50; ++i) {
            auto const look = journal.lock(seconds(30), std::nullopt);
            auto const newest = look.entries.back().position.version;
            EXPECT_EQ(journal.append(batch(newest + 1)->entry), Journal::Appended::Stored);
            journal.unlock();
        }
    };
    auto other = std::async(std::launch::async, [&] { write(*ben); });
    write(*anna);
    other.get();
    EXPECT_EQ(anna->look(std::nullopt).entries.back().position.version, 101);
}

} // namespace project::postgresql
