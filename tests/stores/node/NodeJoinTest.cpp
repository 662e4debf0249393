#include "node/NodeJoin.hpp"

#include <rapidcheck/gtest.h>

#include "support/TextGenerators.hpp"

namespace project::stores {

namespace {

using namespace samples;

Nested category(std::u16string const& uuid, Keys keys = {}, std::vector<Nested> const& labels = {}) {
    keys.emplace(u"UUID", uuid);
    return {u"Category", keys, labels};
}

Node joinTwo(Node const& earlier, Node const& later) {
    NodeJoin join(*earlier);
    join.add(*later);
    return std::move(join).take();
}

std::string joined(Node const& earlier, Node const& later) {
    return described(joinTwo(earlier, later));
}

TEST(NodeJoin, theKeysOfBothAreKeptAndTheLaterValueWins) {
    Node const earlier = makeNode(u"Info", {{u"a", u"1"}, {u"b", u"1"}});
    Node const later = makeNode(u"Info", {{u"b", u"2"}, {u"c", u"2"}});
    EXPECT_EQ(joined(earlier, later), "Info(a=1;b=2;c=2;)");
}

TEST(NodeJoin, theLaterTypeWins) {
    EXPECT_EQ(joined(makeNode(u"Info", {}), makeNode(u"", {})), "()");
}

TEST(NodeJoin, nestedNodesOfOneUuidAreJoinedDeeply) {
    Node const earlier = makeNode(u"Info", {}, {category(u"1", {}, {{u"Label", {{u"UUID", u"x"}}, {}}})});
    Node const later =
        makeNode(u"Info", {}, {category(u"1", {{u"k", u"v"}}, {{u"Label", {{u"UUID", u"y"}}, {}}})});
    EXPECT_EQ(joined(earlier, later), "Info(Category(UUID=1;k=v;Label(UUID=x;)Label(UUID=y;)))");
}

TEST(NodeJoin, theEarlierOrderIsKeptAndNewNestedNodesFollow) {
    Node const earlier = makeNode(u"Info", {}, {category(u"2"), category(u"1")});
    Node const later = makeNode(u"Info", {}, {category(u"3"), category(u"1"), category(u"2")});
    EXPECT_EQ(joined(earlier, later), "Info(Category(UUID=2;)Category(UUID=1;)Category(UUID=3;))");
}

TEST(NodeJoin, nestedNodesWithoutUuidAreMatchedByName) {
    Node const earlier = makeNode(u"Info", {}, {{u"Extension", {{u"Name", u"n"}, {u"Value", u"1"}}, {}}});
    Node const later = makeNode(u"Info", {}, {{u"Extension", {{u"Name", u"n"}, {u"Value", u"2"}}, {}}});
    EXPECT_EQ(joined(earlier, later), "Info(Extension(Name=n;Value=2;))");
}

TEST(NodeJoin, nestedNodesOfDifferentTypesAreNotJoined) {
    Node const earlier = makeNode(u"Info", {}, {{u"A", {{u"UUID", u"1"}}, {}}});
    Node const later = makeNode(u"Info", {}, {{u"B", {{u"UUID", u"1"}}, {}}});
    EXPECT_EQ(joined(earlier, later), "Info(A(UUID=1;)B(UUID=1;))");
}

TEST(NodeJoin, equalNestedNodesWithoutANameAreKeptOnce) {
    Nested const same{u"T", {{u"k", u"v"}}, {}};
    Nested const other{u"T", {{u"k", u"w"}}, {}};
    EXPECT_EQ(joined(makeNode(u"Info", {}, {same}), makeNode(u"Info", {}, {other, same})),
              "Info(T(k=v;)T(k=w;))");
    EXPECT_EQ(joined(makeNode(u"Info", {}, {same}), makeNode(u"Info", {}, {same, same})),
              "Info(T(k=v;)T(k=v;))");
}

TEST(NodeJoin, duplicateNestedNodesAreMatchedInOrder) {
    Nested const one{u"T", {{u"UUID", u"1"}, {u"k", u"a"}}, {}};
    Nested const other{u"T", {{u"UUID", u"1"}, {u"l", u"b"}}, {}};
    NodeJoin join(*makeNode(u"Info", {}, {one}));
    join.add(*makeNode(u"Info", {}, {other, one}));
    join.add(*makeNode(u"Info", {}, {other, other, one}));
    EXPECT_EQ(described(std::move(join).take()), "Info(T(UUID=1;k=a;l=b;)T(UUID=1;k=a;l=b;)T(UUID=1;k=a;))");
}

RC_GTEST_PROP(NodeJoin, joiningManyIsJoiningOneByOne, ()) {
    Node const first = *anyNode();
    NodeJoin join(*first);
    Node oneByOne = first;
    for (Node const& later : *fewOf(4, anyNode())) {
        join.add(*later);
        oneByOne = joinTwo(oneByOne, later);
    }
    RC_ASSERT(described(std::move(join).take()) == described(oneByOne));
}

RC_GTEST_PROP(NodeJoin, aNodeJoinedWithItselfIsItself, ()) {
    Node const node = *anyNode();
    RC_ASSERT(joined(node, node) == described(node));
}

} // namespace

} // namespace project::stores
