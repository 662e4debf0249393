#include "support/TextStore.hpp"

using testing::ElementsAreArray;
using testing::IsEmpty;

namespace project::test {

namespace {

using Calls = std::vector<std::string>;

/// The first lock of a process, and any lock after another program's write: leftovers are searched.
Calls const lockAndClear{
    "openFolder", "lock", "isFolderInPlace", "identify project.jsonl", "list", "identify project.jsonl"};
Calls const lockAgain{"openFolder", "lock", "isFolderInPlace", "identify project.jsonl"};
Calls const checkForChanges{"identifyByPath project.jsonl"};
Calls const readForTheFirstTime{"openFolder", "read project.jsonl"};
Calls const readInLockedFolder{"read project.jsonl"};
Calls const findNoStore{"read project.jsonl", "identify .gitattributes"};
Calls const lookAndRead{"identifyByPath project.jsonl", "openFolder", "read project.jsonl"};
Calls const isInPlace{"isFolderInPlace", "identifyByPath project.jsonl"};
Calls const append{"append project.jsonl", "sync"};
Calls const writeNewText{"create temporary like project.jsonl", "sync", "renameToFree temporary swapping",
                         "identify project.jsonl"};
Calls const exchange{"exchange swapping project.jsonl", "identify swapping", "identify project.jsonl"};
Calls const makeNamesDurable{"syncFolder", "identify swapping", "remove swapping"};

Calls joined(std::initializer_list<Calls> parts) {
    Calls result;
    for (auto const& part : parts) {
        result.insert(result.end(), part.begin(), part.end());
    }
    return result;
}

Calls const wholeAppend = joined({isInPlace, append, isInPlace});
Calls const wholeRewrite = joined({isInPlace, writeNewText, exchange, isInPlace, makeNamesDurable});
Calls const creation =
    joined({{"openFolder", "openFolder", "makeFolder"},
            lockAndClear,
            findNoStore,
            {"create temporary", "sync", "renameToFree temporary .gitattributes", "identify .gitattributes"},
            {"create temporary", "sync", "renameToFree temporary .gitignore", "identify .gitignore"},
            {"create temporary", "sync", "renameToFree temporary project.jsonl", "identify project.jsonl"},
            {"syncFolder"}});

/// The exact calls of each operation to the disk: otherwise an unnecessary sync or read would go unnoticed.
class SyncCounts : public TextStore {
protected:
    template <typename Operation>
    Calls callsOf(Operation const& operation) const {
        volume->advanceBeyondTick();
        volume->calls.clear();
        operation();
        return volume->calls;
    }

    Calls callsOfCommit(TextBackend& backend, char16_t const* file) const {
        return callsOf([&] { commit(backend, addFiles({file})); });
    }

