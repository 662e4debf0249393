#include "support/JournalStore.hpp"

namespace project::test {

namespace {

using stores::HistoryLoss;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

/// A log whose history was deleted, and a server that was reset to an earlier state.
class JournalHistory : public JournalStore {
protected:
    void SetUp() override {
        prepare({u"a"});
        commit(*writer_, {set(fileAddress(u"b"))});
        commit(*writer_, {set(fileAddress(u"c"))});
        contentOf(*client_);
    }

    static void expectLoss(JournalBackend& client, HistoryLoss::Kind kind, std::uint64_t seen,
                           std::uint64_t found) {
        auto const loss = client.takeHistoryLoss();
        ASSERT_TRUE(loss);
        EXPECT_EQ(loss->kind, kind);
        EXPECT_EQ(loss->seen, seen);
        EXPECT_EQ(loss->found, found);
        EXPECT_FALSE(client.takeHistoryLoss()) << "it is reported once";
    }

    std::unique_ptr<JournalBackend> const writer_ = open();
    std::unique_ptr<JournalBackend> const client_ = open();
};

TEST_F(JournalHistory, aResetIsReportedWithTheDifferences) {
    server->resetTo(1);

    Entered const guard(*client_);

    EXPECT_THAT(addressesOf(guard.changes().differences), ElementsAre(fileAddress(u"b"), fileAddress(u"c")));
    EXPECT_EQ(loadAll(*client_), files({u"a"}));
    expectLoss(*client_, HistoryLoss::Kind::Reset, 3, 1);
}

TEST_F(JournalHistory, aResetIsNoticedAfterOthersHaveWrittenMoreThanWasLost) {
    server->resetTo(2);
    for (auto const* const path : {u"d", u"e", u"f"}) {
        commit(*open(), {set(fileAddress(path))});
    }

    Entered const guard(*client_);

    EXPECT_THAT(addressesOf(guard.changes().differences),
                ElementsAre(fileAddress(u"c"), fileAddress(u"d"), fileAddress(u"e"), fileAddress(u"f")));
    expectLoss(*client_, HistoryLoss::Kind::Reset, 3, 5);
}

TEST_F(JournalHistory, aResetIsNoticedIfTheSameContentWasWrittenAgain) {
    server->resetTo(2);
    commit(*open(), {set(fileAddress(u"c"))});

    Entered const guard(*client_);

    EXPECT_THAT(guard.changes().differences, IsEmpty());
    expectLoss(*client_, HistoryLoss::Kind::Reset, 3, 3);
}

TEST_F(JournalHistory, aResetToNothingIsReportedAndNotTakenForANewProject) {
    server->resetTo(0);

    Entered const guard(*client_);

    EXPECT_EQ(guard.changes().differences.size(), 3U);
    EXPECT_THAT(loadAll(*client_), IsEmpty());
    expectLoss(*client_, HistoryLoss::Kind::Reset, 3, 0);
}

TEST_F(JournalHistory, writesAreRefusedUntilTheResetWasTaken) {
    server->resetTo(1);
    for (int turn = 0; turn < 2; ++turn) {
        auto const error = errorOf([&] { commit(*client_, {set(fileAddress(u"d"))}); });
        EXPECT_EQ(error.kind(), StoreError::Kind::Refused);
        EXPECT_THAT(error.problem(), HasSubstr("version 3 was seen, and the newest version is now 1"));
    }
    EXPECT_EQ(errorOf([&] { client_->tidy(); }).kind(), StoreError::Kind::Refused);
    EXPECT_EQ(errorOf([&] { client_->replace(textOf({})); }).kind(), StoreError::Kind::Refused);
    EXPECT_EQ(errorOf([&] { client_->deleteHistory(); }).kind(), StoreError::Kind::Refused);
    EXPECT_EQ(server->entries().size(), 1U);

    EXPECT_TRUE(client_->takeHistoryLoss());
    commit(*client_, {set(fileAddress(u"d"))});

    EXPECT_EQ(stored(), files({u"a", u"d"}));
}

TEST_F(JournalHistory, theDamageOfAServerThatWasResetIsFoundToo) {
    server->resetTo(2);
    server->entry(2).read.lines.clear();

    Entered const guard(*client_, Access::Write);

    EXPECT_EQ(loadAll(*client_), files({u"a"}));
    EXPECT_EQ(errorOf([&] { client_->write({set(fileAddress(u"d"))}); }).kind(), StoreError::Kind::Damaged);
    EXPECT_TRUE(client_->takeHistoryLoss());
}

TEST_F(JournalHistory, aResetDuringAWriteLeavesTheBatchUnstored) {
    Entered const guard(*client_, Access::Write);
    client_->write({set(fileAddress(u"d"))});
    server->resetTo(1);

    EXPECT_EQ(errorOf([&] { client_->keep(); }).kind(), StoreError::Kind::Busy);

    EXPECT_EQ(stored(), files({u"a"}));
}

TEST_F(JournalHistory, deletingHistoryLeavesTheNewestBodyAndTheEntriesAfterIt) {
    writer_->tidy();
    commit(*writer_, {set(fileAddress(u"d"))});

    EXPECT_EQ(writer_->deleteHistory(), 3U);

    EXPECT_EQ(server->entries().front().read.position.version, 4U);
    EXPECT_EQ(server->pieces().size(), 1U);
    EXPECT_EQ(stored(), files({u"a", u"b", u"c", u"d"}));
    EXPECT_EQ(contentOf(*writer_), stored());
    EXPECT_FALSE(writer_->takeHistoryLoss());
    EXPECT_EQ(writer_->deleteHistory(), 0U);
}

TEST_F(JournalHistory, historyIsKeptFromTheBodyBeforeAGivenVersion) {
    writer_->tidy();                            // 4
    commit(*writer_, {set(fileAddress(u"d"))}); // 5
    writer_->tidy();                            // 6
    EXPECT_EQ(writer_->deleteHistory(3), 0U) << "the body at version 1 is needed for version 3";
    EXPECT_EQ(writer_->deleteHistory(5), 3U);
    EXPECT_EQ(server->entries().front().read.position.version, 4U);
}

TEST_F(JournalHistory, aClientThatMissedTheDeletedHistoryReportsItAndMayWrite) {
    writer_->tidy();
    commit(*writer_, {remove(fileAddress(u"a"))});
    writer_->tidy();
    writer_->deleteHistory();

    Entered guard(*client_, Access::Write);
    EXPECT_THAT(addressesOf(guard.changes().differences), ElementsAre(fileAddress(u"a")));
    client_->write({set(fileAddress(u"d"))});
    client_->keep();

    expectLoss(*client_, HistoryLoss::Kind::Cleaned, 3, 6);
    EXPECT_EQ(stored(), files({u"b", u"c", u"d"}));
}

TEST_F(JournalHistory, aClientThatMissedTheDeletedHistoryMayReplaceTheDefinition) {
    writer_->tidy();
    writer_->deleteHistory();

    client_->replace(textOf(addFiles({u"x"})));

    EXPECT_EQ(stored(), files({u"x"}));
    expectLoss(*client_, HistoryLoss::Kind::Cleaned, 3, 4);
}

TEST_F(JournalHistory, aResetThatFollowsAnotherLossIsReportedAsAReset) {
    commit(*writer_, {set(fileAddress(u"d"))});
    server->resetTo(2);
    contentOf(*client_);
    auto const other = open();
    commit(*other, {set(fileAddress(u"x"))});
    other->tidy();
    other->deleteHistory();
    contentOf(*client_);

    expectLoss(*client_, HistoryLoss::Kind::Reset, 3, 4);
}

TEST_F(JournalHistory, onlyTheOwnerDeletesHistory) {
    writer_->tidy();
    JournalBackend other(std::make_unique<MemoryJournal>(server, "guest"));
    EXPECT_EQ(errorOf([&] { other.deleteHistory(); }).kind(), StoreError::Kind::Refused);
    EXPECT_EQ(server->entries().size(), 4U);
}

TEST_F(JournalHistory, nothingIsDeletedIfTheEntriesThatWouldStayAreDamaged) {
    writer_->tidy();
    commit(*writer_, {set(fileAddress(u"d"))});
    std::string const lines = std::exchange(server->entry(5).read.lines, "");
    EXPECT_EQ(errorOf([&] { writer_->deleteHistory(); }).kind(), StoreError::Kind::Damaged);
    server->entry(5).read.lines = lines;
    server->pieces().erase(server->entry(4).read.position.id);
    EXPECT_EQ(errorOf([&] { writer_->deleteHistory(); }).kind(), StoreError::Kind::Damaged);
    EXPECT_EQ(server->entries().size(), 5U);
}

TEST_F(JournalHistory, theRecordsShowWhoWroteWhichEntry) {
    JournalBackend other(std::make_unique<MemoryJournal>(server, "guest"));
    commit(other, {set(fileAddress(u"d"))});

    auto const records = other.journal().records(std::nullopt, 2);
    ASSERT_EQ(records.size(), 2U);
    EXPECT_EQ(records[0].position.version, 4U);
    EXPECT_EQ(records[0].author, "guest");
    EXPECT_EQ(records[1].author, "owner");
    EXPECT_EQ(other.journal().records(2, 10).size(), 1U);
}

} // namespace

} // namespace project::test
