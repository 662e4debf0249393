#include "tree/MetadataTree.hpp"

#include <gmock/gmock.h>

namespace project::stores {
namespace {

using metadata::PathElement;
using testing::ElementsAre;
using testing::IsEmpty;

/// A tree over levels that the test changes as another program would, and a list of the loaded addresses.
class MetadataTreeTest : public testing::Test {
protected:
    static Child plain(std::u16string const& name, bool hasChildren = false) {
        return {PathElement(u"t", name), plainNode(), false, hasChildren};
    }

    static Changes changeAt(Address const& address) { return {false, {{address, nullptr, nullptr}}}; }

    static Child bare(std::u16string const& name) { return {PathElement(u"t", name), nullptr, false, true}; }

    std::map<Address, Children> levels;
    std::vector<Address> loaded;
    MetadataTree tree{[this](Address const& address, ChildSink& sink) {
        loaded.push_back(address);
        for (auto const& child : levels[address]) {
            sink.add({child.element.getType(), child.element.getLocation(), child.node, child.isCreated,
                      child.hasChildren});
        }
    }};
    Address const root = Address::root();
    Address const a = root.child({u"t", u"a"});
    Address const b = root.child({u"t", u"b"});
    Address const aa = a.child({u"t", u"a"});
};

TEST_F(MetadataTreeTest, aLevelIsLoadedWhenItIsFirstAskedForAndOnlyOnce) {
    levels[root] = {plain(u"a", true), plain(u"b")};
    levels[a] = {plain(u"a")};
    tree.node(a);
    EXPECT_THAT(loaded, ElementsAre(root));
    tree.children(a);
    tree.children(a);
    EXPECT_THAT(loaded, ElementsAre(root, a));
}

TEST_F(MetadataTreeTest, nothingIsLoadedBelowAnAddressKnownToHaveNoChildren) {
    levels[root] = {plain(u"a")};
    EXPECT_THAT(tree.children(a), IsEmpty());
    EXPECT_FALSE(tree.exists(aa));
    EXPECT_THAT(loaded, ElementsAre(root));
}

TEST_F(MetadataTreeTest, aChangedNodeIsLoadedAgainAndItsSiblingsStay) {
    levels[root] = {plain(u"a", true), plain(u"b", true)};
    levels[a] = {plain(u"a")};
    levels[b] = {plain(u"b")};
    tree.children(a);
    tree.children(b);
    loaded.clear();

    levels[a] = {plain(u"a"), plain(u"c")};
    tree.applyChanges(changeAt(a.child({u"t", u"c"})));

    EXPECT_THAT(tree.children(a), ElementsAre(aa, a.child({u"t", u"c"})));
    EXPECT_EQ(tree.children(b).size(), 1U);
    EXPECT_THAT(loaded, ElementsAre(root, a)); // b is not loaded again
}

TEST_F(MetadataTreeTest, anAddressThatExistedOnlyForItsChildrenIsRemovedWithThem) {
    levels[root] = {bare(u"a"), plain(u"b")};
    levels[a] = {plain(u"a")};
    tree.children(a);

    levels[root] = {plain(u"b")};
    levels[a] = {};
    tree.applyChanges(changeAt(aa));

    EXPECT_FALSE(tree.exists(a));
    EXPECT_THAT(tree.children(root), ElementsAre(b));
}

TEST_F(MetadataTreeTest, nodesThatOthersAddBelowAnAddressWithoutChildrenAreFound) {
    levels[root] = {plain(u"a")};
    tree.children(a);

    levels[root] = {plain(u"a", true)};
    levels[a] = {plain(u"a")};
    tree.applyChanges(changeAt(aa));

    EXPECT_THAT(tree.children(a), ElementsAre(aa));
}

TEST_F(MetadataTreeTest, levelsThatWereNeverLoadedAreNotLoadedForAChange) {
    tree.applyChanges(changeAt(aa));
    EXPECT_THAT(loaded, IsEmpty());
}

TEST_F(MetadataTreeTest, aChangeOfEverythingDropsAllLoadedLevels) {
    levels[root] = {plain(u"a")};
    tree.children(root);
    levels[root] = {plain(u"b")};
    tree.applyChanges({true, {}});
    EXPECT_THAT(tree.children(root), ElementsAre(b));
}

TEST_F(MetadataTreeTest, rollingBackRestoresTheEarlierTree) {
    levels[root] = {plain(u"a", true)};
    levels[a] = {plain(u"a")};
    auto const deep = b.child({u"t", u"x"}).child({u"t", u"y"});
    auto undo = tree.apply({{Change::Kind::Set, deep, plainNode()},
                            {Change::Kind::Remove, a, nullptr},
                            {Change::Kind::Create, a, nullptr},
                            {Change::Kind::Set, a, plainNode()}});
    EXPECT_TRUE(tree.exists(deep));
    EXPECT_FALSE(tree.exists(aa));

    tree.undo(std::move(undo));

    EXPECT_FALSE(tree.exists(b));
    EXPECT_EQ(tree.node(a), plainNode());
    EXPECT_TRUE(tree.exists(aa));
}

} // namespace
} // namespace project::stores
