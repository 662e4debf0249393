#include "project/metadata/MetadataNodeSpecification.hpp"
#include "support/JournalStore.hpp"

namespace project::test {

namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

/// Each guard of a reader.
class JournalBackendReading : public JournalStore {};

TEST_F(JournalBackendReading, openingReadsBodyAndTailInOneRoundTrip) {
    prepare({u"a"});
    commit(*open(), {set(fileAddress(u"b"))});
    auto const reader = open();
    calls();

    EXPECT_EQ(contentOf(*reader), files({u"a", u"b"}));

    EXPECT_THAT(calls(), ElementsAre("look"));
}

TEST_F(JournalBackendReading, theFirstGuardSaysThatEverythingIsNew) {
    prepare({u"a"});
    auto const reader = open();
    EXPECT_TRUE(Entered(*reader).changes().everything);
    Entered const again(*reader);
    EXPECT_FALSE(again.changes().everything);
    EXPECT_THAT(again.changes().differences, IsEmpty());
}

TEST_F(JournalBackendReading, aLogWithoutEntriesIsAProjectWithoutNodes) {
    auto const reader = open();
    EXPECT_THAT(contentOf(*reader), IsEmpty());
    EXPECT_THAT(contentOf(*reader), IsEmpty());
    EXPECT_EQ(reader->takeHistoryLoss(), std::nullopt);
}

TEST_F(JournalBackendReading, aGuardWithoutChangesIsOneRoundTrip) {
    prepare({u"a"});
    auto const reader = open();
    contentOf(*reader);
    calls();

    Entered const guard(*reader);

    EXPECT_THAT(guard.changes().differences, IsEmpty());
    EXPECT_THAT(calls(), ElementsAre("look"));
}

TEST_F(JournalBackendReading, aGuardAppliesTheBatchesOfOthersAndReportsEachAddressBeforeAndAfter) {
    prepare({u"a", u"b"});
    auto const reader = open();
    contentOf(*reader);
    auto const other = open();
    commit(*other, {set(fileAddress(u"c"))});
    commit(*other, {set(fileAddress(u"b"), makeNode(u"Info", {{u"k", u"1"}})), remove(fileAddress(u"a"))});
    calls();

    Entered const guard(*reader);

    EXPECT_THAT(calls(), ElementsAre("look"));
    EXPECT_THAT(addressesOf(guard.changes().differences),
                ElementsAre(fileAddress(u"c"), fileAddress(u"a"), fileAddress(u"b")));
    EXPECT_EQ(guard.changes().differences[1].after, nullptr);
    EXPECT_TRUE(isEqual(*guard.changes().differences[2].after, *makeNode(u"Info", {{u"k", u"1"}})));
    EXPECT_EQ(loadAll(*reader), stored());
}

TEST_F(JournalBackendReading, anOpenGuardShowsOneState) {
    prepare({u"a"});
    auto const reader = open();
    Entered const guard(*reader);
    commit(*open(), {set(fileAddress(u"b"))});
    EXPECT_EQ(loadAll(*reader), files({u"a"}));
}

TEST_F(JournalBackendReading, theBatchOfABodyIsAppliedWithoutFetchingTheBody) {
    prepare(manyFiles(50));
    auto const reader = open();
    contentOf(*reader);
    auto const writer =
        open({.patience = std::chrono::milliseconds(10), .shortTail = 150, .bodyToTail = 1'000'000});
    commit(*writer, {set(fileAddress(u"x"))});
    commit(*writer, {set(fileAddress(u"y"))});
    ASSERT_TRUE(server->entry(3).read.isBody);
    ASSERT_FALSE(server->entry(3).read.lines.empty());
    calls();

    Entered const guard(*reader);

    EXPECT_THAT(calls(), ElementsAre("look"));
    EXPECT_THAT(addressesOf(guard.changes().differences), ElementsAre(fileAddress(u"x"), fileAddress(u"y")));
    EXPECT_EQ(loadAll(*reader), stored());
}

TEST_F(JournalBackendReading, aBodyWithoutItsBatchIsFetchedAndCompared) {
    prepare({u"a"});
    auto const reader = open();
    contentOf(*reader);
    commit(*open(ofBodies()), {set(fileAddress(u"b"))});
    ASSERT_TRUE(server->entry(2).read.lines.empty());
    calls();

    Entered const guard(*reader);

    EXPECT_THAT(calls(), ElementsAre("look", "body"));
    EXPECT_THAT(addressesOf(guard.changes().differences), ElementsAre(fileAddress(u"b")));
}

TEST_F(JournalBackendReading, aTidiedBodyIsNotFetchedAndChangesNothing) {
    prepare({u"a"});
    auto const other = open();
    commit(*other, {set(fileAddress(u"b"))});
    auto const reader = open();
    contentOf(*reader);
    ASSERT_TRUE(other->tidy());
    calls();

    Entered const guard(*reader);

    EXPECT_THAT(calls(), ElementsAre("look"));
    EXPECT_THAT(guard.changes().differences, IsEmpty());
}

TEST_F(JournalBackendReading, aGuardWithinTheFreshnessAsksNothing) {
    prepare({u"a"});
    auto const reader = open({.freshness = std::chrono::hours(1)});
    contentOf(*reader);
    commit(*open(), {set(fileAddress(u"b"))});
    calls();

    EXPECT_EQ(contentOf(*reader), files({u"a"}));
    EXPECT_THAT(calls(), IsEmpty());

    Entered const writing(*reader, Access::Write);
    EXPECT_EQ(loadAll(*reader), files({u"a", u"b"})) << "a writer always checks for changes";
}

TEST_F(JournalBackendReading, aRequestedCheckIsMadeOnceAlthoughTheLastOneIsFresh) {
    prepare({u"a"});
    auto const reader = open({.freshness = std::chrono::hours(1)});
    contentOf(*reader);
    commit(*open(), {set(fileAddress(u"b"))});
    calls();

    reader->requestCheck();

    EXPECT_EQ(contentOf(*reader), files({u"a", u"b"}));
    EXPECT_EQ(contentOf(*reader), files({u"a", u"b"}));
    EXPECT_THAT(calls(), ::testing::SizeIs(1));
}

TEST_F(JournalBackendReading, anUnreachableServerIsAnErrorThatSaysSo) {
    prepare({u"a"});
    auto const reader = open();
    contentOf(*reader);
    server->plan(Fault::Unreachable, 0);

    auto const error = errorOf([&] { contentOf(*reader); });

    EXPECT_EQ(error.kind(), StoreError::Kind::Unreachable);
    EXPECT_THAT(error.what(), HasSubstr("memory/project"));
    EXPECT_FALSE(reader->isShowingLastState());
    server->cancelPlan();
    EXPECT_EQ(contentOf(*reader), files({u"a"}));
}

TEST_F(JournalBackendReading, theLastStateIsShownWhileTheServerIsUnreachableIfThatIsWanted) {
    prepare({u"a"});
    auto const reader = open({.readsLastState = true});
    server->plan(Fault::Unreachable, 0);
    EXPECT_EQ(errorOf([&] { contentOf(*reader); }).kind(), StoreError::Kind::Unreachable)
        << "nothing was read yet";
    server->cancelPlan();
    contentOf(*reader);
    commit(*open(), {set(fileAddress(u"b"))});
    server->plan(Fault::Unreachable, 0);

    EXPECT_EQ(contentOf(*reader), files({u"a"}));
    EXPECT_TRUE(reader->isShowingLastState());
    EXPECT_EQ(errorOf([&] { commit(*reader, {set(fileAddress(u"c"))}); }).kind(),
              StoreError::Kind::Unreachable);

    server->cancelPlan();
    commit(*reader, {set(fileAddress(u"c"))});
    EXPECT_FALSE(reader->isShowingLastState());
    EXPECT_EQ(contentOf(*reader), files({u"a", u"b", u"c"}));
    EXPECT_FALSE(reader->isShowingLastState());
}

TEST_F(JournalBackendReading, aConnectionThatIsLostDuringACheckIsNotNoticed) {
    prepare({u"a"});
    auto const reader = open();
    for (Fault const fault : {Fault::LostBefore, Fault::LostAfter}) {
        server->plan(fault, 0);
        EXPECT_EQ(contentOf(*reader), files({u"a"}));
        EXPECT_FALSE(server->cancelPlan());
    }
}

TEST_F(JournalBackendReading, theTextForACopyIsCanonical) {
    prepare({u"b"});
    commit(*open(), {set(fileAddress(u"a"))});

    EXPECT_EQ(open()->text(), textOf(addFiles({u"a", u"b"})));
    EXPECT_EQ(JournalBackend(std::make_unique<MemoryJournal>(std::make_shared<JournalServer>())).text(),
              textOf({}));
}

TEST_F(JournalBackendReading, theStatusShowsTheNewestEntryAndTheSizes) {
    prepare({u"a"});
    commit(*open(), {set(fileAddress(u"b"))});

    auto const status = open()->status();

    EXPECT_EQ(status.newest, server->entry(2).read.position);
    EXPECT_EQ(status.bodySize, textOf(addFiles({u"a"})).size());
    EXPECT_EQ(status.tailSize, server->entry(2).read.lines.size());
}

} // namespace

} // namespace project::test
