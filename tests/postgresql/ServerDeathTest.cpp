#include <algorithm>
#include <future>
#include <iostream>
#include <random>
#include <string>
#include <thread>

#include <gmock/gmock.h>

#include "postgresql/FaultyProxy.hpp"
#include "postgresql/SharedProjectFixture.hpp"
#include "postgresql/WriterThreads.hpp"
#include "support/NightlyScale.hpp"
#include "support/Waiting.hpp"

namespace project::postgresql {

namespace {

using std::chrono::seconds;
using ::testing::HasSubstr;
using ::testing::IsEmpty;

/// Tests with servers of their own, which die.
class ServerDeathTest : public ::testing::Test {
protected:
    void SetUp() override {
        if (auto const obstacle = test::PostgresServer::obstacle(); !obstacle.empty()) {
            GTEST_SKIP() << obstacle;
        }
    }

    static bool isNightly() { return test::numberFromEnvironment("PROJECT_TEST_CRASH_POINTS", 0) > 0; }

    static std::unique_ptr<PostgresJournal> open(std::string const& connection,
                                                 SharedProject const& project) {
        return std::make_unique<PostgresJournal>(settingsFor(connection), project.id);
    }

    static std::string incompressible(std::size_t length) {
        std::mt19937 random; // NOLINT(cert-msc32-c,cert-msc51-cpp): the same bytes in each run
        std::string bytes(length, '\0');
        std::generate(bytes.begin(), bytes.end(), [&] { return static_cast<char>(random()); });
        return bytes;
    }

    static void appendFirst(Journal& journal) {
        journal.lock(seconds(10), std::nullopt);
        EXPECT_EQ(journal.append(body(1, "text\n")->entry), Journal::Appended::Stored);
        journal.unlock();
    }

