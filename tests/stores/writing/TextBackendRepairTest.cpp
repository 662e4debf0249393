#include "support/TextStore.hpp"

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::SizeIs;

namespace project::test {

namespace {

using stores::Fault;

class TextBackendRepair : public TextStore {
protected:
    std::string damaged() const {
        auto bytes = textOf(addFiles({u"a", u"b", u"c"}));
        return bytes.replace(bytes.find("\"b\""), 3, "\"b  ");
    }
};

TEST_F(TextBackendRepair, closingAStoreThatHasAppendedTidiesIt) {
    prepare(manyFiles(20));
    {
        auto const backend = open(appending());
        commit(*backend, addFiles({u"b"}));
        ASSERT_THAT(text(), HasSubstr("batch"));
    }

    auto all = manyFiles(20);
    all.push_back(u"b");
    EXPECT_EQ(textOf(addFiles(all)), text());
}

TEST_F(TextBackendRepair, closingAStoreThatHasOnlyReadChangesNothing) {
    auto const tailed = textOf(addFiles(manyFiles(20)), {addFiles({u"b"})});
    prepareText(tailed);
    contentOf(*open(appending()));

    EXPECT_EQ(tailed, text());
}

TEST_F(TextBackendRepair, closingAStoreThatAnotherProcessIsWritingChangesNothingAndDoesNotWait) {
    prepare(manyFiles(20));
    auto backend = open(appending());
    commit(*backend, addFiles({u"b"}));
    auto const tailed = text();
    auto const other = open(appending());
    Entered const theirs(*other, Access::Write);
    volume->calls.clear();

    backend.reset();

    EXPECT_EQ(tailed, text());
    EXPECT_THAT(writes(), IsEmpty());
}

TEST_F(TextBackendRepair, closingAStoreWhoseDiskFailsThrowsNothingAndLosesNothing) {
    prepare(manyFiles(20));
    auto backend = open(appending());
    commit(*backend, addFiles({u"b"}));
    auto const tailed = text();
    volume->plan(CrashingVolume::InjectedFault::FailsForGood, 0);

    backend.reset();

    volume->cancelPlan();
    EXPECT_EQ(tailed, text());
}

TEST_F(TextBackendRepair, tidyWritesTheBodyWithoutATailAndOnlyOnce) {
    prepareText(textOf(addFiles(manyFiles(20)), {addFiles({u"b"}), {remove(fileAddress(u"many/0000"))}}));
    auto const backend = open(appending());
    auto const before = contentOf(*backend);

    EXPECT_TRUE(backend->tidy());

    EXPECT_EQ(before, contentOf(*backend));
    EXPECT_EQ(before, stored());
    EXPECT_EQ(std::string::npos, text().find("batch"));
    writes();
    EXPECT_FALSE(backend->tidy());
    EXPECT_THAT(writes(), IsEmpty());
}

TEST_F(TextBackendRepair, tidyCreatesNoStore) {
    EXPECT_FALSE(open()->tidy());
    EXPECT_FALSE(volume->hasFolder());
}

TEST_F(TextBackendRepair, changesThatTidyFoundAreReportedByTheNextGuard) {
    prepareText(textOf(addFiles(manyFiles(20))));
    auto const backend = open(appending());
    contentOf(*backend);
    volume->replaceFile("project.jsonl", textOf(addFiles(manyFiles(20)), {addFiles({u"b"})}));

    EXPECT_TRUE(backend->tidy());

    Entered const entered(*backend);
    EXPECT_THAT(addressesOf(entered.changes().differences), ElementsAre(fileAddress(u"b")));
}

TEST_F(TextBackendRepair, aDamagedTextIsNotTidied) {
    prepareText(damaged());

    EXPECT_EQ(3U, errorOf([&] { open()->tidy(); }).line());
    EXPECT_EQ(damaged(), text());
}

TEST_F(TextBackendRepair, tidyWaitsForAnotherWriterAndReleasesTheLock) {
    prepareText(textOf(addFiles({u"a"}), {addFiles({u"b"})}));
    auto const backend = open();
    {
        auto const other = open();
        Entered const theirs(*other, Access::Write);
        EXPECT_EQ(StoreError::Kind::Busy, errorOf([&] { backend->tidy(); }).kind());
    }
    EXPECT_TRUE(backend->tidy());

    EXPECT_NO_THROW(commit(*open(), addFiles({u"c"})));
}

TEST_F(TextBackendRepair, checkReportsAllFaultsByLineAndTakesNoLock) {
    prepareText(damaged() + "\"torn");
    auto const other = open();
    Entered const theirs(*other, Access::Write);

    auto const faults = open()->check();

    ASSERT_THAT(faults, SizeIs(2));
    EXPECT_EQ(Fault::Kind::Damage, faults[0].kind);
    EXPECT_EQ(3U, faults[0].line);
    EXPECT_EQ(Fault::Kind::TornTail, faults[1].kind);
    EXPECT_EQ(6U, faults[1].line);
}

TEST_F(TextBackendRepair, checkFindsNothingInAGoodTextAndWhereThereIsNoStore) {
    EXPECT_THAT(open()->check(), IsEmpty());
    prepare({u"a"});
    EXPECT_THAT(open()->check(), IsEmpty());
}

TEST_F(TextBackendRepair, checkReadsTheTextWhateverItsTimesSay) {
    prepare({u"a", u"b", u"c"});
    auto const backend = open();
    contentOf(*backend);
    volume->calls.clear();

    backend->check();

    EXPECT_EQ(1U, volume->count("read project.jsonl"));
}

TEST_F(TextBackendRepair, repairSetsDamageAsideAndAllowsWritesAgain) {
    prepareText(damaged());
    auto const backend = open();
    EXPECT_THROW(commit(*backend, addFiles({u"d"})), StoreError);

    auto const aside = backend->repair();

    EXPECT_EQ("\"b  \n", volume->content(aside));
    EXPECT_EQ(textOf(addFiles({u"a", u"c"})), text());
    EXPECT_THAT(aside, testing::StartsWith("damaged-"));
    commit(*backend, addFiles({u"d"}));
    EXPECT_EQ(contentAfter({addFiles({u"a", u"c", u"d"})}), stored());
    EXPECT_EQ("", backend->repair());
}

TEST_F(TextBackendRepair, theDamagedLinesAreDurableBeforeTheTextOmitsThem) {
    for (unsigned seed = 0; seed < 20; ++seed) {
        bool wasReached = true;
        for (std::size_t call = 0; wasReached; ++call) {
            *volume = CrashingVolume(seed);
            prepareText(damaged());
            auto const backend = open();
            volume->plan(CrashingVolume::InjectedFault::Dies, call);
            try {
                backend->repair();
            } catch (ProcessDied const&) {
            }
            wasReached = !volume->cancelPlan();
            volume->powerCut();

            bool const isInText = text() == damaged();
            bool isAside = false;
            for (auto const& name : volume->namesLike("damaged-")) {
                isAside = isAside || volume->content(name) == "\"b  \n";
            }
            EXPECT_TRUE(isInText || isAside) << call << " of " << seed;
        }
    }
}

TEST_F(TextBackendRepair, resolvingReplacesTheTextWithMarkers) {
    auto const resolved = textOf(addFiles({u"a", u"b"}));
    auto conflict = textOf(addFiles({u"a", u"d"}));
    conflict.insert(conflict.find("\"d\""), "<<<<<<< ours\n\"b\"\n=======\n\"c\"\n>>>>>>> theirs\n");
    prepareText(conflict);
    auto const backend = open();

    backend->resolve(resolved);

    EXPECT_EQ(text(), resolved);
    EXPECT_EQ(contentOf(*backend), contentAfter({addFiles({u"a", u"b"})}));
    commit(*backend, addFiles({u"e"}));
}

TEST_F(TextBackendRepair, aFailedResolveRestoresTheMarkers) {
    auto const resolved = textOf(addFiles({u"a", u"b"}));
    auto conflict = textOf(addFiles({u"a", u"d"}));
    conflict.insert(conflict.find("\"d\""), "<<<<<<< ours\n\"b\"\n=======\n\"c\"\n>>>>>>> theirs\n");
    prepareText(conflict);
    auto const backend = open();
    failOnce("syncFolder");

    EXPECT_EQ("Input/output error", errorOf([&] { backend->resolve(resolved); }).problem());

    EXPECT_EQ(conflict, text());
    EXPECT_EQ(contentAfter({addFiles({u"a", u"b", u"c", u"d"})}), contentOf(*backend));
    EXPECT_THROW(commit(*backend, addFiles({u"e"})), StoreError) << "the conflict is not resolved yet";
    backend->resolve(resolved);
    EXPECT_EQ(resolved, text());
}

TEST_F(TextBackendRepair, resolvingChangesNothingWithoutAConflict) {
    auto const sound = textOf(addFiles({u"a"}));
    prepareText(sound);
    auto const backend = open();

    EXPECT_EQ(StoreError::Kind::Refused, errorOf([&] { backend->resolve(textOf(addFiles({u"b"}))); }).kind());
    EXPECT_EQ(text(), sound);
}

TEST_F(TextBackendRepair, resolvingRefusesAnUnsoundText) {
    auto conflict = textOf(addFiles({u"a", u"d"}));
    conflict.insert(conflict.find("\"d\""), "<<<<<<< ours\n\"b\"\n=======\n\"c\"\n>>>>>>> theirs\n");
    prepareText(conflict);
    auto const backend = open();
    auto const sound = textOf(addFiles({u"a"}));

    for (auto const& bad : {conflict, sound.substr(0, sound.size() / 2), std::string(),
                            std::string(sound).insert(sound.find("\"a\""), "damage\n")}) {
        EXPECT_EQ(StoreError::Kind::Refused, errorOf([&] { backend->resolve(bad); }).kind());
        EXPECT_EQ(text(), conflict);
    }
}

TEST_F(TextBackendRepair, repairKeepsConflictMarkers) {
    auto conflict = textOf(addFiles({u"a", u"d"}));
    conflict.insert(conflict.find("\"d\""), "<<<<<<< ours\n\"b\"\n=======\n\"c\"\n>>>>>>> theirs\n");
    prepareText(conflict);

    EXPECT_EQ(3U, errorOf([&] { open()->repair(); }).line());

    EXPECT_EQ(conflict, text());
}

} // namespace

} // namespace project::test
