#include "support/JournalStore.hpp"

namespace project::test {

namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

/// Each guard of a writer, and each commit.
class JournalBackendWriting : public JournalStore {};

TEST_F(JournalBackendWriting, theFirstBatchIsABodyAndTheNextIsABatchThatChainsToIt) {
    auto const writer = open();
    commit(*writer, {set(fileAddress(u"a"))});
    commit(*writer, {set(fileAddress(u"b"))});

    auto const& body = server->entry(1).read;
    auto const& batch = server->entry(2).read;
    EXPECT_TRUE(body.isBody);
    EXPECT_EQ(body.after, "");
    EXPECT_EQ(server->pieces().at(body.position.id), textOf(addFiles({u"a"})));
    EXPECT_EQ(body.position.sum, stores::samples::sumOf(textOf(addFiles({u"a"}))));
    EXPECT_FALSE(batch.isBody);
    EXPECT_EQ(batch.after, body.position.sum);
    EXPECT_EQ(textOf(addFiles({u"a"})) + batch.lines, textOf(addFiles({u"a"}), {addFiles({u"b"})}))
        << "the entries are the body and the tail of a text";
}

TEST_F(JournalBackendWriting, aBatchCostsTwoRoundTrips) {
    prepare({u"a"});
    auto const writer = open();
    contentOf(*writer);
    calls();

    commit(*writer, {set(fileAddress(u"b"))});

    EXPECT_THAT(calls(), ElementsAre("lock", "insert"));
}

TEST_F(JournalBackendWriting, aWriteReportsNoFiles) {
    auto const written = commit(*open(), {set(fileAddress(u"a"))});
    EXPECT_THAT(written.added, IsEmpty());
    EXPECT_THAT(written.removed, IsEmpty());
}

TEST_F(JournalBackendWriting, aWriterAppliesTheBatchesOfOthersBeforeItsOwn) {
    prepare({u"a"});
    auto const writer = open();
    contentOf(*writer);
    commit(*open(), {set(fileAddress(u"b"))});

    commit(*writer, {set(fileAddress(u"c"))});

    EXPECT_EQ(contentOf(*writer), files({u"a", u"b", u"c"}));
    EXPECT_EQ(stored(), files({u"a", u"b", u"c"}));
}

TEST_F(JournalBackendWriting, loadingShowsTheBatchThatIsNotCommittedYetAndDiscardingForgetsIt) {
    prepare({u"a"});
    for (auto const& options : {appending(), ofBodies()}) {
        auto const writer = open(options);
        Entered const guard(*writer, Access::Write);
        calls();

        writer->write({set(fileAddress(u"b")), remove(fileAddress(u"a"))});
        EXPECT_EQ(loadAll(*writer), files({u"b"}));
        writer->discard();
        EXPECT_EQ(loadAll(*writer), files({u"a"}));
        writer->keep();

        EXPECT_THAT(calls(), IsEmpty()) << "these steps are local";
    }
    EXPECT_EQ(stored(), files({u"a"}));
}

TEST_F(JournalBackendWriting, aTailThatWouldBeLongerThanASixteenthOfTheBodyBecomesABody) {
    prepare(manyFiles(400)); // some 6,400 bytes
    auto const writer = open({.shortTail = 0});
    std::size_t batches = 0;
    while (!server->entry(batches + 1).read.isBody || batches == 0) {
        auto const name = std::to_string(batches);
        commit(*writer, {set(fileAddress(std::u16string(name.begin(), name.end())))});
        ++batches;
        ASSERT_LT(batches, 100U);
    }

    std::size_t tail = 0;
    for (std::uint64_t version = 2; version <= batches; ++version) {
        tail += server->entry(version).read.lines.size();
    }
    auto const body = server->pieces().at(server->entry(1).read.position.id).size();
    EXPECT_GT(batches, 2U);
    EXPECT_LE(tail, body / 16);
    EXPECT_GT(tail + server->entry(batches + 1).read.lines.size(), body / 16);
    EXPECT_FALSE(server->entry(batches + 1).read.lines.empty()) << "others need not fetch the body";
}

TEST_F(JournalBackendWriting, aTailOfASmallProjectMayBeLongerThanItsBody) {
    prepare({u"a"});
    auto const writer = open();
    for (auto const& path : manyFiles(100)) {
        commit(*writer, {set(fileAddress(path))});
    }
    EXPECT_FALSE(server->entries().back().read.isBody);
    EXPECT_EQ(stored().size(), 101U);
}

TEST_F(JournalBackendWriting, aBatchThatIsLongerThanAServerAcceptsIsCommittedAsABody) {
    prepare({u"a"});
    auto const writer = open({.shortTail = std::size_t{1} << 30});
    auto const text = std::u16string(stores::Journal::longestBatch - 400, u'x');
    commit(*writer, {set(fileAddress(u"b"), makeNode(u"Info", {{u"k", text}}))});
    EXPECT_FALSE(server->entries().back().read.isBody);
    commit(*writer, {set(fileAddress(u"c"), makeNode(u"Info", {{u"k", text + std::u16string(400, u'y')}}))});
    EXPECT_TRUE(server->entries().back().read.isBody);
    EXPECT_THAT(server->entries().back().read.lines, IsEmpty());
    EXPECT_EQ(stored(), contentOf(*writer));
}

TEST_F(JournalBackendWriting, theErrorOfALockNamesItsHolderAndTheGuardIsNotTaken) {
    prepare({u"a"});
    auto const holder = std::make_unique<JournalBackend>(std::make_unique<MemoryJournal>(server, "anna"));
    auto const writer = open();
    {
        Entered const guard(*holder, Access::Write);
        auto const error = errorOf([&] { commit(*writer, {set(fileAddress(u"b"))}); });
        EXPECT_EQ(error.kind(), StoreError::Kind::Busy);
        EXPECT_THAT(error.problem(), HasSubstr("locked by anna"));
        EXPECT_EQ(contentOf(*writer), files({u"a"})) << "a reader does not wait";
    }
    commit(*writer, {set(fileAddress(u"b"))});
    EXPECT_EQ(stored(), files({u"a", u"b"}));
}

TEST_F(JournalBackendWriting, leavingReleasesTheLockAlsoAfterAnErrorOfTheGuard) {
    prepare({u"a"});
    auto const writer = open();
    contentOf(*writer);
    commit(*open(ofBodies()), {set(fileAddress(u"b"))});
    server->plan(Fault::DiskFull, 1); // the body that the guard fetches
    EXPECT_EQ(errorOf([&] { commit(*writer, {set(fileAddress(u"c"))}); }).kind(),
              StoreError::Kind::DiskFailed);
    EXPECT_FALSE(server->cancelPlan());

    commit(*open(), {set(fileAddress(u"d"))});

    EXPECT_EQ(contentOf(*writer), files({u"a", u"b", u"d"}));
}

TEST_F(JournalBackendWriting, aConnectionThatIsLostBeforeOrAfterTheServerStoresTheBatchStoresItOnce) {
    prepare({u"a"});
    auto const writer = open();
    for (Fault const fault : {Fault::LostBefore, Fault::LostAfter}) {
        contentOf(*writer);
        auto const entries = server->entries().size();
        server->plan(fault, 1);

        commit(*writer, {set(fileAddress(fault == Fault::LostBefore ? u"b" : u"c"))});

        EXPECT_FALSE(server->cancelPlan());
        EXPECT_EQ(server->entries().size(), entries + 1);
    }
    EXPECT_EQ(stored(), files({u"a", u"b", u"c"}));
    EXPECT_EQ(contentOf(*writer), stored());
}

TEST_F(JournalBackendWriting, aBatchThatAnotherClientHasOvertakenIsNotStored) {
    prepare({u"a"});
    auto const writer = open();
    auto const other = open();
    server->beforeCall = [&](std::string const& call) {
        if (call == "insert") {
            server->beforeCall = nullptr;
            server->dropConnections(); // the lock is lost, and another client takes it
            commit(*other, {set(fileAddress(u"b"))});
        }
    };

    auto const error = errorOf([&] { commit(*writer, {set(fileAddress(u"c"))}); });

    EXPECT_EQ(error.kind(), StoreError::Kind::Busy);
    EXPECT_THAT(error.problem(), HasSubstr("not in the project"));
    EXPECT_EQ(stored(), files({u"a", u"b"}));
    commit(*writer, {set(fileAddress(u"c"))});
    EXPECT_EQ(stored(), files({u"a", u"b", u"c"}));
}

TEST_F(JournalBackendWriting, aGuardThatLostItsLockContinuesIfNobodyHasWritten) {
    prepare({u"a"});
    auto const writer = open();
    Entered const guard(*writer, Access::Write);
    writer->write({set(fileAddress(u"b"))});
    server->dropConnections();
    calls();

    writer->keep();

    EXPECT_THAT(calls(), ElementsAre("lock", "insert"));
    EXPECT_EQ(stored(), files({u"a", u"b"}));
}

TEST_F(JournalBackendWriting, anAnswerThatDoesNotArriveLeavesTheOutcomeUnknownAndTheNextGuardShowsIt) {
    prepare({u"a"});
    for (Fault const fault : {Fault::Unreachable, Fault::Stalls}) {
        auto const writer = open();
        contentOf(*writer);
        server->plan(fault, 1);

        auto const error = errorOf([&] { commit(*writer, {set(fileAddress(u"b"))}); });

        server->cancelPlan();
        EXPECT_EQ(error.kind(), StoreError::Kind::OutcomeUnknown);
        Entered const guard(*writer);
        EXPECT_EQ(loadAll(*writer), fault == Fault::Stalls ? files({u"a", u"b"}) : files({u"a"}));
        EXPECT_EQ(addressesOf(guard.changes().differences).size(), fault == Fault::Stalls ? 1U : 0U)
            << "the tree was rolled back, so a batch that was stored is a change";
    }
}

TEST_F(JournalBackendWriting, afterAnUnknownOutcomeTheNextReaderChecksWhateverTheFreshness) {
    prepare({u"a"});
    auto const writer = open({.freshness = std::chrono::hours(1)});
    contentOf(*writer);
    server->plan(Fault::Stalls, 1);
    EXPECT_EQ(errorOf([&] { commit(*writer, {set(fileAddress(u"b"))}); }).kind(),
              StoreError::Kind::OutcomeUnknown);
    server->cancelPlan();

    EXPECT_EQ(contentOf(*writer), files({u"a", u"b"}));
}

TEST_F(JournalBackendWriting, aBatchThatTheServerStoresLateIsShownWhenItIsThereAndOnlyOnce) {
    prepare({u"a"});
    auto const writer = open();
    contentOf(*writer);
    server->plan(Fault::StallsLate, 1);
    EXPECT_EQ(errorOf([&] { commit(*writer, {set(fileAddress(u"b"))}); }).kind(),
              StoreError::Kind::OutcomeUnknown);
    server->cancelPlan();

    EXPECT_EQ(contentOf(*writer), files({u"a"}));
    EXPECT_EQ(contentOf(*writer), files({u"a", u"b"}));
    EXPECT_EQ(server->entries().size(), 2U);
}

TEST_F(JournalBackendWriting, ofALateBatchAndTheNextOneTheServerStoresTheFirstThatArrives) {
    for (std::size_t const calls : {1U, 2U}) {
        server->resetTo(0);
        prepare({u"a"});
        auto const writer = open();
        auto const other = open();
        contentOf(*writer);
        server->callsBeforeLate = calls;
        server->plan(Fault::StallsLate, 1);
        EXPECT_EQ(errorOf([&] { commit(*writer, {set(fileAddress(u"late"))}); }).kind(),
                  StoreError::Kind::OutcomeUnknown);
        server->cancelPlan();

        bool const isLateFirst = calls == 1; // it arrives between the lock and the insert of the other client
        if (isLateFirst) {
            EXPECT_EQ(errorOf([&] { commit(*other, {set(fileAddress(u"next"))}); }).kind(),
                      StoreError::Kind::Busy);
        } else {
            commit(*other, {set(fileAddress(u"next"))});
        }

        EXPECT_EQ(stored(), isLateFirst ? files({u"a", u"late"}) : files({u"a", u"next"}));
        EXPECT_EQ(contentOf(*writer), stored());
        EXPECT_EQ(server->entries().size(), 2U);
    }
}

TEST_F(JournalBackendWriting, aFullDiskOfTheServerMeansThatTheBatchIsNotStored) {
    prepare({u"a"});
    auto const writer = open();
    server->plan(Fault::DiskFull, 1);
    EXPECT_EQ(errorOf([&] { commit(*writer, {set(fileAddress(u"b"))}); }).kind(),
              StoreError::Kind::DiskFailed);
    server->cancelPlan();
    EXPECT_EQ(contentOf(*writer), files({u"a"}));
    commit(*writer, {set(fileAddress(u"b"))});
    EXPECT_EQ(stored(), files({u"a", u"b"}));
}

TEST_F(JournalBackendWriting, tidyAppendsABodyOnceAndKeepsTheDefinition) {
    prepare({u"a"});
    auto const writer = open();
    commit(*writer, {set(fileAddress(u"b"))});

    EXPECT_TRUE(writer->tidy());
    EXPECT_FALSE(writer->tidy());

    EXPECT_TRUE(server->entries().back().read.isBody);
    EXPECT_EQ(server->entries().size(), 3U);
    EXPECT_EQ(stored(), files({u"a", u"b"}));
    EXPECT_FALSE(JournalBackend(std::make_unique<MemoryJournal>(std::make_shared<JournalServer>())).tidy());
}

TEST_F(JournalBackendWriting, aTextReplacesTheDefinitionAndTheNextGuardReportsTheDifferences) {
    auto const writer = open();
    writer->replace(textOf(addFiles({u"a", u"b"}), {addFiles({u"c"})}));
    EXPECT_EQ(stored(), files({u"a", u"b", u"c"}));
    EXPECT_EQ(writer->text(), textOf(addFiles({u"a", u"b", u"c"})));
    contentOf(*writer);

    writer->replace(textOf(addFiles({u"b", u"d"})));

    Entered const guard(*writer);
    EXPECT_THAT(addressesOf(guard.changes().differences),
                ElementsAre(fileAddress(u"a"), fileAddress(u"c"), fileAddress(u"d")));
    EXPECT_EQ(loadAll(*writer), files({u"b", u"d"}));
}

TEST_F(JournalBackendWriting, aTextThatIsIncompleteOrDamagedReplacesNothing) {
    prepare({u"a"});
    for (auto const& text : {std::string(), std::string("no text\n"), stores::samples::bodyOf({"broken"})}) {
        EXPECT_THROW(open()->replace(text), StoreError);
    }
    EXPECT_EQ(stored(), files({u"a"}));
    EXPECT_EQ(server->entries().size(), 1U);
}

} // namespace

} // namespace project::test