    /// A connection string for two servers, of which the one that can write is used.
    static std::string eitherOf(test::PostgresServer const& first, test::PostgresServer const& second) {
        return "host=127.0.0.1,127.0.0.1 port=" + std::to_string(first.port()) + "," +
               std::to_string(second.port()) + " user=anna dbname=projects password=secret sslmode=disable";
    }
};

} // namespace

TEST_F(ServerDeathTest, noAcknowledgedBatchIsLostWhenTheServerIsKilledWhileTwelveClientsWrite) {
    test::PostgresServer server;
    prepare(server);
    auto const project = createProject(server);
    auto const reader = open(server.connection("anna"), project);
    appendFirst(*reader);
    WriterThreads writers(12, [&] { return open(server.connection("anna"), project); });
    int const kills = isNightly() ? 10 : 3;
    for (int i = 0; i < kills; ++i) {
        EXPECT_TRUE(writers.await(writers.acknowledged() + 50));
        server.kill();
        server.start();
    }
    EXPECT_TRUE(writers.await(writers.acknowledged() + 50));
    writers.finish();
    EXPECT_THAT(writers.unexpectedErrors(), IsEmpty());
    writers.expectAllIn(reader->look(1));
    RecordProperty("acknowledged", static_cast<int>(writers.acknowledged()));
}

TEST_F(ServerDeathTest, allClientsGetTheSameShareOfTheWrites) {
    test::PostgresServer server;
    prepare(server);
    auto const project = createProject(server);
    auto const reader = open(server.connection("anna"), project);
    appendFirst(*reader);
    int const clients = isNightly() ? 100 : 10;
    WriterThreads writers(clients, [&] { return open(server.connection("anna"), project); });
    EXPECT_TRUE(writers.awaitAll());
    EXPECT_TRUE(writers.await(writers.acknowledged() + (isNightly() ? 0 : 300)));
    std::this_thread::sleep_for(seconds(isNightly() ? 60 : 0));
    writers.finish();
    EXPECT_THAT(writers.unexpectedErrors(), IsEmpty());
    writers.expectAllIn(reader->look(1));
    auto const [fewest, most] = writers.sharesOfClients();
    constexpr std::size_t counted = 2; // the first and the last round are counted for some of them only
    EXPECT_GE((fewest + counted) * 10, most * 9) << "from " << fewest << " to " << most;
    std::cout << writers.acknowledged() << " batches, each client from " << fewest << " to " << most << '\n';
}

TEST_F(ServerDeathTest, noAcknowledgedBatchIsLostWhenASynchronousStandbyIsPromotedWhileTwentyClientsWrite) {
    test::PostgresServer primary;
    prepare(primary);
    auto const project = createProject(primary);
    test::PostgresServer standby(primary, {"synchronous_standby_names = ''"});
    primary.query("ALTER SYSTEM SET synchronous_standby_names = 'standby'");
    primary.query("SELECT pg_reload_conf()");
    ASSERT_TRUE(test::comesTrue([&] {
        return primary.query("SELECT count(*) FROM pg_stat_replication WHERE sync_state = 'sync'") == "1";
    }));
    auto const either = eitherOf(primary, standby);
    auto const reader = open(either, project);
    appendFirst(*reader);
    WriterThreads writers(20, [&] { return open(either, project); });
    EXPECT_TRUE(writers.await(100));
    primary.kill();
    standby.promote();
    EXPECT_TRUE(writers.await(writers.acknowledged() + 100));
    writers.finish();
    EXPECT_THAT(writers.unexpectedErrors(), IsEmpty());
    writers.expectAllIn(reader->look(1));
    RecordProperty("acknowledged", static_cast<int>(writers.acknowledged()));
}

TEST_F(ServerDeathTest, anEntryThatNoStandbyHasIsNotAcknowledgedAlthoughTheServerShowsIt) {
    test::PostgresServer primary;
    prepare(primary);
    auto const project = createProject(primary);
    auto const reader = open(primary.connection("anna"), project);
    appendFirst(*reader);
    primary.query("ALTER SYSTEM SET synchronous_standby_names = 'absent'");
    primary.query("SELECT pg_reload_conf()");
    auto settings = settingsFor(primary.connection("ben"));
    settings.silenceLimit = milliseconds(300);
    settings.operationLimit = seconds(3);
    PostgresJournal writer(settings, project.id);
    writer.lock(seconds(5), 1);
    auto const own = batch(2);
    EXPECT_EQ(errorOf([&] { writer.append(own->entry); }).kind(), StoreError::Kind::OutcomeUnknown);
    auto const look = reader->look(1);
    ASSERT_EQ(look.entries.size(), 2) << "the commit was interrupted while it waited for the standby";
    EXPECT_EQ(look.entries[1].position, own->entry.position);
}

TEST_F(ServerDeathTest, aCommitThatStopsWaitingForItsStandbyIsNotAcknowledged) {
    test::PostgresServer primary;
    prepare(primary);
    auto const project = createProject(primary);
    appendFirst(*open(primary.connection("anna"), project));
    primary.query("ALTER SYSTEM SET synchronous_standby_names = 'absent'");
    primary.query("SELECT pg_reload_conf()");
    auto settings = settingsFor(primary.connection("ben"));
    settings.operationLimit = seconds(3);
    PostgresJournal writer(settings, project.id);
    writer.lock(seconds(5), 1);
    auto outcome = std::async(std::launch::async, [&] {
        auto const own = batch(2);
        return errorOf([&] { writer.append(own->entry); }).kind();
    });
    // The server answers a cancelled wait with success and a warning.
    EXPECT_TRUE(test::comesTrue([&] {
        return primary.query(
                   "SELECT count(pg_cancel_backend(pid)) FROM pg_stat_activity WHERE wait_event = 'SyncRep'"
                   " AND usename = 'ben'") != "0";
    }));
    EXPECT_EQ(outcome.get(), StoreError::Kind::OutcomeUnknown);
}

TEST_F(ServerDeathTest, aStandbyThatWasBehindShowsAnEarlierState) {
    test::PostgresServer primary;
    prepare(primary);
    auto const project = createProject(primary);
    test::PostgresServer standby(primary, {});
    auto const journal = open(eitherOf(primary, standby), project);
    appendFirst(*journal);
    ASSERT_TRUE(test::comesTrue([&] { return standby.query("SELECT count(*) FROM pm.entry") == "1"; }));
    standby.stop();
    journal->lock(seconds(5), 1);
    EXPECT_EQ(journal->append(batch(2)->entry), Journal::Appended::Stored);
    journal->unlock();
    primary.kill();
    standby.start();
    standby.promote();
    EXPECT_EQ(journal->look(1).entries.size(), 1);
    EXPECT_THAT(journal->look(2).entries, IsEmpty()) << "the caller sees that its state is lost";
    journal->lock(seconds(5), 2);
    EXPECT_EQ(journal->append(batch(3)->entry), Journal::Appended::Superseded);
}

TEST_F(ServerDeathTest, aFullDiskOfTheServerRefusesABatchAndStoresTheNext) {
    if (auto const obstacle = test::PostgresServer::obstacleToSmallDisk(); !obstacle.empty()) {
        GTEST_SKIP() << obstacle;
    }
    test::PostgresServer server({}, 16);
    prepare(server);
    auto const project = createProject(server);
    auto const journal = open(server.connection("anna"), project);
    appendFirst(*journal);
    server.query("ALTER TABLE pm.entry SET TABLESPACE small");
    server.query("CREATE TABLE filler (bytes bytea) TABLESPACE small;"
                 " ALTER TABLE filler ALTER COLUMN bytes SET STORAGE EXTERNAL");
    auto const fillDisk = [&] {
        for (int kibibytes = 1024; kibibytes > 0;) {
            try {
                server.query("INSERT INTO filler SELECT decode(repeat('00', 1024 * " +
                             std::to_string(kibibytes) + "), 'hex')");
            } catch (std::runtime_error const&) {
                kibibytes /= 2;
            }
        }
    };
    fillDisk();
    auto const large = batch(2, incompressible(300'000));
    journal->lock(seconds(5), 1);
    auto const error = errorOf([&] { journal->append(large->entry); });
    EXPECT_EQ(error.kind(), StoreError::Kind::DiskFailed);
    EXPECT_THAT(error.what(), HasSubstr("the server's disk is full"));
    EXPECT_EQ(journal->look(1).entries.size(), 1) << "the rest can be read";
    server.query("DROP TABLE filler; CHECKPOINT");
    EXPECT_EQ(journal->append(large->entry), Journal::Appended::Stored);
    EXPECT_EQ(journal->look(1).entries.back().lines, large->lines);
}

TEST_F(ServerDeathTest, aBackupIsRestoredWithEntriesRightsAndProjects) {
    test::PostgresServer server;
    prepare(server);
    auto const project = createProject(server);
    auto const journal = open(server.connection("anna"), project);
    appendFirst(*journal);
    journal->lock(seconds(5), 1);
    journal->append(batch(2)->entry);
    journal->unlock();
    auto const dump = server.folder() / "dump";
    auto const connection = server.connection(test::PostgresServer::superuser);
    server.runProgram({test::PostgresServer::program("pg_dump"), "--format=custom", "--schema=pm", "--file",
                       dump, "--dbname", connection});
    journal->lock(seconds(5), 2);
    journal->append(batch(3)->entry);
    journal->unlock();
    server.query("DROP SCHEMA pm CASCADE");
    EXPECT_EQ(errorOf([&] { journal->look(3); }).kind(), StoreError::Kind::Refused);
    server.runProgram({test::PostgresServer::program("pg_restore"), "--exit-on-error", "--single-transaction",
                       "--dbname", connection, dump});
    EXPECT_EQ(journal->look(1).entries.size(), 2);
    EXPECT_EQ(journal->look(std::nullopt).body, "text\n");
    EXPECT_THAT(journal->look(3).entries, IsEmpty()) << "clients see that the later entry is lost";
    journal->lock(seconds(5), 2);
    EXPECT_EQ(journal->append(batch(3)->entry), Journal::Appended::Stored);
    auto const rita = open(server.connection("rita"), project);
    EXPECT_EQ(rita->look(1).entries.size(), 3);
    EXPECT_EQ(errorOf([&] { rita->deleteBefore(1); }).kind(), StoreError::Kind::Refused);
}

} // namespace project::postgresql
