#include "support/TextStore.hpp"

using testing::Contains;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::SizeIs;

namespace project::test {

namespace {

/// Git, editors and other writers at every moment of a batch of ours.
class TextBackendOtherPrograms : public TextStore {
protected:
    /// Acts once, before or after the first call of a name.
    void once(std::function<void(std::string const&)>& moment, std::string call,
              std::function<void()> action) const {
        moment = [call = std::move(call), action = std::move(action),
                  done = false](std::string const& now) mutable {
            if (now == call && !std::exchange(done, true)) {
                action();
            }
        };
    }

    /// Another program replaces the text once, before or after the first call of a name.
    void replaceTextBefore(std::string call) {
        once(volume->beforeCall, std::move(call), [this] { replaceText(); });
    }

    void replaceTextAfter(std::string call) {
        once(volume->afterCall, std::move(call), [this] { replaceText(); });
    }

    void replaceText() { volume->replaceFile("project.jsonl", theirs); }

    /// Runs an action between the write of a batch and its commit, which would rewrite the text, or append.
    void duringEachKindOfBatch(std::function<void(TextBackend&)> const& action) {
        for (auto const& options : {rewriting(), appending()}) {
            prepare(manyFiles(20));
            auto const backend = open(options);
            Entered const entered(*backend, Access::Write);
            backend->write(addFiles({u"b"}));
            action(*backend);
        }
    }

    /// A writer of ours dies while it has the text of another program in its hands, not yet restored.
    void dieWithTheirText() {
        prepare({u"a"});
        once(volume->beforeCall, exchange, [this] {
            replaceText();
            volume->plan(CrashingVolume::InjectedFault::Dies, 1); // before the text is restored
        });
        EXPECT_THROW(commit(*open(), addFiles({u"b"})), ProcessDied);
        volume->beforeCall = nullptr;
    }

    void expectTheirTextAndNoOtherFile(std::string const& situation = "") {
        EXPECT_EQ(theirs, text()) << situation;
        EXPECT_EQ(usual, volume->names()) << situation;
    }

    [[noreturn]] static void failDisk() {
        throw StoreError(StoreError::Kind::DiskFailed, "", 0, "Input/output error", "");
    }

