#include "merge/ConflictWords.hpp"

#include <initializer_list>
#include <utility>

#include <gtest/gtest.h>

namespace projectctl {
namespace {

using project::metadata::MetadataPath;
using project::metadata::PathElement;
using project::stores::MergeConflict;
using project::stores::MergeSide;

MetadataPath address(std::initializer_list<std::pair<char16_t const*, char16_t const*>> steps) {
    auto result = MetadataPath::root();
    for (auto const& [type, location] : steps) {
        result = result.child(PathElement(type, location));
    }
    return result;
}

MetadataPath file(char16_t const* folder, char16_t const* name) {
    return address({{u"Files", u"Root"}, {u"File", folder}, {u"File", name}});
}

MergeConflict conflictAt(MetadataPath where, MergeConflict::Kind kind) {
    return {.kind = kind,
            .address = std::move(where),
            .nested = {},
            .key = {},
            .removedBy = {},
            .values = {},
            .nodes = {},
            .changed = {}};
}

/// The words for an address of which ours changed the key "K" and theirs removed it.
std::string wordsFor(MetadataPath where) {
    auto conflict = conflictAt(std::move(where), MergeConflict::Kind::Key);
    conflict.key = u"K";
    conflict.values.ours = u"new";
    return inWords(conflict);
}

std::string keyOf(std::string const& subject) {
    return "the \"K\" of " + subject + " is set to \"new\" by ours and removed by theirs";
}

TEST(ConflictWords, nameEachPartOfTheDefinition) {
    EXPECT_EQ(wordsFor(file(u"src", u"a.c")), keyOf("the file \"src/a.c\""));
    EXPECT_EQ(wordsFor(address({{u"Files", u"Root"}, {u"File", u"a"}, {u"LabelData", u"Data"}})),
              keyOf("the data of the file \"a\""));
    EXPECT_EQ(wordsFor(address({{u"Categories", u"Root"}, {u"Category", u"c1"}})),
              keyOf("the category \"c1\""));
    EXPECT_EQ(wordsFor(address({{u"Categories", u"Root"}, {u"Category", u"c1"}, {u"Label", u"l1"}})),
              keyOf("the label \"l1\""));
    EXPECT_EQ(wordsFor(address({{u"EntryPoints", u"Root"}, {u"EntryPoint", u"e1"}})),
              keyOf("the entry point \"e1\""));
    EXPECT_EQ(wordsFor(address({{u"EntryPointGroups", u"Root"}, {u"EntryPointGroup", u"g1"}})),
              keyOf("the entry point group \"g1\""));
    EXPECT_EQ(wordsFor(address({{u"ProjectPath", u"Root"}, {u"Reference", u"r1"}})),
              keyOf("the reference in the project path \"r1\""));
    EXPECT_EQ(wordsFor(address({{u"References", u"Root"}, {u"Reference", u"r2"}})),
              keyOf("the reference in the referenced projects \"r2\""));
}

TEST(ConflictWords, nameAnythingElseByItsAddress) {
    EXPECT_EQ(wordsFor(address({{u"Info", u"ProjectData"}})), keyOf("the data at \"Info ProjectData\""));
    EXPECT_EQ(wordsFor(address({{u"EntryPoints", u"Root"}})), keyOf("the data at \"EntryPoints Root\""));
    EXPECT_EQ(wordsFor(address({{u"Odd", u"One"}, {u"Below", u"It"}})),
              keyOf("the data at \"Odd One\" \"Below It\""));
}

TEST(ConflictWords, describeATypeThatBothSidesChanged) {
    auto conflict = conflictAt(file(u"src", u"a.c"), MergeConflict::Kind::Type);
    conflict.values.ours = u"One";
    conflict.values.theirs = u"Two";

    EXPECT_EQ(inWords(conflict),
              "the type of the file \"src/a.c\" is set to \"One\" by ours and set to \"Two\" by theirs");
}

TEST(ConflictWords, describeNestedNodesFromTheInnermostOne) {
    auto conflict = conflictAt(file(u"src", u"a.c"), MergeConflict::Kind::Nested);
    conflict.nested = {{u"Category", u"UUID", u"c1", 0}, {u"Label", u"UUID", u"l1", 0}};
    conflict.removedBy = MergeSide::Theirs;

    EXPECT_EQ(inWords(conflict),
              "the label \"l1\" of the category \"c1\" on the file \"src/a.c\" is removed by theirs "
              "and changed by ours");

    conflict.nested = {{u"Extension", u"Name", u"icon", 0}};
    conflict.removedBy = MergeSide::Ours;
    EXPECT_EQ(inWords(conflict),
              "the \"Extension\" \"icon\" on the file \"src/a.c\" is removed by ours and changed by theirs");
}

TEST(ConflictWords, nameTheFirstChangeBelowARemovedAddress) {
    auto conflict =
        conflictAt(address({{u"Files", u"Root"}, {u"File", u"src"}}), MergeConflict::Kind::Subtree);
    conflict.removedBy = MergeSide::Ours;
    auto const words = std::string("the file \"src\" is removed by ours and changed by theirs");

    EXPECT_EQ(inWords(conflict), words);

    conflict.changed = {conflict.address};
    EXPECT_EQ(inWords(conflict), words);

    conflict.changed = {file(u"src", u"a.c"), file(u"src", u"b.c")};
    EXPECT_EQ(inWords(conflict), words + ", in the file \"src/a.c\"");
}

} // namespace
} // namespace projectctl
