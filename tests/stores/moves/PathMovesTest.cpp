#include "project/stores/PathMoves.hpp"

#include <gtest/gtest.h>

#include "support/ProjectTextSamples.hpp"

namespace project::stores {
namespace {

using namespace samples;

PathMoves moves(std::initializer_list<std::pair<char16_t const*, char16_t const*>> pairs) {
    PathMoves result;
    for (auto const& [from, to] : pairs) {
        result.add(from, to);
    }
    return result;
}

std::optional<std::u16string> none() {
    return std::nullopt;
}

TEST(PathMoves, moveExactlyTheirOwnPaths) {
    auto const result = moves({{u"src", u"lib"}, {u"a", u"a"}});

    EXPECT_EQ(result.moved(u"src"), u"lib");
    EXPECT_EQ(result.moved(u"src/main.cpp"), none());
    EXPECT_EQ(result.moved(u"srcs"), none());
    EXPECT_EQ(result.moved(u"a"), none());
    EXPECT_EQ(result.moved(u""), none());
}

TEST(PathMoves, ofTreesMoveWhateverHasNoMoveOfItsOwn) {
    auto result = moves({{u"src/main.cpp", u"main.cpp"}, {u"src/kept", u"src/kept"}});
    result.add(u"src", u"lib", true);
    result.add(u"src/io", u"io", true);

    EXPECT_EQ(result.moved(u"src"), u"lib");
    EXPECT_EQ(result.moved(u"src/main.cpp"), u"main.cpp");
    EXPECT_EQ(result.moved(u"src/main.cpp/x"), u"lib/main.cpp/x");
    EXPECT_EQ(result.moved(u"src/kept"), none());
    EXPECT_EQ(result.moved(u"src/a/b"), u"lib/a/b");
    EXPECT_EQ(result.moved(u"src/io/b"), u"io/b");
    EXPECT_EQ(result.moved(u"srcs/io"), none());
}

TEST(PathMoves, exchangeTwoFiles) {
    auto const result = moves({{u"a", u"b"}, {u"b", u"a"}});

    EXPECT_EQ(result.moved(u"a"), u"b");
    EXPECT_EQ(result.moved(u"b"), u"a");
    EXPECT_EQ(result.reversed().moved(u"a"), u"b");
}

TEST(PathMoves, reversedRestoreEachPath) {
    PathMoves result = moves({{u"a", u"b/c"}});
    result.add(u"src", u"lib", true);

    EXPECT_EQ(result.reversed().moved(u"b/c"), u"a");
    EXPECT_EQ(result.reversed().moved(u"lib/x"), u"src/x");
}

TEST(PathMoves, applyToAddressesInEveryScopeAndBelowAFile) {
    auto const result = moves({{u"src/a", u"b"}});
    for (auto const* scope : {u"Root", u"Other"}) {
        auto const files = Address::root().child({u"Files", scope});
        auto const from = files.child({u"File", u"src"}).child({u"File", u"a"});
        auto const to = files.child({u"File", u"b"});

        EXPECT_EQ(result.moved(from), to);
        EXPECT_EQ(result.moved(from.child({u"LabelData", u"Data"})), to.child({u"LabelData", u"Data"}));
        EXPECT_EQ(result.moved(from.child({u"x", u"1"}).child({u"File", u"y"})),
                  to.child({u"x", u"1"}).child({u"File", u"y"}));
        EXPECT_EQ(result.moved(from.child({u"File", u"y"})), std::nullopt);
    }
    EXPECT_EQ(result.moved(Address::root().child({u"Categories", u"Root"}).child({u"File", u"a"})),
              std::nullopt);
    EXPECT_EQ(result.moved(Address::root()), std::nullopt);
}

TEST(PathMoves, doNotTakeANameWithASlashForTwoNames) {
    auto const files = Address::root().child({u"Files", u"Root"});

    EXPECT_EQ(moves({{u"a/b", u"c"}}).moved(files.child({u"File", u"a/b"})), std::nullopt);
    EXPECT_EQ(moves({{u"a", u"c"}}).moved(files.child({u"File", u""}).child({u"File", u"a"})), std::nullopt);
}

/// The value of a key after moving.
std::u16string movedValue(PathMoves const& moves, char16_t const* head, char16_t const* step,
                          Keys const& keys, char16_t const* key, std::u16string_view root = {}) {
    auto const address = Address::root().child({head, u"Root"}).child({step, u"1"});
    return moves.moved(address, makeNode(u"Info", keys), root)->get(key);
}

TEST(PathMoves, applyToEntryPointsAndToRelativeReferences) {
    auto const both = moves({{u"src", u"lib"}, {u"src/a", u"b"}});
    for (auto const* head : {u"ProjectPath", u"References"}) {
        EXPECT_EQ(movedValue(both, head, u"Reference", {{u"Ref", u"src"}, {u"Type", u"Relative"}}, u"Ref"),
                  u"lib");
        EXPECT_EQ(movedValue(both, head, u"Reference", {{u"Ref", u"../src"}, {u"Type", u"Relative"}}, u"Ref"),
                  u"../src");
        EXPECT_EQ(movedValue(both, head, u"Reference", {{u"Ref", u"src"}, {u"Type", u"Other"}}, u"Ref"),
                  u"src");
    }
    EXPECT_EQ(movedValue(both, u"EntryPoints", u"EntryPoint", {{u"File", u"src/a"}}, u"File"), u"b");
    EXPECT_EQ(movedValue(both, u"EntryPointGroups", u"EntryPointGroup", {{u"File", u"src/a"}}, u"File"),
              u"src/a");
}

TEST(PathMoves, applyToAbsoluteReferencesBelowAKnownRoot) {
    auto const result = moves({{u"src", u"lib"}});
    Keys const keys{{u"Ref", u"/p/src"}, {u"Type", u"Absolute"}};

    EXPECT_EQ(movedValue(result, u"References", u"Reference", keys, u"Ref", u"/p"), u"/p/lib");
    EXPECT_EQ(movedValue(result, u"References", u"Reference", keys, u"Ref"), u"/p/src");
    EXPECT_EQ(movedValue(result, u"References", u"Reference", keys, u"Ref", u"/"), u"/p/src");
}

TEST(PathMoves, returnANodeThatTheyDoNotChange) {
    auto const node = makeNode(u"Info", {{u"File", u"a"}});
    auto const address = Address::root().child({u"EntryPoints", u"Root"}).child({u"EntryPoint", u"1"});

    EXPECT_EQ(moves({{u"b", u"a"}}).moved(address, node), node);
    EXPECT_EQ(moves({{u"b", u"a"}}).moved(address, nullptr), nullptr);
}

} // namespace
} // namespace project::stores
