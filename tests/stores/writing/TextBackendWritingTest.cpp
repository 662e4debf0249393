#include "support/TextStore.hpp"

using testing::ElementsAre;
using testing::ElementsAreArray;
using testing::HasSubstr;
using testing::IsEmpty;

namespace project::test {

namespace {

/// The calls of a rewrite, without the checks before and after it.
auto const rewrite = {"create temporary like project.jsonl", "sync",       "renameToFree temporary swapping",
                      "exchange swapping project.jsonl",     "syncFolder", "remove swapping"};

class TextBackendWriting : public TextStore {};

TEST_F(TextBackendWriting, nothingIsWrittenBeforeTheFirstBatch) {
    {
        auto const backend = open();
        Entered const entered(*backend, Access::Write);
        EXPECT_THAT(backend->load(Address::root()), IsEmpty());
    }

    EXPECT_FALSE(volume->hasFolder());
    EXPECT_THAT(writes(), IsEmpty());
}

TEST_F(TextBackendWriting, theFirstBatchCreatesTheStoreBeforeWriteReturns) {
    auto const backend = open();
    Entered const entered(*backend, Access::Write);

    auto const files = backend->write(addFiles({u"a"}));

    EXPECT_THAT(files.added, ElementsAre(Path(u"/project/.projectdata/.gitattributes"),
                                         Path(u"/project/.projectdata/.gitignore"),
                                         Path(u"/project/.projectdata/project.jsonl")));
    EXPECT_THAT(files.removed, IsEmpty());
    EXPECT_THAT(writes(), ElementsAre("makeFolder", "create temporary", "sync",
                                      "renameToFree temporary .gitattributes", "create temporary", "sync",
                                      "renameToFree temporary .gitignore", "create temporary", "sync",
                                      "renameToFree temporary project.jsonl", "syncFolder"));
    EXPECT_EQ(textOf({}), text());
    EXPECT_EQ("project.jsonl -text merge=project-definition\n", volume->content(".gitattributes"));
    EXPECT_EQ("/project.jsonl.*.tmp\n/damaged-*\n/displaced-*\n/local/\n", volume->content(".gitignore"));
    EXPECT_THAT(stored(), IsEmpty());
}

TEST_F(TextBackendWriting, theNewStoreSurvivesAPowerCutBeforeKeep) {
    auto const backend = open();
    backend->enter(Access::Write);
    backend->write(addFiles({u"a"}));

    volume->powerCut();

    EXPECT_THAT(volume->names(), ElementsAre(".gitattributes", ".gitignore", "project.jsonl"));
    EXPECT_EQ(textOf({}), text());
}

TEST_F(TextBackendWriting, existingFilesOfANewStoreAreNotCreatedAgain) {
    volume->makeFolder();
    volume->replaceFile(".gitattributes", "* text\n");
    auto const backend = open();

    auto const files = commit(*backend, addFiles({u"a"}));

    EXPECT_THAT(files.added, ElementsAre(Path(u"/project/.projectdata/.gitignore"),
                                         Path(u"/project/.projectdata/project.jsonl")));
    EXPECT_EQ("* text\n", volume->content(".gitattributes"));
    EXPECT_EQ(contentAfter({addFiles({u"a"})}), stored());
}

TEST_F(TextBackendWriting, discardingTheFirstBatchDeletesTheStoreSoThatItIsReportedAgain) {
    auto const backend = open();
    Entered const entered(*backend, Access::Write);
    auto const first = backend->write(addFiles({u"a"}));

    backend->discard();

    EXPECT_FALSE(volume->hasFolder());
    EXPECT_THAT(loadAll(*backend), IsEmpty());
    EXPECT_EQ(first.added, backend->write(addFiles({u"a"})).added);
    backend->keep();
    EXPECT_EQ(contentAfter({addFiles({u"a"})}), stored());
}

TEST_F(TextBackendWriting, discardingTheFirstBatchKeepsAStoreThatAnotherProgramChanged) {
    auto const backend = open();
    Entered const entered(*backend, Access::Write);
    backend->write(addFiles({u"a"}));
    auto const theirs = textOf(addFiles({u"b"}));
    volume->replaceFile("project.jsonl", theirs);

    backend->discard();

    EXPECT_EQ(theirs, text());
    EXPECT_TRUE(volume->has(".gitignore"));
}

TEST_F(TextBackendWriting, discardingALaterBatchLeavesTheStore) {
    prepare({u"a"});
    auto const before = text();
    auto const backend = open();
    Entered const entered(*backend, Access::Write);
    backend->write(addFiles({u"b"}));

    backend->discard();

    EXPECT_EQ(before, text());
    EXPECT_EQ(contentAfter({addFiles({u"a"})}), loadAll(*backend));
}

TEST_F(TextBackendWriting, aFirstBatchWhoseFilesCannotBeCreatedLeavesNothing) {
    for (std::size_t room : {std::size_t{0}, std::size_t{50}, std::size_t{150}}) {
        volume->room = room;
        auto const backend = open();

        auto const error = errorOf([&] { commit(*backend, addFiles({u"a"})); });

        EXPECT_EQ("Make room on the disk and try again.", error.remedy());
        EXPECT_FALSE(volume->hasFolder()) << room;
    }
}

TEST_F(TextBackendWriting, writeChangesNothingOnDiskAndLoadIncludesTheBatch) {
    prepare({u"a", u"b"});
    for (auto const& options : {rewriting(), appending()}) {
        auto const before = text();
        auto const backend = open(options);
        Entered const entered(*backend, Access::Write);
        Batch const batch{set(fileAddress(u"c")), remove(fileAddress(u"a"))};

        backend->write(batch);

        EXPECT_EQ(contentAfter({addFiles({u"a", u"b"}), batch}), loadAll(*backend));
        EXPECT_EQ(before, text());
        EXPECT_THAT(writes(), IsEmpty());
        backend->discard();
        EXPECT_EQ(contentAfter({addFiles({u"a", u"b"})}), loadAll(*backend));
    }
}

TEST_F(TextBackendWriting, aShortTextIsRewrittenWithOneSyncOfTheFileAndOneOfTheFolder) {
    prepare({u"a"});
    auto const backend = open();

    auto const files = commit(*backend, addFiles({u"b"}));

    EXPECT_THAT(files.added, IsEmpty());
    EXPECT_THAT(writes(), ElementsAreArray(rewrite));
    EXPECT_EQ(textOf(addFiles({u"a", u"b"})), text());
}

TEST_F(TextBackendWriting, withoutExchangeTheNewFileIsRenamedOverTheOldOne) {
    prepare({u"a"});
    volume->canExchange = false;
    auto const backend = open();

    commit(*backend, addFiles({u"b"}));

    EXPECT_THAT(writes(),
                ElementsAre("create temporary like project.jsonl", "sync", "renameToFree temporary swapping",
                            "exchange swapping project.jsonl", "create temporary",
                            "rename swapping project.jsonl", "syncFolder", "remove temporary"));
    EXPECT_EQ(textOf(addFiles({u"a", u"b"})), text());
}

TEST_F(TextBackendWriting, aSmallBatchIsAppendedToALongBodyWithOneWriteAndOneSync) {
    prepare(manyFiles(20));
    auto const backend = open(appending());

    commit(*backend, addFiles({u"b"}));

    EXPECT_THAT(writes(), ElementsAre("append project.jsonl", "sync"));
    EXPECT_EQ(textOf(addFiles(manyFiles(20)), {addFiles({u"b"})}), text());
}

TEST_F(TextBackendWriting, aBodyOfExactlyTheLimitIsRewrittenAndALongerOneIsNot) {
    prepare(manyFiles(20));
    auto options = appending();
    options.alwaysRewritten = text().size();
    commit(*open(options), {set(fileAddress(u"many/0000"), makeNode(u"x", {}))});
    EXPECT_THAT(writes(), ElementsAreArray(rewrite));

    options.alwaysRewritten = text().size() - 1;
    commit(*open(options), addFiles({u"b"}));
    EXPECT_EQ("append project.jsonl", writes().front());
}

TEST_F(TextBackendWriting, theTailGrowsUpToItsShareOfTheBodyAndNotBeyond) {
    prepare(manyFiles(20));
    auto const body = text().size();
    auto const tail = textOf(addFiles(manyFiles(20)), {addFiles({u"b"}), addFiles({u"c"})}).size() - body;
    auto options = appending();
    options.bodyToTail = body / tail; // so that two batches fit, whatever is left over
    ASSERT_GE(body / options.bodyToTail, tail);
    ASSERT_LT(body / options.bodyToTail, tail / 2 * 3);
    auto const backend = open(options);
    commit(*backend, addFiles({u"b"}));
    commit(*backend, addFiles({u"c"}));
    EXPECT_THAT(writes(), ElementsAre("append project.jsonl", "sync", "append project.jsonl", "sync"));

    commit(*backend, addFiles({u"d"}));

    EXPECT_THAT(writes(), ElementsAreArray(rewrite));
    auto all = manyFiles(20);
    all.insert(all.end(), {u"b", u"c", u"d"});
    EXPECT_EQ(textOf(addFiles(all)), text());
}

TEST_F(TextBackendWriting, theLimitsAreAQuarterOfAMebibyteAndASixteenth) {
    TextBackend::Options const usual;
    prepare(manyFiles(25'000, u"a folder with a long name")); // 0.9 MB: the tail may have 57 KB
    auto const backend = open(usual);

    commit(*backend, addFiles(manyFiles(1'000, u"a folder with another name")));
    EXPECT_THAT(writes(), ElementsAre("append project.jsonl", "sync"));
    commit(*backend, addFiles(manyFiles(1'000, u"yet another folder's name")));
    EXPECT_THAT(writes(), ElementsAreArray(rewrite));

    volume->replaceFile("project.jsonl", textOf(addFiles(manyFiles(6'000, u"a folder with a long name"))));
    ASSERT_LT(text().size(), 256U * 1024U);
    commit(*backend, addFiles({u"a"}));
    EXPECT_THAT(writes(), ElementsAreArray(rewrite));
}

TEST_F(TextBackendWriting, aTornTailIsDroppedByTheNextBatchAndNeverCounts) {
    auto const body = textOf(addFiles(manyFiles(20)));
    prepareText(body + "\"torn\"\n{\"bat");
    auto const backend = open(appending());
    EXPECT_EQ(contentAfter({addFiles(manyFiles(20))}), contentOf(*backend));

    commit(*backend, addFiles({u"b"}));

    EXPECT_THAT(writes(), ElementsAreArray(rewrite));
    auto all = manyFiles(20);
    all.push_back(u"b");
    EXPECT_EQ(textOf(addFiles(all)), text());
}

TEST_F(TextBackendWriting, evenASingleTornByteIsDroppedWhenTheStoreIsClosed) {
    auto backend = open();
    commit(*backend, addFiles({u"a"}));
    volume->append("project.jsonl", "{");
    EXPECT_EQ(contentAfter({addFiles({u"a"})}), contentOf(*backend));

    backend.reset();

    EXPECT_EQ(textOf(addFiles({u"a"})), text());
}

TEST_F(TextBackendWriting, anIrregularTextIsRewritten) {
    auto const lines = textOf(addFiles({u"a", u"b"}));
    auto const swapped =
        lines.substr(0, lines.find("\"a\"")) + "\"b\"\n\"a\"\n" + lines.substr(lines.find("\"b\"\n") + 4);
    prepareText(swapped);

    commit(*open(appending()), addFiles({u"c"}));

    EXPECT_THAT(writes(), ElementsAreArray(rewrite));
    EXPECT_EQ(textOf(addFiles({u"a", u"b", u"c"})), text());
}

TEST_F(TextBackendWriting, aBodyThatIsNotCanonicalIsRewritten) {
    auto other = textOf(addFiles(manyFiles(20)));
    other.insert(other.find("\"many/0007\""), " ");
    prepareText(other);
    auto const backend = open(appending());
    ASSERT_EQ(contentAfter({addFiles(manyFiles(20))}), contentOf(*backend));

    commit(*backend, addFiles({u"b"}));

    EXPECT_THAT(writes(), ElementsAreArray(rewrite));
}

TEST_F(TextBackendWriting, aDamagedTextIsReadAndRefusesWrites) {
    auto damaged = textOf(addFiles({u"a", u"b", u"c"}));
    damaged.replace(damaged.find("\"b\""), 3, "\"b  ");
    prepareText(damaged);
    auto const backend = open();
    EXPECT_EQ(contentAfter({addFiles({u"a", u"c"})}), contentOf(*backend));

    auto const error = errorOf([&] { commit(*backend, addFiles({u"d"})); });

    EXPECT_EQ(StoreError::Kind::Damaged, error.kind());
    EXPECT_EQ("/project/.projectdata/project.jsonl", error.file());
    EXPECT_EQ(3U, error.line());
    EXPECT_THAT(error.remedy(), HasSubstr("projectctl check --repair"));
    EXPECT_EQ(damaged, text());
}

TEST_F(TextBackendWriting, aTextWithConflictMarkersIsReadWithBothSidesAndRefusesWrites) {
    auto conflict = textOf(addFiles({u"a", u"d"}));
    conflict.insert(conflict.find("\"d\""), "<<<<<<< ours\n\"b\"\n=======\n\"c\"\n>>>>>>> theirs\n");
    prepareText(conflict);
    auto const backend = open();
    EXPECT_EQ(contentAfter({addFiles({u"a", u"b", u"c", u"d"})}), contentOf(*backend));

    auto const error = errorOf([&] { commit(*backend, addFiles({u"e"})); });

    EXPECT_EQ(StoreError::Kind::Conflict, error.kind());
    EXPECT_EQ(3U, error.line());
    EXPECT_THAT(error.remedy(), HasSubstr("projectctl resolve"));
    EXPECT_EQ(conflict, text());
}

TEST_F(TextBackendWriting, aTextOfALaterFormatIsNeitherReadNorWritten) {
    auto later = textOf(addFiles({u"a"}));
    later.replace(later.find("\"version\":1"), 11, "\"version\":2");
    prepareText(later);
    auto const backend = open();

    for (auto const& error :
         {errorOf([&] { contentOf(*backend); }), errorOf([&] { commit(*backend, addFiles({u"b"})); })}) {
        EXPECT_EQ(StoreError::Kind::Refused, error.kind());
        EXPECT_EQ(1U, error.line());
    }
    EXPECT_EQ(later, text());
}

TEST_F(TextBackendWriting, aFullDiskLeavesTheProjectAsItWasAndTheNextBatchRepairsTheTail) {
    prepare(manyFiles(20));
    auto const backend = open(appending());
    volume->room = 20;

    auto const error = errorOf([&] { commit(*backend, addFiles({u"b"})); });

    EXPECT_EQ(StoreError::Kind::DiskFailed, error.kind());
    EXPECT_EQ("No space left on device", error.problem());
    EXPECT_EQ(contentAfter({addFiles(manyFiles(20))}), contentOf(*backend));
    EXPECT_EQ(contentAfter({addFiles(manyFiles(20))}), stored());
    volume->room.reset();
    writes();
    commit(*backend, addFiles({u"b"}));
    EXPECT_THAT(writes(), ElementsAreArray(rewrite));
    EXPECT_EQ(contentAfter({addFiles(manyFiles(20)), addFiles({u"b"})}), stored());
}

TEST_F(TextBackendWriting, aBatchWithoutItsLastByteOnAFullDiskIsRolledBack) {
    prepare(manyFiles(20));
    auto const lines = textOf(addFiles(manyFiles(20)), {addFiles({u"b"})}).substr(text().size());
    auto const backend = open(appending());
    volume->room = lines.size() - 1;
    volume->beforeCall = [&](std::string const& call) {
        if (call.starts_with("create")) {
            volume->room.reset();
        }
    };

    EXPECT_EQ("No space left on device", errorOf([&] { commit(*backend, addFiles({u"b"})); }).problem());

    EXPECT_EQ(textOf(addFiles(manyFiles(20))), text());
    EXPECT_EQ(contentAfter({addFiles(manyFiles(20))}), contentOf(*backend));
}

TEST_F(TextBackendWriting, theOutcomeIsUnknownIfTheDiskFailsAfterABatchWithoutItsLastByte) {
    prepare(manyFiles(20));
    auto const lines = textOf(addFiles(manyFiles(20)), {addFiles({u"b"})}).substr(text().size());
    auto const backend = open(appending());
    volume->room = lines.size() - 1;
    volume->beforeCall = [hasAppended = false](std::string const& call) mutable {
        if (hasAppended) {
            throw StoreError(StoreError::Kind::DiskFailed, "", 0, "Input/output error", "");
        }
        hasAppended = call.starts_with("append");
    };

    auto const error = errorOf([&] { commit(*backend, addFiles({u"b"})); });

    EXPECT_EQ(StoreError::Kind::OutcomeUnknown, error.kind());
    volume->beforeCall = nullptr;
    EXPECT_EQ(1U, stored(appending()).count(fileAddress(u"b")));
}

TEST_F(TextBackendWriting, aFullDiskAtARewriteLeavesTheTextAndNoTemporaryFile) {
    prepare({u"a"});
    auto const before = text();
    auto const backend = open();
    volume->room = 20;

    EXPECT_THROW(commit(*backend, addFiles({u"b"})), StoreError);

    EXPECT_EQ(before, text());
    EXPECT_THAT(volume->names(), ElementsAre(".gitattributes", ".gitignore", "project.jsonl"));
}

TEST_F(TextBackendWriting, whenAnAppendCannotBeSyncedTheTextWithoutItIsWrittenToANewFile) {
    prepare(manyFiles(20));
    auto const backend = open(appending());
    failOnce("sync");

    auto const error = errorOf([&] { commit(*backend, addFiles({u"b"})); });

    EXPECT_EQ("Input/output error", error.problem());
    EXPECT_EQ(textOf(addFiles(manyFiles(20))), text());
    EXPECT_EQ(contentAfter({addFiles(manyFiles(20))}), contentOf(*backend));
    volume->powerCut();
    EXPECT_EQ(textOf(addFiles(manyFiles(20))), text());
}

TEST_F(TextBackendWriting, afterAFailedSyncTheNextBatchIsWrittenAsUsual) {
    prepare(manyFiles(20));
    auto const backend = open(appending());
    failOnce("sync");
    EXPECT_THROW(commit(*backend, addFiles({u"b"})), StoreError);

    commit(*backend, addFiles({u"c"}));

    EXPECT_EQ(textOf(addFiles(manyFiles(20)), {addFiles({u"c"})}), text());
}

TEST_F(TextBackendWriting, whenTheNewFileFailsTooTheOutcomeIsUnknownAndNothingIsWrittenUntilReopened) {
    prepare(manyFiles(20));
    auto backend = open(appending());
    volume->beforeCall = [](std::string const& call) {
        if (call == "sync") {
            throw StoreError(StoreError::Kind::DiskFailed, "", 0, "Input/output error", "");
        }
    };

    auto const error = errorOf([&] { commit(*backend, addFiles({u"b"})); });

    EXPECT_EQ(StoreError::Kind::OutcomeUnknown, error.kind());
    volume->beforeCall = nullptr;
    EXPECT_EQ(StoreError::Kind::Refused, errorOf([&] { commit(*backend, addFiles({u"c"})); }).kind());
    EXPECT_EQ(StoreError::Kind::Refused, errorOf([&] { backend->tidy(); }).kind());
    backend = open(appending());
    writes();
    commit(*backend, addFiles({u"c"}));
    EXPECT_THAT(writes(), ElementsAreArray(rewrite))
        << "the system's cached content of the old file is not trusted";
    EXPECT_EQ(1U, stored().count(fileAddress(u"c")));
}

TEST_F(TextBackendWriting, whenTheFolderCannotBeSyncedAfterARewriteTheTextWithoutTheBatchIsRestored) {
    prepare({u"a"});
    auto const before = text();
    auto const backend = open();
    failOnce("syncFolder");

    EXPECT_EQ("Input/output error", errorOf([&] { commit(*backend, addFiles({u"b"})); }).problem());

    EXPECT_EQ(before, text());
    EXPECT_THAT(volume->names(), ElementsAre(".gitattributes", ".gitignore", "project.jsonl"));
    commit(*backend, addFiles({u"c"}));
    EXPECT_EQ(textOf(addFiles({u"a", u"c"})), text());
}

TEST_F(TextBackendWriting, aDiskThatCannotIdentifyTheExchangedFileIsNotTakenForAnotherProgram) {
    prepare({u"a"});
    auto const before = text();
    auto const backend = open();
    failOnce("identify swapping");

    EXPECT_EQ("Input/output error", errorOf([&] { commit(*backend, addFiles({u"b"})); }).problem());

    EXPECT_EQ(before, text());
    EXPECT_THAT(volume->names(), ElementsAre(".gitattributes", ".gitignore", "project.jsonl"));
    volume->powerCut();
    EXPECT_EQ(before, text());
}

TEST_F(TextBackendWriting, whenAnyCallFailsTheBatchIsCommittedOrNotAsTheErrorSays) {
    for (auto const& options : {rewriting(), appending()}) {
        prepare(manyFiles(20));
        auto const without = contentAfter({addFiles(manyFiles(20))});
        auto const with = contentAfter({addFiles(manyFiles(20)), addFiles({u"b"})});
        for (std::size_t call = 0;; ++call) {
            volume->replaceFile("project.jsonl", textOf(addFiles(manyFiles(20))));
            auto const backend = open(options);
            volume->plan(CrashingVolume::InjectedFault::Fails, call);
            bool isKept = false;
            try {
                commit(*backend, addFiles({u"b"}));
                isKept = true;
            } catch (StoreError const&) {
            }
            bool const wasReached = !volume->cancelPlan();
            EXPECT_EQ(isKept ? with : without, contentOf(*backend)) << call;
            EXPECT_EQ(isKept ? with : without, stored()) << call;
            if (!wasReached) {
                EXPECT_TRUE(isKept);
                break;
            }
        }
    }
}

TEST_F(TextBackendWriting, aProcessThatDiesAtAnyCallLeavesTheBatchCommittedOrNot) {
    for (unsigned seed = 0; seed < 20; ++seed) {
        for (bool const appends : {false, true}) {
            bool wasReached = true;
            for (std::size_t call = 0; wasReached; ++call) {
                CrashingVolume& fresh = *volume;
                fresh = CrashingVolume(seed * 1000 + static_cast<unsigned>(call));
                prepare(manyFiles(20));
                auto const without = contentAfter({addFiles(manyFiles(20))});
                auto const with = contentAfter({addFiles(manyFiles(20)), addFiles({u"b"})});
                fresh.plan(CrashingVolume::InjectedFault::Dies, call);
                bool isKept = false;
                try {
                    auto const backend = open(appends ? appending() : rewriting());
                    commit(*backend, addFiles({u"b"}));
                    isKept = true;
                } catch (ProcessDied const&) {
                }
                wasReached = !fresh.cancelPlan();
                if (seed % 2 == 0) {
                    fresh.powerCut();
                }
                auto const after = stored();
                EXPECT_TRUE(after == with || (!isKept && after == without))
                    << "seed " << seed << ", " << call;
                commit(*open(), addFiles({u"c"}));
                EXPECT_THAT(fresh.names(), ElementsAre(".gitattributes", ".gitignore", "project.jsonl"));
            }
        }
    }
}

TEST_F(TextBackendWriting, aProcessThatDiesAtItsFirstBatchLeavesAProjectThatOpens) {
    for (unsigned seed = 0; seed < 20; ++seed) {
        bool wasReached = true;
        for (std::size_t call = 0; wasReached; ++call) {
            *volume = CrashingVolume(seed * 1000 + static_cast<unsigned>(call));
            volume->plan(CrashingVolume::InjectedFault::Dies, call);
            bool isKept = false;
            try {
                auto const backend = open();
                commit(*backend, addFiles({u"b"}));
                isKept = true;
            } catch (ProcessDied const&) {
            }
            wasReached = !volume->cancelPlan();
            if (seed % 2 == 0) {
                volume->powerCut();
            }
            auto const after = stored();
            EXPECT_TRUE(after == contentAfter({addFiles({u"b"})}) || (!isKept && after.empty()))
                << "seed " << seed << ", " << call;
        }
    }
}

} // namespace

} // namespace project::test
