#include "support/TextStore.hpp"

using testing::Contains;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;
using testing::UnorderedElementsAre;

namespace project::test {

namespace {

class TextBackendReading : public TextStore {
protected:
    /// The calls of one guard to read.
    std::vector<std::string> callsOfALook(TextBackend& backend) const {
        volume->calls.clear();
        Entered const entered(backend);
        return volume->calls;
    }
};

TEST_F(TextBackendReading, aProjectWithoutAStoreIsEmpty) {
    auto const backend = open();

    EXPECT_THAT(contentOf(*backend), IsEmpty());
    EXPECT_THAT(volume->calls, ElementsAre("openFolder"));
}

TEST_F(TextBackendReading, aFolderWithoutATextIsEmpty) {
    volume->makeFolder();

    EXPECT_THAT(contentOf(*open()), IsEmpty());
}

TEST_F(TextBackendReading, theFirstGuardReadsTheTextAndTakesNoLock) {
    prepare({u"a"});
    auto const backend = open();

    EXPECT_THAT(callsOfALook(*backend), ElementsAre("openFolder", "read project.jsonl"));
    EXPECT_EQ(contentAfter({addFiles({u"a"})}), contentOf(*backend));
}

TEST_F(TextBackendReading, aTextWithAnOldStampIsCheckedWithOneCallAndNotRead) {
    prepare({u"a"});
    auto const backend = open();
    contentOf(*backend);

    EXPECT_THAT(callsOfALook(*backend), ElementsAre("identifyByPath project.jsonl"));
}

TEST_F(TextBackendReading, ourOwnBatchIsNotReadAgain) {
    for (auto const& options : {rewriting(), appending()}) {
        prepare(manyFiles(20));
        auto const backend = open(options);
        commit(*backend, addFiles({u"b"}));

        EXPECT_THAT(callsOfALook(*backend), ElementsAre("identifyByPath project.jsonl"));
        commit(*backend, {remove(fileAddress(u"b"))});
    }
}

TEST_F(TextBackendReading, withoutStampsOurOwnBatchIsComparedByContentOnce) {
    volume->keepsStamps = false;
    prepare(manyFiles(20));
    for (auto const& options : {rewriting(), appending()}) {
        auto const backend = open(options);
        commit(*backend, addFiles({u"b"}));
        EXPECT_THAT(callsOfALook(*backend), Contains("read project.jsonl"));

        volume->advanceBeyondTick();
        contentOf(*backend);

        EXPECT_THAT(callsOfALook(*backend), ElementsAre("identifyByPath project.jsonl"));
        commit(*backend, {remove(fileAddress(u"b"))});
    }
}

TEST_F(TextBackendReading, aChangeByOthersOfTheSameLengthRightAfterOurBatchIsNoticed) {
    for (bool const stamps : {true, false}) {
        volume->keepsStamps = stamps;
        prepare({u"a"});
        auto const backend = open();
        commit(*backend, addFiles({u"b"}));

        volume->overwrite("project.jsonl", textOf(addFiles({u"a", u"c"})));

        Entered const entered(*backend);
        EXPECT_THAT(addressesOf(entered.changes().differences),
                    UnorderedElementsAre(fileAddress(u"b"), fileAddress(u"c")));
        EXPECT_EQ(contentAfter({addFiles({u"a", u"c"})}), loadAll(*backend));
    }
}

TEST_F(TextBackendReading, aChangeWithinTheTickInWhichAYoungTextWasReadIsNoticed) {
    prepare({u"a"});
    volume->replaceFile("project.jsonl", textOf(addFiles({u"b"})));
    auto const backend = open();
    contentOf(*backend);

    volume->overwrite("project.jsonl", textOf(addFiles({u"c"})));

    EXPECT_EQ(contentAfter({addFiles({u"c"})}), contentOf(*backend));
}

TEST_F(TextBackendReading, aTextWithTimesInTheFutureIsComparedByContent) {
    prepare({u"a"});
    volume->advance(3'600'000'000'000);
    volume->touch("project.jsonl");
    volume->advance(-3'600'000'000'000);
    auto const backend = open();
    contentOf(*backend);
    EXPECT_THAT(callsOfALook(*backend), Contains("read project.jsonl"));

    volume->advance(3'600'000'000'000 + 30'000'000);
    contentOf(*backend);

    EXPECT_THAT(callsOfALook(*backend), ElementsAre("identifyByPath project.jsonl"));
}

TEST_F(TextBackendReading, aBatchThatAnotherProcessAppendedIsReadWithoutTheRest) {
    prepare(manyFiles(20));
    auto const backend = open(appending());
    contentOf(*backend);
    auto const other = open(appending());
    commit(*other, {set(fileAddress(u"b")), remove(fileAddress(u"many/0003"))});

    Entered const entered(*backend);

    EXPECT_FALSE(entered.changes().everything);
    EXPECT_THAT(addressesOf(entered.changes().differences),
                UnorderedElementsAre(fileAddress(u"b"), fileAddress(u"many/0003")));
    EXPECT_EQ(contentOf(*other), loadAll(*backend));
}

TEST_F(TextBackendReading, severalAppendedBatchesAreReadAtOnceAndAreAppendedTo) {
    prepare(manyFiles(40));
    auto const backend = open(appending());
    contentOf(*backend);
    auto const other = open(appending());
    commit(*other, addFiles({u"b"}));
    commit(*other, addFiles({u"c"}));
    writes();

    commit(*backend, addFiles({u"d"}));

    EXPECT_THAT(writes(), ElementsAre("append project.jsonl", "sync"));
    EXPECT_EQ(textOf(addFiles(manyFiles(40)), {addFiles({u"b"}), addFiles({u"c"}), addFiles({u"d"})}),
              text());
}

TEST_F(TextBackendReading, aBatchThatIsStillBeingAppendedDoesNotCount) {
    prepare(manyFiles(20));
    auto const backend = open(appending());
    auto const before = contentOf(*backend);
    auto const whole = textOf(addFiles(manyFiles(20)), {addFiles({u"b"})});
    auto const lines = whole.substr(text().size());

    volume->append("project.jsonl", lines.substr(0, lines.size() / 2));
    EXPECT_EQ(before, contentOf(*backend));
    volume->append("project.jsonl", lines.substr(lines.size() / 2));

    EXPECT_EQ(contentAfter({addFiles(manyFiles(20)), addFiles({u"b"})}), contentOf(*backend));
}

TEST_F(TextBackendReading, aTextThatAnotherProcessRewroteIsComparedAndOnlyDifferencesCount) {
    prepare({u"a", u"b"});
    auto const backend = open();
    contentOf(*backend);
    commit(*open(), {remove(fileAddress(u"a")), set(fileAddress(u"c"))});

    Entered const entered(*backend);

    EXPECT_FALSE(entered.changes().everything);
    EXPECT_THAT(addressesOf(entered.changes().differences),
                UnorderedElementsAre(fileAddress(u"a"), fileAddress(u"c")));
}

TEST_F(TextBackendReading, aTidiedTextHasNotChanged) {
    prepareText(textOf(addFiles(manyFiles(20)), {addFiles({u"b"})}));
    auto const backend = open();
    contentOf(*backend);
    ASSERT_TRUE(open()->tidy());

    Entered const entered(*backend);

    EXPECT_FALSE(entered.changes().everything);
    EXPECT_THAT(addressesOf(entered.changes().differences), IsEmpty());
}

TEST_F(TextBackendReading, aFolderThatWasReplacedIsReadAgain) {
    prepare({u"a"});
    auto const backend = open();
    contentOf(*backend);
    volume->moveFolderAway();
    volume->replaceFile("project.jsonl", textOf(addFiles({u"b"})));

    EXPECT_EQ(contentAfter({addFiles({u"b"})}), contentOf(*backend));
}

TEST_F(TextBackendReading, anOpenGuardShowsOneStateWhateverOthersDo) {
    prepare({u"a"});
    auto const backend = open();
    Entered const entered(*backend);

    volume->replaceFile("project.jsonl", textOf(addFiles({u"b"})));

    EXPECT_EQ(contentAfter({addFiles({u"a"})}), loadAll(*backend));
}

TEST_F(TextBackendReading, aTextThatIsBeingWrittenInPiecesIsWaitedFor) {
    auto const whole = textOf(addFiles({u"a", u"b"}));
    for (std::size_t length = 0; length < whole.size(); length += 7) {
        prepareText(whole.substr(0, length));
        int pauses = 0;
        volume->beforeCall = [&](std::string const& call) {
            if (call == "pause" && ++pauses == 3) {
                volume->overwrite("project.jsonl", whole);
            }
        };

        EXPECT_EQ(contentAfter({addFiles({u"a", u"b"})}), contentOf(*open())) << length;
        EXPECT_EQ(3, pauses);
    }
}

TEST_F(TextBackendReading, aTextThatStaysIncompleteIsAnErrorAndNeverAnEmptyProject) {
    auto const whole = textOf(addFiles({u"a", u"b"}));
    for (auto const& incomplete : {std::string(), whole.substr(0, 10), whole.substr(0, whole.size() - 5)}) {
        prepareText(incomplete);

        auto const error = errorOf([&] { contentOf(*open()); });

        EXPECT_EQ("/project/.projectdata/project.jsonl", error.file());
        EXPECT_EQ(StoreError::Kind::Damaged, error.kind());
        EXPECT_THAT(error.remedy(), HasSubstr("git checkout"));
        EXPECT_THROW(commit(*open(), addFiles({u"c"})), StoreError);
        EXPECT_EQ(incomplete, text());
    }
}

TEST_F(TextBackendReading, theWaitForATextIsAsLongAsThePatience) {
    prepareText("");
    auto const backend =
        open({.patience = std::chrono::milliseconds(700), .alwaysRewritten = 0, .bodyToTail = 1});
    auto const pauses = [&] {
        volume->calls.clear();
        EXPECT_THROW(contentOf(*backend), StoreError);
        return volume->count("pause");
    };

    EXPECT_GT(pauses(), 10U);
    EXPECT_LT(pauses(), 30U);
}

TEST_F(TextBackendReading, aTextThatVanishedIsWaitedForAndThenAnError) {
    prepare({u"a"});
    auto const backend = open();
    contentOf(*backend);
    volume->remove("project.jsonl");
    EXPECT_EQ(StoreError::Kind::Damaged, errorOf([&] { contentOf(*backend); }).kind());
    volume->beforeCall = [&](std::string const& call) {
        if (call == "pause") {
            volume->replaceFile("project.jsonl", textOf(addFiles({u"b"})));
        }
    };

    EXPECT_EQ(contentAfter({addFiles({u"b"})}), contentOf(*backend));
}

TEST_F(TextBackendReading, openingAProjectWaitsForATextThatGitHasJustDeleted) {
    for (auto const access : {Access::Read, Access::Write}) {
        prepare({u"a"});
        volume->remove("project.jsonl");
        volume->beforeCall = [&](std::string const& call) {
            if (call == "pause") {
                volume->replaceFile("project.jsonl", textOf(addFiles({u"b"})));
            }
        };
        auto const backend = open();
        Entered const entered(*backend, access);

        EXPECT_EQ(contentAfter({addFiles({u"b"})}), loadAll(*backend));
    }
}

TEST_F(TextBackendReading, aStoreWhoseCreatorDiedBeforeItsTextExistedIsAnEmptyProject) {
    prepare({u"a"});
    volume->remove("project.jsonl");

    EXPECT_THAT(
        contentOf(*open({.patience = std::chrono::seconds(10), .alwaysRewritten = 0, .bodyToTail = 1})),
        IsEmpty());

    EXPECT_GT(volume->count("pause"), 3U);
    EXPECT_LT(volume->count("pause"), 15U);
    commit(*open(), addFiles({u"b"}));
    EXPECT_EQ(contentAfter({addFiles({u"b"})}), stored());
}

TEST_F(TextBackendReading, aFolderThatVanishedIsNotAnEmptyProject) {
    prepare({u"a"});
    auto const backend = open();
    contentOf(*backend);
    volume->removeFolder();

    EXPECT_THROW(contentOf(*backend), StoreError);
    EXPECT_THROW(commit(*backend, addFiles({u"b"})), StoreError);
    EXPECT_FALSE(volume->hasFolder());
}

TEST_F(TextBackendReading, aStoreWithoutNodesThatItsCreatorDiscardedIsAProjectWithoutAStore) {
    auto const maker = open();
    maker->enter(Access::Write);
    maker->write(addFiles({u"a"}));
    auto const backend = open();
    EXPECT_THAT(contentOf(*backend), IsEmpty());

    maker->discard();
    maker->leave();

    EXPECT_THAT(contentOf(*backend), IsEmpty());
    EXPECT_THAT(commit(*backend, addFiles({u"b"})).added, Not(IsEmpty()));
}

TEST_F(TextBackendReading, aNewStoreIsSeenByTheNextGuard) {
    auto const backend = open();
    contentOf(*backend);
    prepare({u"a"});

    Entered const entered(*backend);

    EXPECT_TRUE(entered.changes().everything);
    EXPECT_EQ(contentAfter({addFiles({u"a"})}), loadAll(*backend));
}

TEST_F(TextBackendReading, differencesAreListedHoweverManyTheyAre) {
    prepare({u"a"});
    auto const backend = open();
    contentOf(*backend);
    volume->replaceFile("project.jsonl", textOf(addFiles(manyFiles(10'000))));

    Entered const entered(*backend);

    EXPECT_FALSE(entered.changes().everything);
    EXPECT_EQ(entered.changes().differences.size(), 10'001U);
}

TEST_F(TextBackendReading, changesThatCheckFoundAreReportedByTheNextGuard) {
    prepare({u"a"});
    auto const backend = open();
    contentOf(*backend);
    commit(*open(), addFiles({u"b"}));
    backend->check();

    Entered const entered(*backend);

    EXPECT_THAT(addressesOf(entered.changes().differences), ElementsAre(fileAddress(u"b")));
}

TEST_F(TextBackendReading, aTextInAnotherFormatIsAnErrorWithItsLine) {
    prepareText("hello\n");

    auto const error = errorOf([&] { contentOf(*open()); });

    EXPECT_EQ(StoreError::Kind::Damaged, error.kind());
    EXPECT_EQ("/project/.projectdata/project.jsonl", error.file());
    EXPECT_EQ(1U, error.line());
}

TEST_F(TextBackendReading, aPipeInThePlaceOfTheTextIsAnError) {
    prepare({u"a"});
    auto const backend = open();
    contentOf(*backend);
    volume->putPipe("project.jsonl");

    EXPECT_THROW(contentOf(*backend), StoreError);
    EXPECT_THROW(contentOf(*open()), StoreError);
    EXPECT_THROW(commit(*open(), addFiles({u"b"})), StoreError);
}

} // namespace

} // namespace project::test
