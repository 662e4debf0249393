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

/// What passChildren passes on, in words.
class PassedChildren : public ChildSink {
public:
    void add(LoadedChild const& child) override {
        lines.push_back(std::u16string(child.location) + (child.node ? u" node" : u"") +
                        (child.isCreated ? u" created" : u"") + (child.hasChildren ? u" children" : u""));
    }

    std::vector<std::u16string> lines;
};

TEST_F(MetadataTreeTest, aLevelThatIsOnlyPassedOnIsNotKept) {
    levels[root] = {plain(u"a", true), bare(u"b")};
    for (int time = 0; time < 2; ++time) {
        PassedChildren passed;
        tree.passChildren(root, passed);
        EXPECT_THAT(passed.lines, ElementsAre(u"a node children", u"b children"));
    }
    EXPECT_THAT(loaded, ElementsAre(root, root));
}

TEST_F(MetadataTreeTest, aLoadedLevelIsPassedOnFromMemoryWithTheChangesOfABatch) {
    levels[root] = {plain(u"a", true), plain(u"b", true), plain(u"c")};
    levels[a] = {plain(u"x")};
    levels[b] = {plain(u"x")};
    tree.apply({{Change::Kind::Remove, b, nullptr},
                {Change::Kind::Create, root.child({u"t", u"d"}), nullptr},
                {Change::Kind::Set, root.child({u"t", u"c"}).child({u"t", u"new"}), plainNode()},
                {Change::Kind::Remove, a.child({u"t", u"x"}), nullptr}});
    loaded.clear();

    PassedChildren top;
    tree.passChildren(root, top);
    EXPECT_THAT(top.lines, ElementsAre(u"a node", u"c node children", u"d created"));
    PassedChildren below;
    for (auto const& address : {a, b, b.child({u"t", u"x"}), root.child({u"t", u"d"})}) {
        tree.passChildren(address, below);
    }
    EXPECT_THAT(below.lines, IsEmpty());
    EXPECT_THAT(loaded, IsEmpty());
}

TEST_F(MetadataTreeTest, aLevelBelowALoadedOneIsPassedOnFromTheLoader) {
    levels[root] = {plain(u"a", true)};
    levels[a] = {plain(u"a", true)};
    levels[aa] = {plain(u"deep")};
    tree.children(root);
    PassedChildren passed;
    tree.passChildren(aa, passed);
    EXPECT_THAT(passed.lines, ElementsAre(u"deep node"));
    EXPECT_THAT(loaded, ElementsAre(root, aa));
}

} // namespace
} // namespace project::stores
