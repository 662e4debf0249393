#include "support/TextStore.hpp"

using testing::ElementsAre;
using testing::UnorderedElementsAre;

namespace project::test {

namespace {

/// File systems that ignore case in names, and clones in which the case of a name differs from the store's.
class FoldingNames : public TextStore {
protected:
    void SetUp() override {
        volume->foldsNames = true;
        volume->makeFolder();
        volume->replaceFile(".GitAttributes", "* text\n");
        volume->replaceFile("PROJECT.JSONL", textOf(files));
        volume->advanceBeyondTick();
    }

    Batch const files = addFiles(manyFiles(20));
};

TEST_F(FoldingNames, aTextWhoseNameDiffersInCaseIsTheProjectsText) {
    for (auto const& options : {rewriting(), appending()}) {
        auto const backend = open(options);
        EXPECT_EQ(contentAfter({files}), contentOf(*backend));

        commit(*backend, addFiles({u"b"}));
        EXPECT_EQ(contentAfter({files, addFiles({u"b"})}), stored(options));

        commit(*backend, {remove(fileAddress(u"b"))});
        EXPECT_EQ(contentAfter({files}), stored(options));
    }
    EXPECT_THAT(volume->names(), ElementsAre(".GitAttributes", "PROJECT.JSONL"));
    EXPECT_EQ("* text\n", volume->content(".gitattributes"));
}

TEST_F(FoldingNames, aFirstBatchUsesNoTakenName) {
    volume->remove("PROJECT.JSONL");
    volume->replaceFile("project.jsonl.NOTES", "theirs");

    commit(*open(), addFiles({u"a"}));

    EXPECT_EQ(contentAfter({addFiles({u"a"})}), stored());
    EXPECT_THAT(volume->names(),
                UnorderedElementsAre(".GitAttributes", ".gitignore", "project.jsonl", "project.jsonl.NOTES"));
    EXPECT_EQ("* text\n", volume->content(".gitattributes"));
}

TEST_F(FoldingNames, everyFaultAtEveryCallLeavesTheBatchCommittedOrNot) {
    using InjectedFault = CrashingVolume::InjectedFault;
    auto const with = contentAfter({files, addFiles({u"b"})});
    for (auto const fault : {InjectedFault::Fails, InjectedFault::FailsForGood, InjectedFault::DiesBefore,
                             InjectedFault::DiesAmid, InjectedFault::DiesAfter}) {
        bool wasReached = true;
        for (std::size_t call = 0; wasReached; ++call) {
            auto const now = volume->copy(static_cast<unsigned>(call));
            auto const disk = [&now] { return std::make_unique<CrashingDisk>(now); };
            now->plan(fault, call);
            bool isKept = false;
            try {
                TextBackend backend(disk(), rewriting());
                commit(backend, addFiles({u"b"}));
                isKept = true;
            } catch (StoreError const&) {
            } catch (ProcessDied const&) {
            }
            wasReached = !now->faulted().empty();
            now->cancelPlan();
            TextBackend next(disk(), rewriting());
            auto const found = contentOf(next);
            EXPECT_TRUE(found == with || (!isKept && found == contentAfter({files}))) << call;
            commit(next, addFiles({u"c"}));
            EXPECT_THAT(now->names(), ElementsAre(".GitAttributes", "PROJECT.JSONL")) << call;
        }
    }
}

} // namespace

} // namespace project::test
