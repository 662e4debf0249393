#include "project/stores/FileJournalCache.hpp"

#include "project/stores/SystemDisk.hpp"
#include "support/JournalStore.hpp"
#include "support/TemporaryFolder.hpp"

namespace project::test {

namespace {

using stores::CachedText;
using stores::FileJournalCache;
using testing::ElementsAre;

/// The cache in a file, in memory and on disk.
class FileJournalCacheTest : public JournalStore {
protected:
    std::unique_ptr<FileJournalCache> cache() const {
        return std::make_unique<FileJournalCache>(std::make_unique<CrashingDisk>(volume_));
    }

    std::unique_ptr<JournalBackend> openCached() const {
        return std::make_unique<JournalBackend>(std::make_unique<MemoryJournal>(server), appending(),
                                                cache());
    }

    CachedText const sample_{{17, "an-id", "a-sum"}, "first\nsecond\n"};
    std::shared_ptr<CrashingVolume> const volume_ = std::make_shared<CrashingVolume>();
};

TEST_F(FileJournalCacheTest, theNextProcessLoadsTheStoredText) {
    cache()->store({{1, "old", "old"}, "old"});
    cache()->store(sample_);

    auto const loaded = cache()->load();

    ASSERT_TRUE(loaded);
    EXPECT_EQ(loaded->position, sample_.position);
    EXPECT_EQ(loaded->text, sample_.text);
    EXPECT_THAT(volume_->names(), ElementsAre("text"));
}

TEST_F(FileJournalCacheTest, theCacheOfAnotherProjectIsNotLoaded) {
    FileJournalCache other(std::make_unique<CrashingDisk>(volume_), "another-project");
    other.store(sample_);

    EXPECT_FALSE(cache()->load());
    EXPECT_TRUE(other.load());
    EXPECT_THAT(volume_->names(), ElementsAre("another-project"));
}

TEST_F(FileJournalCacheTest, withoutAFolderNothingIsLoadedAndNothingCreated) {
    EXPECT_FALSE(cache()->load());
    EXPECT_FALSE(volume_->hasFolder());
}

TEST_F(FileJournalCacheTest, aFileWithoutAPositionIsIgnored) {
    volume_->makeFolder();
    for (auto const* const bytes :
         {"", "\n", "1", "1 id", "1 id sum", "x id sum\ntext", "1x id sum\ntext", "1  sum\ntext",
          "1 id \ntext", "-1 id sum\ntext", "99999999999999999999 id sum\ntext"}) {
        volume_->replaceFile("text", bytes);
        EXPECT_FALSE(cache()->load()) << bytes;
    }
    volume_->replaceFile("text", "1 id sum\ntext");
    EXPECT_TRUE(cache()->load());
}

TEST_F(FileJournalCacheTest, whereverStoringFailsTheProjectIsReadFromTheLogOrTheCache) {
    using InjectedFault = CrashingVolume::InjectedFault;
    prepare({u"a"});
    for (auto const fault : {InjectedFault::Fails, InjectedFault::FailsForGood}) {
        bool isReached = true;
        for (std::size_t call = 0; isReached; ++call) {
            commit(*openCached(), {set(fileAddress(u"b"))});
            auto client = openCached();
            commit(*client, {remove(fileAddress(u"b"))});
            volume_->plan(fault, call);
            client.reset();
            isReached = !volume_->cancelPlan();
            EXPECT_EQ(contentOf(*openCached()), files({u"a"}));
        }
    }
}

TEST_F(FileJournalCacheTest, aPowerCutLeavesTheCacheRightOrIgnored) {
    prepare({u"a"});
    for (unsigned turn = 0; turn < 50; ++turn) {
        commit(*openCached(), {set(fileAddress(u"b"))});
        commit(*openCached(), {remove(fileAddress(u"b"))});
        volume_->powerCut();
        auto const client = openCached();
        EXPECT_EQ(contentOf(*client), files({u"a"}));
        EXPECT_FALSE(client->takeHistoryLoss());
    }
}

TEST_F(FileJournalCacheTest, onDiskItIsAFileInAFolderOfItsOwn) {
    prepare({u"a"});
    TemporaryFolder folder;
    auto const onDisk = [&] {
        return std::make_unique<FileJournalCache>(stores::makeSystemDisk(folder.root(), u"cache"));
    };
    contentOf(
        *std::make_unique<JournalBackend>(std::make_unique<MemoryJournal>(server), appending(), onDisk()));

    auto const loaded = onDisk()->load();

    ASSERT_TRUE(loaded);
    EXPECT_EQ(loaded->position, server->entry(1).read.position);
    EXPECT_EQ(loaded->text, textOf(addFiles({u"a"})));
}

} // namespace

} // namespace project::test
