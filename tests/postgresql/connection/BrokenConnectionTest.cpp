#include <map>
#include <random>
#include <string>
#include <vector>

#include <gmock/gmock.h>

#include "postgresql/FaultyProxy.hpp"
#include "postgresql/SharedProjectFixture.hpp"
#include "support/NightlyScale.hpp"
#include "support/Waiting.hpp"

namespace project::postgresql {

namespace {

using Fault = test::FaultyProxy::Fault;
using std::chrono::seconds;

/// A client behind a proxy. The one that checks is connected directly.
class BrokenConnectionTest : public SharedProjectTest {
protected:
    void SetUp() override {
        SharedProjectTest::SetUp();
        if (!IsSkipped()) {
            append(*anna, *body(1, "text\n"));
            ids.push_back(anna->look(1).entries[0].position.id);
            proxy = std::make_unique<test::FaultyProxy>(sharedServer().port());
        }
    }

    /// A connected client behind the proxy.
    std::unique_ptr<PostgresJournal> openBehindProxy(ServiceSettings settings = {}) const {
        settings.service = test::PostgresServer::connectionAt(proxy->port(), "swift");
        auto journal = std::make_unique<PostgresJournal>(settings, project.id);
        journal->look(1);
        return journal;
    }

    std::uint64_t nextVersion() const { return ids.size() + 1; }

    /// Expects that the log consists of the entries with these identities, each of them once.
    void expectStored() {
        auto const look = anna->look(1);
        std::vector<std::string> stored;
        for (auto const& entry : look.entries) {
            stored.push_back(entry.position.id);
        }
        EXPECT_EQ(stored, ids);
    }

    /// Breaks an operation after a number of bytes, on a new connection each time, until it needs fewer.
    /// @param step the distance of the breaks in bytes, from a random one on; in the nightly run, a fifth of
    /// it.
    /// @return the number of breaks, multiplied by the distance: the bytes of the operation.
    template <class Operation>
    std::size_t breakEverywhere(Fault fault, std::size_t step, ServiceSettings const& settings,
                                Operation const& operation) {
        step = test::numberFromEnvironment("PROJECT_TEST_CRASH_POINTS", 0) > 0 ? (step + 4) / 5 : step;
        for (std::size_t bytes = 1 + test::testSeed() % step;; bytes += step) {
            auto const journal = openBehindProxy(settings);
            proxy->breakAfter(bytes, fault);
            operation(*journal);
            if (!proxy->hasBroken()) {
                return bytes;
            }
            if (HasFailure()) {
                ADD_FAILURE() << "broken after " << bytes << " bytes";
                return bytes;
            }
        }
    }

    /// A write of one batch, as a guard makes it, and a check for changes.
    /// @param patience is added to the time in which a stall is noticed, because it may be a wait for the
    /// lock.
    void write(PostgresJournal& journal, milliseconds patience = seconds(20)) {
        auto const own = batch(nextVersion());
        auto const look = journal.lock(patience, nextVersion() - 1);
        EXPECT_EQ(look.entries.size(), 1);
        EXPECT_EQ(journal.append(own->entry), Journal::Appended::Stored);
        journal.unlock();
        ids.push_back(own->entry.position.id);
        EXPECT_EQ(journal.look(ids.size()).entries.size(), 1); // a release that was lost is noticed now
    }