    static constexpr char const* exchange = "exchange swapping project.jsonl";
    std::string const theirs = textOf(addFiles({u"their file"}));
    std::vector<std::string> const usual{".gitattributes", ".gitignore", "project.jsonl"};
};

TEST_F(TextBackendOtherPrograms, aTextThatWasReplacedBeforeTheBatchStaysAndTheBatchIsNotInIt) {
    duringEachKindOfBatch([&](TextBackend& backend) {
        replaceText();

        EXPECT_EQ(StoreError::Kind::Busy, errorOf([&] { backend.keep(); }).kind());

        backend.discard();
        expectTheirTextAndNoOtherFile();
        EXPECT_EQ(contentAfter({addFiles(manyFiles(20))}), loadAll(backend)) << "the guard shows one state";
    });
}

TEST_F(TextBackendOtherPrograms, aTextThatWasChangedInPlaceBeforeTheBatchStays) {
    duringEachKindOfBatch([&](TextBackend& backend) {
        volume->advance(4'000'000);
        volume->overwrite("project.jsonl", theirs);

        EXPECT_THROW(backend.keep(), StoreError);

        backend.discard();
        EXPECT_EQ(theirs, text());
    });
}

TEST_F(TextBackendOtherPrograms, aFolderThatWasMovedAwayBeforeTheBatchIsNotTouched) {
    duringEachKindOfBatch([&](TextBackend& backend) {
        auto const bringBack = volume->moveFolderAway();
        writes();

        EXPECT_THROW(backend.keep(), StoreError);

        EXPECT_THAT(writes(), IsEmpty());
        backend.discard();
        bringBack();
        EXPECT_EQ(textOf(addFiles(manyFiles(20))), text());
    });
}

TEST_F(TextBackendOtherPrograms, aTextWrittenBeforeTheLastCheckIsNotExchanged) {
    prepare({u"a"});
    auto const backend = open();
    replaceTextAfter("renameToFree temporary swapping");

    EXPECT_THROW(commit(*backend, addFiles({u"b"})), StoreError);

    EXPECT_EQ(0U, volume->count(exchange));
    expectTheirTextAndNoOtherFile();
}

TEST_F(TextBackendOtherPrograms, aTextThatIsChangedInPlaceWhileASyncFailsMayHaveTheBatchAndTheErrorSaysSo) {
    prepare(manyFiles(20));
    auto const backend = open(appending());
    once(volume->beforeCall, "sync", [&] {
        volume->append("project.jsonl", "\"theirs");
        failDisk();
    });

    auto const error = errorOf([&] { commit(*backend, addFiles({u"b"})); });

    volume->beforeCall = nullptr;
    EXPECT_THAT(error.problem(), HasSubstr("Input/output error"));
    EXPECT_EQ(StoreError::Kind::OutcomeUnknown, error.kind());
}

TEST_F(TextBackendOtherPrograms, aTextWrittenBetweenTheCheckAndTheExchangeIsRestored) {
    prepare({u"a"});
    auto const backend = open();
    replaceTextBefore(exchange);

    EXPECT_THROW(commit(*backend, addFiles({u"b"})), StoreError);

    expectTheirTextAndNoOtherFile();
    EXPECT_EQ(contentAfter({addFiles({u"their file"})}), contentOf(*backend));
    commit(*backend, addFiles({u"b"}));
    EXPECT_EQ(contentAfter({addFiles({u"their file", u"b"})}), stored());
}

TEST_F(TextBackendOtherPrograms, aRestoredTextSurvivesAPowerCut) {
    for (unsigned seed = 0; seed < 20; ++seed) {
        *volume = CrashingVolume(seed);
        prepare({u"a"});
        replaceTextBefore(exchange);
        EXPECT_THROW(commit(*open(), addFiles({u"b"})), StoreError);
        volume->beforeCall = nullptr;

        volume->powerCut();

        EXPECT_EQ(theirs, text());
    }
}

TEST_F(TextBackendOtherPrograms, theOutcomeIsUnknownIfARestoredTextCannotBeMadeDurable) {
    for (unsigned seed = 0; seed < 20; ++seed) {
        *volume = CrashingVolume(seed);
        prepare({u"a"});
        auto const backend = open();
        replaceTextBefore(exchange);
        once(volume->afterCall, "identify swapping", [&] { failOnce("syncFolder"); });

        auto const error = errorOf([&] { commit(*backend, addFiles({u"b"})); });

        EXPECT_EQ(StoreError::Kind::OutcomeUnknown, error.kind());
        EXPECT_EQ(theirs, text());
        EXPECT_EQ(StoreError::Kind::Refused, errorOf([&] { commit(*backend, addFiles({u"c"})); }).kind());
        volume->powerCut();
        EXPECT_THAT((std::vector<Content>{contentAfter({addFiles({u"a", u"b"})}),
                                          contentAfter({addFiles({u"their file"})})}),
                    Contains(stored()));
    }
}

TEST_F(TextBackendOtherPrograms, withoutExchangeTheTextIsCheckedAgainRightBeforeTheRename) {
    for (auto const* moment : {"sync", exchange, "create temporary"}) {
        prepare({u"a"});
        volume->canExchange = false;
        replaceTextAfter(moment);

        EXPECT_THROW(commit(*open(), addFiles({u"b"})), StoreError) << moment;

        volume->afterCall = nullptr;
        expectTheirTextAndNoOtherFile(moment);
    }
}

TEST_F(TextBackendOtherPrograms, aPipeCreatedInBetweenIsRestoredToo) {
    prepare({u"a"});
    auto const backend = open();
    once(volume->beforeCall, exchange, [&] { volume->putPipe("project.jsonl"); });

    EXPECT_THROW(commit(*backend, addFiles({u"b"})), StoreError);

    EXPECT_EQ(usual, volume->names());
    EXPECT_THROW(contentOf(*backend), StoreError);
}

TEST_F(TextBackendOtherPrograms, twoTextsWrittenInBetweenAreBothKept) {
    prepare({u"a"});
    int exchanges = 0;
    auto const second = textOf(addFiles({u"their second file"}));
    auto const backend = open();
    volume->beforeCall = [&](std::string const& call) {
        if (call == exchange) {
            volume->replaceFile("project.jsonl", ++exchanges == 1 ? theirs : second);
        }
    };

    EXPECT_THROW(commit(*backend, addFiles({u"b"})), StoreError);

    auto const aside = volume->namesLike("displaced-");
    ASSERT_THAT(aside, SizeIs(1));
    EXPECT_EQ(theirs, text());
    EXPECT_EQ(second, volume->content(aside.front()));
}

TEST_F(TextBackendOtherPrograms, aTextThatCannotBeRestoredIsSetAsideAndReported) {
    prepare({u"a"});
    int exchanges = 0;
    auto const backend = open();
    volume->beforeCall = [&](std::string const& call) {
        if (call == exchange) {
            if (++exchanges == 2) {
                failDisk();
            }
            replaceText();
        }
    };

    auto const error = errorOf([&] { commit(*backend, addFiles({u"b"})); });

    auto const aside = volume->namesLike("displaced-");
    ASSERT_THAT(aside, SizeIs(1));
    EXPECT_EQ(StoreError::Kind::OutcomeUnknown, error.kind());
    EXPECT_THAT(error.problem(), HasSubstr(aside.front()));
    EXPECT_EQ(theirs, volume->content(aside.front()));
    auto const faults = backend->check();
    ASSERT_FALSE(faults.empty());
    EXPECT_EQ(stores::Fault::Kind::Displaced, faults.back().kind);
    EXPECT_THAT(faults.back().problem, HasSubstr(aside.front()));
}

TEST_F(TextBackendOtherPrograms, aTextThatReplacesOursRightAfterTheWriteWinsAndTheBatchThrows) {
    for (auto const& [options, call] :
         {std::pair{rewriting(), exchange}, std::pair{appending(), "append project.jsonl"},
          std::pair{appending(), "sync"}}) {
        prepare(manyFiles(20));
        auto const backend = open(options);
        replaceTextAfter(call);

        EXPECT_THROW(commit(*backend, addFiles({u"b"})), StoreError) << call;

        volume->afterCall = nullptr;
        expectTheirTextAndNoOtherFile();
    }
}

TEST_F(TextBackendOtherPrograms, aFolderThatWasMovedAwayIsNotRecreatedByTheBatch) {
    for (auto const& [options, call] :
         {std::pair{rewriting(), "create temporary like project.jsonl"}, std::pair{rewriting(), exchange},
          std::pair{appending(), "append project.jsonl"}, std::pair{appending(), "sync"}}) {
        prepare(manyFiles(20));
        auto const backend = open(options);
        std::function<void()> bringBack;
        once(volume->afterCall, call, [&] { bringBack = volume->moveFolderAway(); });

        EXPECT_THROW(commit(*backend, addFiles({u"b"})), StoreError) << call;

        volume->afterCall = nullptr;
        EXPECT_THAT(volume->names(), IsEmpty());
        bringBack();
        EXPECT_EQ(contentAfter({addFiles(manyFiles(20))}), stored()) << call;
        EXPECT_EQ(usual, volume->names());
    }
}

TEST_F(TextBackendOtherPrograms, aBatchThatOthersAppendAfterOursIsSeenByTheNextGuard) {
    prepare(manyFiles(20));
    auto const backend = open(appending());
    once(volume->afterCall, "append project.jsonl", [&] { volume->append("project.jsonl", "\"torn"); });
    commit(*backend, addFiles({u"b"}));
    volume->afterCall = nullptr;
    writes();

    commit(*backend, addFiles({u"c"}));

    EXPECT_EQ("create temporary like project.jsonl", writes().front());
    EXPECT_EQ(contentAfter({addFiles(manyFiles(20)), addFiles({u"b", u"c"})}), stored());
}

TEST_F(TextBackendOtherPrograms, aProcessThatDiesWhileItHoldsTheTextOfAnotherProgramNeverLosesIt) {
    for (unsigned seed = 0; seed < 10; ++seed) {
        bool wasReached = true;
        for (std::size_t call = 0; wasReached; ++call) {
            *volume = CrashingVolume(seed);
            prepare({u"a"});
            replaceTextBefore(exchange);
            auto backend = open();
            volume->plan(CrashingVolume::InjectedFault::Dies, call);
            bool died = false;
            try {
                commit(*backend, addFiles({u"b"}));
            } catch (ProcessDied const&) {
                died = true;
            } catch (StoreError const&) {
            }
            wasReached = !volume->cancelPlan();
            bool const hadCome = volume->count(exchange) > 0;
            volume->beforeCall = nullptr;

            commit(*open(), addFiles({u"c"}));

            if (hadCome) {
                EXPECT_EQ(contentAfter({addFiles({u"their file", u"c"})}), stored())
                    << call << " of " << seed;
            } else {
                EXPECT_TRUE(died);
            }
            EXPECT_EQ(usual, volume->names()) << call << " of " << seed;
        }
    }
}

TEST_F(TextBackendOtherPrograms, aTextRestoredForADeadWriterSurvivesAPowerCut) {
    for (unsigned seed = 0; seed < 20; ++seed) {
        *volume = CrashingVolume(seed);
        dieWithTheirText();
        auto const backend = open(appending());
        backend->enter(Access::Write);

        volume->powerCut();

        EXPECT_EQ(theirs, text());
    }
}

TEST_F(TextBackendOtherPrograms, aBatchAfterATextOfADeadWriterSurvivesAPowerCut) {
    for (unsigned seed = 0; seed < 40; ++seed) {
        bool const hasWrittenBefore = seed % 2 == 0;
        *volume = CrashingVolume(seed);
        prepare(manyFiles(40));
        volume->canExchange = seed % 4 < 2;
        auto const* const last = volume->canExchange ? exchange : "rename swapping project.jsonl";
        auto const backend = open(appending());
        if (hasWrittenBefore) {
            commit(*backend, addFiles({u"d"}));
        }
        volume->afterCall = [&](std::string const& call) {
            if (call == last) {
                throw ProcessDied(); // the new text has its name, which is not durable
            }
        };
        EXPECT_THROW(commit(*open(), addFiles({u"b"})), ProcessDied);
        volume->afterCall = nullptr;
        contentOf(*backend);
        volume->calls.clear();
        commit(*backend, addFiles({u"c"}));
        ASSERT_EQ(1U, volume->count("append project.jsonl"));
        auto const kept = stored();

        volume->powerCut();

        EXPECT_EQ(kept, stored()) << seed;
    }
}

TEST_F(TextBackendOtherPrograms, aBatchThatOthersAppendDuringOursIsSeenByTheNextGuard) {
    prepare(manyFiles(40));
    auto const backend = open(appending());
    auto const lines = textOf(addFiles(manyFiles(40)), {addFiles({u"b"})}).substr(text().size());
    volume->amidAppend = [&] { volume->append("project.jsonl", lines); };
    commit(*backend, addFiles({u"c"}));
    volume->amidAppend = nullptr;

    EXPECT_EQ(stored(), contentOf(*backend));
    EXPECT_EQ(1U, stored().count(fileAddress(u"b")));
    EXPECT_EQ(1U, stored().count(fileAddress(u"c")));
}

TEST_F(TextBackendOtherPrograms, aTextOfAnotherProgramIsSetAsideIfItsPlaceIsTaken) {
    dieWithTheirText();
    volume->replaceFile("project.jsonl", textOf(addFiles({u"d"})));

    commit(*open(), addFiles({u"c"}));

    EXPECT_EQ(contentAfter({addFiles({u"c", u"d"})}), stored());
    auto const aside = volume->namesLike("displaced-");
    ASSERT_THAT(aside, SizeIs(1));
    EXPECT_EQ(theirs, volume->content(aside.front()));
}

TEST_F(TextBackendOtherPrograms, temporaryFilesOfDeadWritersAreDeletedWhenAWriterOpensAndOthersStay) {
    prepare({u"a"});
    volume->replaceFile("project.jsonl.123-0123456789abcdef.tmp", "half");
    volume->replaceFile("project.jsonl.orig", "an editor's");
    volume->replaceFile("notes.txt", "somebody's");
    volume->putPipe("project.jsonl.123-pipe.tmp");
    auto const backend = open();
    contentOf(*backend);
    EXPECT_TRUE(volume->has("project.jsonl.123-0123456789abcdef.tmp")) << "readers change nothing";

    Entered const entered(*backend, Access::Write);

    EXPECT_THAT(volume->namesLike("project.jsonl"), ElementsAre("project.jsonl", "project.jsonl.orig"));
    EXPECT_TRUE(volume->has("notes.txt"));
    EXPECT_THAT(volume->namesLike("displaced-"), SizeIs(1));
}

TEST_F(TextBackendOtherPrograms, leftoversThatCannotBeDeletedBlockNoWriter) {
    prepare({u"a"});
    volume->replaceFile("project.jsonl.123-0123456789abcdef.tmp", "half");
    volume->beforeCall = [](std::string const& call) {
        if (call == "remove temporary") {
            throw StoreError(StoreError::Kind::DiskFailed, "", 0, "Read-only file system", "");
        }
    };
    auto const backend = open();

    Entered const entered(*backend, Access::Write);

    EXPECT_EQ(contentAfter({addFiles({u"a"})}), loadAll(*backend));
}

TEST_F(TextBackendOtherPrograms, anotherWriterIsWaitedForAndThenNamed) {
    prepare({u"a"});
    auto const other = open();
    Entered const theirGuard(*other, Access::Write);
    auto const backend = open();

    auto const error = errorOf([&] { backend->enter(Access::Write); });

    EXPECT_EQ("/project/.projectdata", error.file());
    EXPECT_EQ(StoreError::Kind::Busy, error.kind());
    EXPECT_EQ("is locked by process 4711 (another)", error.problem());
    EXPECT_EQ(contentAfter({addFiles({u"a"})}), contentOf(*backend)) << "readers do not wait";
}

TEST_F(TextBackendOtherPrograms, aFailedGuardReleasesTheLock) {
    prepare({u"a"});
    auto const backend = open();
    contentOf(*backend);
    volume->overwrite("project.jsonl", "");
    EXPECT_THROW(backend->enter(Access::Write), StoreError);
    volume->overwrite("project.jsonl", theirs);

    EXPECT_NO_THROW(commit(*open(), addFiles({u"b"})));
}

TEST_F(TextBackendOtherPrograms, aFolderThatIsReplacedWhileWeWaitForItsLockIsReopened) {
    prepare({u"a"});
    auto const backend = open();
    once(volume->beforeCall, "lock", [&] {
        volume->moveFolderAway();
        replaceText();
    });

    commit(*backend, addFiles({u"b"}));

    EXPECT_EQ(contentAfter({addFiles({u"their file", u"b"})}), stored());
}

TEST_F(TextBackendOtherPrograms, aFolderThatReplacesTheLockedOneIsNotWrittenWithoutALock) {
    prepare({u"a"});
    auto const backend = open();
    once(volume->beforeCall, "identify project.jsonl", [&] { // the first call after the folder was locked
        volume->moveFolderAway();
        replaceText();
    });

    EXPECT_EQ(StoreError::Kind::Busy, errorOf([&] { commit(*backend, addFiles({u"b"})); }).kind());

    EXPECT_EQ(theirs, text());
}

TEST_F(TextBackendOtherPrograms, aStoreThatAnotherProgramCreatesMeanwhileIsNotOverwritten) {
    auto const backend = open();
    Entered const entered(*backend, Access::Write);
    commit(*open(), addFiles({u"their file"}));

    auto const error = errorOf([&] { backend->write(addFiles({u"b"})); });

    EXPECT_EQ(StoreError::Kind::Busy, error.kind());
    backend->discard();
    EXPECT_EQ(contentAfter({addFiles({u"their file"})}), stored());
    EXPECT_EQ(usual, volume->names());
}

TEST_F(TextBackendOtherPrograms, aTextThatGitWritesWhileTheStoreIsCreatedIsNotOverwritten) {
    auto const backend = open();
    replaceTextBefore("renameToFree temporary project.jsonl");

    EXPECT_EQ(StoreError::Kind::Busy, errorOf([&] { commit(*backend, addFiles({u"b"})); }).kind());

    EXPECT_EQ(theirs, text());
    commit(*backend, addFiles({u"b"}));
    EXPECT_EQ(contentAfter({addFiles({u"their file", u"b"})}), stored());
}

} // namespace

} // namespace project::test
