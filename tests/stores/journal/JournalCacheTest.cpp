#include "support/JournalStore.hpp"

namespace project::test {

namespace {

using stores::HistoryLoss;
using testing::ElementsAre;

/// A client that keeps the text between processes.
class JournalCacheTest : public JournalStore {
protected:
    void SetUp() override {
        prepare({u"a"});
        contentOf(*openCached());
        calls();
    }

    std::unique_ptr<JournalBackend> openCached(Options options = appending()) const {
        return open(options, saved_);
    }

    std::shared_ptr<SavedText> const saved_ = std::make_shared<SavedText>();
};

TEST_F(JournalCacheTest, theNextProcessFetchesOnlyTheNewEntries) {
    commit(*open(), {set(fileAddress(u"b"))});
    auto const looked = server->entries().size();
    auto const client = openCached();
    calls();

    EXPECT_EQ(contentOf(*client), files({u"a", u"b"}));

    EXPECT_THAT(calls(), ElementsAre("look"));
    EXPECT_EQ(looked, 2U);
    EXPECT_EQ(saved_->cached->position.version, 1U) << "it is stored when the client closes";
}

TEST_F(JournalCacheTest, theFirstGuardSaysThatEverythingIsNew) {
    auto const client = openCached();
    EXPECT_TRUE(Entered(*client).changes().everything);
}

TEST_F(JournalCacheTest, bodyAndTailAreStoredWhenTheClientCloses) {
    commit(*openCached(), {set(fileAddress(u"b"))});
    EXPECT_EQ(saved_->cached->position, server->entry(2).read.position);
    EXPECT_EQ(saved_->cached->text, textOf(addFiles({u"a"}), {addFiles({u"b"})}));

    auto const times = saved_->times;
    contentOf(*openCached());
    EXPECT_EQ(saved_->times, times) << "an unchanged text is not stored again";
}

TEST_F(JournalCacheTest, aWrongCacheIsIgnored) {
    for (bool const hasTail : {false, true}) {
        if (hasTail) {
            commit(*openCached(), {set(fileAddress(u"b"))});
        }
        auto const right = *saved_->cached;
        auto const expectIgnored = [&] {
            auto const client = openCached();
            EXPECT_EQ(contentOf(*client), stored());
            EXPECT_FALSE(client->takeHistoryLoss());
        };
        for (std::size_t position = 0; position < right.text.size(); ++position) {
            saved_->cached = right;
            saved_->cached->text[position] ^= 1;
            expectIgnored();
        }
        saved_->cached = right;
        saved_->cached->text.clear();
        expectIgnored();
        saved_->cached = right;
        saved_->cached->position.sum = std::string(32, '0');
        expectIgnored();
        saved_->cached = right;
        saved_->cached->position.version = 0;
        expectIgnored();
    }
}

TEST_F(JournalCacheTest, aResetOfTheServerBetweenTwoProcessesIsReported) {
    commit(*openCached(), {set(fileAddress(u"b"))});
    server->resetTo(1);
    auto const client = openCached();

    EXPECT_EQ(contentOf(*client), files({u"a"}));

    auto const loss = client->takeHistoryLoss();
    ASSERT_TRUE(loss);
    EXPECT_EQ(loss->kind, HistoryLoss::Kind::Reset);
    EXPECT_EQ(loss->seen, 2U);
    EXPECT_EQ(loss->found, 1U);
}

TEST_F(JournalCacheTest, aResetIsReportedByEachProcessUntilItIsTaken) {
    commit(*openCached(), {set(fileAddress(u"b"))});
    server->resetTo(1);

    contentOf(*openCached());

    auto const refused = openCached();
    EXPECT_EQ(errorOf([&] { commit(*refused, {set(fileAddress(u"c"))}); }).kind(), StoreError::Kind::Refused);
    ASSERT_TRUE(refused->historyLoss());
    EXPECT_EQ(refused->takeHistoryLoss()->kind, HistoryLoss::Kind::Reset);
    EXPECT_FALSE(refused->historyLoss());
    commit(*refused, {set(fileAddress(u"c"))});
    EXPECT_EQ(stored(), files({u"a", u"c"}));
}

TEST_F(JournalCacheTest, theCachedStateIsShownWhileTheServerIsUnreachableIfThatIsWanted) {
    server->plan(Fault::Unreachable, 0);
    EXPECT_EQ(errorOf([&] { contentOf(*openCached()); }).kind(), StoreError::Kind::Unreachable);
    auto const client = openCached({.readsLastState = true});
    EXPECT_EQ(contentOf(*client), files({u"a"}));
    EXPECT_TRUE(client->isShowingLastState());
}

} // namespace

} // namespace project::test