    std::unique_ptr<test::FaultyProxy> proxy;
    std::vector<std::string> ids; ///< of all entries that were acknowledged, from version 1
};

ServiceSettings withSilence(milliseconds silence) {
    ServiceSettings settings;
    settings.silenceLimit = silence;
    return settings;
}

} // namespace

TEST_F(BrokenConnectionTest, aWriteThatIsCutAnywhereIsStoredOnce) {
    auto const length = breakEverywhere(Fault::Cut, 5, {}, [&](PostgresJournal& journal) { write(journal); });
    EXPECT_GT(length, 500);
    expectStored();
}

TEST_F(BrokenConnectionTest, aWriteWhoseConnectionTheServerDoesNotSeeClosedIsStoredOnce) {
    auto const length =
        breakEverywhere(Fault::HalfClose, 10, {}, [&](PostgresJournal& journal) { write(journal); });
    EXPECT_GT(length, 500);
    expectStored();
}

TEST_F(BrokenConnectionTest, aWriteThatStallsAnywhereIsStoredOnce) {
    auto const length = breakEverywhere(Fault::Stall, 50, withSilence(milliseconds(150)),
                                        [&](PostgresJournal& journal) { write(journal, milliseconds(200)); });
    EXPECT_GT(length, 500);
    expectStored();
}

TEST_F(BrokenConnectionTest, aBodyOfSeveralPiecesThatIsCutIsStoredOnce) {
    std::size_t const bodyLength = 2'500'000;
    std::mt19937 random(7); // bytes that cannot be compressed
    std::string text(bodyLength, '\0');
    for (auto& byte : text) {
        byte = static_cast<char>(random());
    }
    breakEverywhere(Fault::Cut, bodyLength / 20, {}, [&](PostgresJournal& journal) {
        auto const own = body(nextVersion(), text);
        journal.lock(seconds(20), nextVersion() - 1);
        EXPECT_EQ(journal.append(own->entry), Journal::Appended::Stored);
        journal.unlock();
        ids.push_back(own->entry.position.id);
        EXPECT_TRUE(anna->body(own->entry.position) == text);
    });
    expectStored();
}

TEST_F(BrokenConnectionTest, aReadThatIsCutAnywhereShowsTheState) {
    append(*anna, *batch(2));
    auto const looks = breakEverywhere(Fault::Cut, 5, {}, [&](PostgresJournal& journal) {
        auto const look = journal.look(std::nullopt);
        EXPECT_EQ(look.entries.size(), 2);
        EXPECT_EQ(look.body, "text\n");
    });
    EXPECT_GT(looks, 200);
    auto const position = anna->look(1).entries[0].position;
    auto const bodies = breakEverywhere(Fault::Cut, 10, {}, [&](PostgresJournal& journal) {
        EXPECT_EQ(journal.body(position), "text\n");
        EXPECT_EQ(journal.records(std::nullopt, 10).size(), 2);
    });
    EXPECT_GT(bodies, 50);
}

TEST_F(BrokenConnectionTest, anAttemptToConnectThatIsCutAnywhereFailsAtOnceOrSucceeds) {
    int unreachable = 0;
    for (std::size_t bytes = 1;; bytes += 7) {
        PostgresJournal journal(settingsFor(test::PostgresServer::connectionAt(proxy->port(), "ben")),
                                project.id);
        proxy->breakAfter(bytes, Fault::Cut);
        try {
            EXPECT_EQ(journal.look(1).entries.size(), 1);
        } catch (StoreError const& error) {
            EXPECT_EQ(error.kind(), StoreError::Kind::Unreachable) << error.what();
            ++unreachable;
        }
        if (!proxy->hasBroken()) {
            break;
        }
    }
    EXPECT_GT(unreachable, 20);
}

TEST_F(BrokenConnectionTest, theOutcomeIsUnknownOnlyIfTheEntryMayBeStored) {
    proxy->refuseAfterBreak(true);
    auto settings = withSilence(milliseconds(500));
    settings.operationLimit = milliseconds(300);
    std::map<StoreError::Kind, int> kinds;
    for (std::size_t bytes = 1; bytes < 5'000; bytes += 40) {
        proxy->breakAfter(1'000'000, Fault::Cut); // lets it connect
        std::unique_ptr<PostgresJournal> journal;
        ASSERT_TRUE(test::comesTrue([&] {
            try {
                journal = openBehindProxy(settings);
            } catch (StoreError const&) { // the machine is busy
            }
            return journal != nullptr;
        }));
        auto const own = batch(nextVersion());
        proxy->breakAfter(bytes, Fault::Cut);
        bool isStored = false;
        try {
            journal->lock(milliseconds(10), nextVersion() - 1);
            isStored = journal->append(own->entry) == Journal::Appended::Stored;
            EXPECT_TRUE(isStored);
        } catch (StoreError const& error) {
            ++kinds[error.kind()];
            auto const entries = anna->look(nextVersion()).entries;
            isStored = !entries.empty() && entries[0].position.id == own->entry.position.id;
            if (error.kind() != StoreError::Kind::OutcomeUnknown) {
                EXPECT_EQ(error.kind(), StoreError::Kind::Unreachable) << error.what();
                EXPECT_FALSE(isStored) << error.what();
            }
        }
        if (isStored) {
            ids.push_back(own->entry.position.id);
        }
        if (isStored && !proxy->hasBroken()) {
            break;
        }
    }
    EXPECT_GT(kinds[StoreError::Kind::OutcomeUnknown], 5);
    EXPECT_GT(kinds[StoreError::Kind::Unreachable], 5);
    expectStored();
}

TEST_F(BrokenConnectionTest, anUnknownOutcomeIsKnownAtTheNextCheck) {
    auto settings = withSilence(milliseconds(200));
    settings.operationLimit = milliseconds(100);
    auto const journal = openBehindProxy(settings);
    journal->lock(seconds(5), 1);
    auto const own = batch(2);
    proxy->breakAfter(1, Fault::Stall);
    EXPECT_EQ(errorOf([&] { journal->append(own->entry); }).kind(), StoreError::Kind::OutcomeUnknown);
    journal->unlock();
    auto const look = journal->look(1);
    // The statement never arrived, and the process that waited for the rest of it has ended.
    EXPECT_EQ(look.entries.size(), 1);
    EXPECT_EQ(append(*anna, *batch(2)), Journal::Appended::Stored);
}

TEST_F(BrokenConnectionTest, aSlowConnectionIsNotALostOne) {
    auto const journal = openBehindProxy();
    proxy->delay(milliseconds(20));
    write(*journal);
    expectStored();
    EXPECT_EQ(proxy->connections(), 1);
}

TEST_F(BrokenConnectionTest, aLargeBodyMayTakeLongerThanAnOperation) {
    auto settings = withSilence(seconds(10));
    settings.operationLimit = milliseconds(500);
    auto const journal = openBehindProxy(settings);
    std::mt19937 random(7);
    std::string text(4'000'000, '\0');
    for (auto& byte : text) {
        byte = static_cast<char>(random());
    }
    auto const own = body(2, text);
    journal->lock(seconds(5), 1);
    proxy->delay(milliseconds(20));
    EXPECT_EQ(journal->append(own->entry), Journal::Appended::Stored);
    journal->unlock();
    EXPECT_TRUE(journal->look(std::nullopt).body == text);
    EXPECT_TRUE(journal->body(own->entry.position) == text);
    EXPECT_EQ(proxy->connections(), 1);
}

TEST_F(BrokenConnectionTest, aServerThatNeverAnswersEndsTheWait) {
    auto settings = withSilence(milliseconds(100));
    settings.operationLimit = milliseconds(300);
    auto const journal = openBehindProxy(settings);
    proxy->refuseAfterBreak(true);
    proxy->breakAfter(1, Fault::Stall);
    auto const error = errorOf([&] { journal->look(1); });
    EXPECT_EQ(error.kind(), StoreError::Kind::Unreachable);
}

TEST_F(BrokenConnectionTest, theLockOfALostConnectionIsTakenAgainBeforeTheNextAppend) {
    auto const journal = openBehindProxy();
    journal->lock(seconds(5), 1);
    proxy->breakAfter(1, Fault::HalfClose); // the server still sees a session with the lock
    auto const own = batch(2);
    EXPECT_EQ(journal->append(own->entry), Journal::Appended::Stored);
    EXPECT_EQ(errorOf([&] { anna->lock(milliseconds(50), std::nullopt); }).kind(), StoreError::Kind::Busy);
    journal->unlock();
    anna->lock(seconds(5), std::nullopt);
}

} // namespace project::postgresql
