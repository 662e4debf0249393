#include <gmock/gmock.h>

#include "project/metadata/MetadataNodeSpecification.hpp"
#include "project/stores/TreeMetadataManager.hpp"
#include "support/TextStore.hpp"

namespace project::test {

namespace {

using metadata::MetadataNode;
using metadata::MetadataNodeSpecification;
using stores::Changes;
using stores::TreeMetadataManager;
using testing::ElementsAre;
using testing::IsEmpty;

/// A store, and the changes of other processes to it.
class OthersChanges : public TextStore {
protected:
    void SetUp() override {
        prepare({u"a", u"b", u"c"});
        tree_ = std::make_unique<TreeMetadataManager>(open(), u"/project/.projectdata");
        EXPECT_THAT(take(), IsEmpty());
    }

    std::vector<Address> take() { return addressesOf(tree_->takeOthersChanges().differences); }

    void others(Batch const& batch) const { commit(*open(), batch); }

    std::unique_ptr<TreeMetadataManager> tree_;
};

TEST_F(OthersChanges, areReportedByAddressInTheirOrderAndOnce) {
    others({set(fileAddress(u"d"))});
    others({set(fileAddress(u"b"), makeNode(u"Info", {{u"k", u"1"}})), remove(fileAddress(u"a"))});

    EXPECT_THAT(take(), ElementsAre(fileAddress(u"a"), fileAddress(u"b"), fileAddress(u"d")));
    EXPECT_THAT(take(), IsEmpty());
}

TEST_F(OthersChanges, areReportedFromBeforeTheFirstToAfterTheLast) {
    others({set(fileAddress(u"a"), makeNode(u"Info", {{u"k", u"1"}}))});
    EXPECT_TRUE(tree_->hasNode(fileAddress(u"a")));
    others({remove(fileAddress(u"a"))});

    auto const changes = tree_->takeOthersChanges();

    ASSERT_EQ(changes.differences.size(), 1U);
    EXPECT_TRUE(isEqual(*changes.differences[0].before, *stores::plainNode()));
    EXPECT_EQ(changes.differences[0].after, nullptr);
}

TEST_F(OthersChanges, areReportedWhicheverOperationFoundThem) {
    others({set(fileAddress(u"d"))});
    EXPECT_TRUE(tree_->hasNode(fileAddress(u"d")));
    others({set(fileAddress(u"e"))});
    { auto const guard = tree_->acquireWriteLock(); }

    EXPECT_THAT(take(), ElementsAre(fileAddress(u"d"), fileAddress(u"e")));
}

TEST_F(OthersChanges, areNotReportedIfTheyWereUndone) {
    others({remove(fileAddress(u"a"))});
    EXPECT_FALSE(tree_->hasNode(fileAddress(u"a")));
    others({set(fileAddress(u"a"))});

    EXPECT_THAT(take(), IsEmpty());
}

TEST_F(OthersChanges, areNotOurOwn) {
    std::map<Address, std::shared_ptr<MetadataNode>> nodes{
        {fileAddress(u"mine"), std::make_shared<MetadataNodeSpecification>(u"Info")}};
    tree_->setNodes(nodes);
    others({set(fileAddress(u"theirs"))});

    EXPECT_THAT(take(), ElementsAre(fileAddress(u"theirs")));
}

TEST_F(OthersChanges, waitForTheEndOfAnOpenGuard) {
    auto guard = std::make_unique<cmlink::ReentrantReadWriteLock::LockGuard>(tree_->acquireReadLock());
    others({set(fileAddress(u"d"))});

    EXPECT_THAT(take(), IsEmpty());
    guard.reset();
    EXPECT_THAT(take(), ElementsAre(fileAddress(u"d")));
}

TEST_F(OthersChanges, areThoseOfTheWholeCheckout) {
    volume->replaceFile("project.jsonl", textOf(addFiles(manyFiles(5'000))));

    EXPECT_EQ(take().size(), 5'003U);
    EXPECT_TRUE(tree_->hasNode(fileAddress(u"many/0000")));
    EXPECT_FALSE(tree_->hasNode(fileAddress(u"a")));
}

TEST_F(OthersChanges, areEverythingWhenAStoreIsCreatedWhereNoneWas) {
    volume->removeFolder();
    TreeMetadataManager fresh(open(), u"/project/.projectdata");
    EXPECT_FALSE(fresh.takeOthersChanges().everything);
    prepare({u"a"});

    EXPECT_TRUE(fresh.takeOthersChanges().everything);
}

} // namespace

} // namespace project::test