    Calls callsOfCheck(TextBackend& backend) const {
        return callsOf([&] { contentOf(backend); });
    }
};

TEST_F(SyncCounts, aFirstBatchSyncsThreeFilesAndTheFolderAndIsThenWrittenLikeAnyOther) {
    auto const backend = open();

    EXPECT_THAT(callsOfCommit(*backend, u"a"), ElementsAreArray(joined({creation, wholeRewrite})));
    EXPECT_EQ(4U, volume->count("sync"));
    EXPECT_EQ(2U, volume->count("syncFolder"));
}

TEST_F(SyncCounts, anAppendIsOneWriteAndOneSync) {
    prepare(manyFiles(20));
    auto const backend = open(appending());
    contentOf(*backend);

    EXPECT_THAT(callsOfCommit(*backend, u"b"),
                ElementsAreArray(joined({lockAndClear, checkForChanges, wholeAppend})));
    EXPECT_THAT(callsOfCommit(*backend, u"c"),
                ElementsAreArray(joined({lockAgain, checkForChanges, wholeAppend})));
    EXPECT_EQ(1U, volume->count("sync"));
    EXPECT_EQ(0U, volume->count("syncFolder"));
}

TEST_F(SyncCounts, aRewriteIsOneSyncOfTheFileAndOneOfTheFolder) {
    prepare({u"a"});
    auto const backend = open();
    contentOf(*backend);

    EXPECT_THAT(callsOfCommit(*backend, u"b"),
                ElementsAreArray(joined({lockAndClear, checkForChanges, wholeRewrite})));
    EXPECT_THAT(callsOfCommit(*backend, u"c"),
                ElementsAreArray(joined({lockAgain, checkForChanges, wholeRewrite})));
    EXPECT_EQ(1U, volume->count("sync"));
    EXPECT_EQ(1U, volume->count("syncFolder"));
}

TEST_F(SyncCounts, aRewriteWithoutExchangeNeedsNoFurtherSync) {
    prepare({u"a"});
    volume->canExchange = false;
    auto const backend = open();
    contentOf(*backend);

    EXPECT_THAT(callsOfCommit(*backend, u"b"),
                ElementsAreArray(
                    joined({lockAndClear,
                            checkForChanges,
                            isInPlace,
                            writeNewText,
                            {"exchange swapping project.jsonl", "create temporary", "identify project.jsonl",
                             "rename swapping project.jsonl", "identify project.jsonl"},
                            isInPlace,
                            {"syncFolder", "identify temporary", "remove temporary"}})));
}

TEST_F(SyncCounts, aWriterThatHasNotReadReadsOnce) {
    prepare(manyFiles(20));

    auto const backend = open(appending());

    EXPECT_THAT(callsOfCommit(*backend, u"b"),
                ElementsAreArray(joined({lockAndClear, readInLockedFolder, wholeAppend})));
}

TEST_F(SyncCounts, tidyingIsARewriteUnlessTheTextIsTidy) {
    prepareText(textOf(addFiles(manyFiles(20)), {addFiles({u"b"})}));
    auto const backend = open(appending());
    contentOf(*backend);
    auto const tidy = [&] { backend->tidy(); };

    EXPECT_THAT(callsOf(tidy), ElementsAreArray(joined({lockAndClear, checkForChanges, wholeRewrite})));
    EXPECT_THAT(callsOf(tidy), ElementsAreArray(joined({lockAndClear, checkForChanges})));
    EXPECT_THAT(callsOf(tidy), ElementsAreArray(joined({lockAgain, checkForChanges})));
}

TEST_F(SyncCounts, closingRewritesAfterAnAppendAndOtherwiseDoesNothing) {
    prepare(manyFiles(20));
    auto reader = open(appending());
    auto rewriter = open();
    auto appender = open(appending());
    contentOf(*reader);
    commit(*rewriter, addFiles({u"b"}));
    commit(*appender, addFiles({u"c"}));

    EXPECT_THAT(callsOf([&] { appender.reset(); }),
                ElementsAreArray(joined({lockAgain, checkForChanges, wholeRewrite})));
    EXPECT_THAT(callsOf([&] { rewriter.reset(); }), IsEmpty());
    EXPECT_THAT(callsOf([&] { reader.reset(); }), IsEmpty());
}

TEST_F(SyncCounts, repairMakesTheDamagedLinesDurableFirst) {
    auto damaged = textOf(addFiles({u"a", u"b", u"c"}));
    damaged.replace(damaged.find("\"b\""), 3, "\"b  ");
    prepareText(damaged);
    auto const backend = open();

    EXPECT_THAT(
        callsOf([&] { backend->repair(); }),
        ElementsAreArray(joined(
            {lockAndClear, readInLockedFolder, {"create damaged", "sync", "syncFolder"}, wholeRewrite})));
}

TEST_F(SyncCounts, resolvingIsARewrite) {
    auto conflict = textOf(addFiles({u"a", u"d"}));
    conflict.insert(conflict.find("\"d\""), "<<<<<<< ours\n\"b\"\n=======\n\"c\"\n>>>>>>> theirs\n");
    prepareText(conflict);
    auto const backend = open();

    EXPECT_THAT(callsOf([&] { backend->resolve(textOf(addFiles({u"a"}))); }),
                ElementsAreArray(joined({lockAndClear, readInLockedFolder, wholeRewrite})));
}

TEST_F(SyncCounts, discardingABatchSyncsNothing) {
    prepare({u"a"});
    auto const backend = open();
    contentOf(*backend);

    EXPECT_THAT(callsOf([&] {
                    Entered const entered(*backend, Access::Write);
                    backend->write(addFiles({u"b"}));
                    backend->discard();
                }),
                ElementsAreArray(joined({lockAndClear, checkForChanges})));
}

TEST_F(SyncCounts, discardingAFirstBatchDeletesTheNewFilesAndSyncsNothing) {
    auto const backend = open();

    EXPECT_THAT(callsOf([&] {
                    Entered const entered(*backend, Access::Write);
                    backend->write(addFiles({u"b"}));
                    backend->discard();
                }),
                ElementsAreArray(joined({creation,
                                         {"identify project.jsonl", "remove project.jsonl",
                                          "identify .gitattributes", "remove .gitattributes",
                                          "identify .gitignore", "remove .gitignore", "removeFolder"}})));
}

TEST_F(SyncCounts, aCheckForChangesIsOneCallAndReadsOnlyAppendedBatches) {
    prepare(manyFiles(20));
    auto const reader = open(appending());
    auto const writer = open(appending());

    EXPECT_THAT(callsOfCheck(*reader), ElementsAreArray(readForTheFirstTime));
    EXPECT_THAT(callsOfCheck(*reader), ElementsAreArray(checkForChanges));
    commit(*writer, addFiles({u"b"}));
    EXPECT_THAT(callsOfCheck(*reader), ElementsAreArray(lookAndRead));
    EXPECT_THAT(callsOfCheck(*reader), ElementsAreArray(checkForChanges));
    EXPECT_THAT(callsOfCheck(*writer), ElementsAreArray(checkForChanges))
        << "it does not read its own batch again";
    writer->tidy();
    EXPECT_THAT(callsOfCheck(*reader), ElementsAreArray(lookAndRead));
    EXPECT_THAT(callsOfCheck(*reader), ElementsAreArray(checkForChanges));
}

TEST_F(SyncCounts, aFileSystemWithoutStampsCostsOneMoreReadAfterAWrite) {
    prepare({u"a"});
    volume->keepsStamps = false;
    auto const backend = open();
    commit(*backend, addFiles({u"b"}));

    EXPECT_THAT(callsOfCheck(*backend), ElementsAreArray(lookAndRead));
    EXPECT_THAT(callsOfCheck(*backend), ElementsAreArray(checkForChanges));
}

TEST_F(SyncCounts, aWriterThatFindsTheLeftoversOfADeadOneSyncsTheFolderOnceMore) {
    prepare({u"a"});
    volume->replaceFile("project.jsonl.1-0123456789abcdef.tmp", "half");
    auto const backend = open();
    contentOf(*backend);

    EXPECT_THAT(callsOfCommit(*backend, u"b"),
                ElementsAreArray(joined(
                    {{"openFolder", "lock", "isFolderInPlace", "identify project.jsonl", "list", "syncFolder",
                      "identify temporary", "remove temporary", "identify project.jsonl"},
                     checkForChanges,
                     wholeRewrite})));
}

} // namespace

} // namespace project::test
