// The merge of the nodes that are nested in one node: labels on a file, data, extensions.
#include "project/stores/TextMerge.hpp"

#include <gtest/gtest.h>

#include "stores/merge/MergeSamples.hpp"

namespace project::stores {

namespace {

using namespace samples;

Nested label(std::u16string const& uuid, Keys keys = {}) {
    keys.emplace(u"UUID", uuid);
    return {u"Label", keys, {}};
}

Nested category(std::u16string const& uuid, std::vector<Nested> const& labels, Keys keys = {}) {
    keys.emplace(u"UUID", uuid);
    return {u"Category", keys, labels};
}

Nested extension(std::u16string const& name, std::u16string const& value) {
    return {u"Extension", {{u"Name", name}, {u"Value", value}}, {}};
}

/// A text with one file that has these nested nodes.
std::string file(std::vector<Nested> const& nested) {
    return textWith({set(fileAddress(u"a"), makeNode(u"Info", {}, nested))});
}

TEST(TextMergeNested, labelsOfBothSidesAreOnTheFile) {
    EXPECT_EQ(merged(file({}), file({category(u"c", {label(u"1")})}), file({category(u"d", {label(u"2")})})),
              file({category(u"c", {label(u"1")}), category(u"d", {label(u"2")})}));
    EXPECT_EQ(merged(file({}), file({category(u"c", {label(u"1")})}), file({category(u"c", {label(u"2")})})),
              file({category(u"c", {label(u"1"), label(u"2")})}));
}

TEST(TextMergeNested, aLabelThatBothSidesAddedIsOnTheFileOnce) {
    EXPECT_EQ(merged(file({}), file({category(u"c", {label(u"1"), label(u"2")})}),
                     file({category(u"c", {label(u"2")})})),
              file({category(u"c", {label(u"1"), label(u"2")})}));
}

TEST(TextMergeNested, aLabelThatOneSideRemovedStaysRemoved) {
    std::string const base = file({category(u"c", {label(u"1"), label(u"2")})});
    EXPECT_EQ(merged(base, file({category(u"c", {label(u"2")})}),
                     file({category(u"c", {label(u"1"), label(u"2"), label(u"3")})})),
              file({category(u"c", {label(u"2"), label(u"3")})}));
}

TEST(TextMergeNested, anAddedLabelStaysWhenTheOtherSideRemovesTheLastOneOfItsCategory) {
    std::string const base = file({category(u"c", {label(u"1")})});
    std::string const other = file({category(u"c", {label(u"1"), label(u"2")})});
    EXPECT_EQ(merged(base, file({}), other), file({category(u"c", {label(u"2")})}));
    EXPECT_EQ(merged(base, other, file({})), file({category(u"c", {label(u"2")})}));
}

TEST(TextMergeNested, aCategoryWhoseLabelsBothSidesRemovedIsRemoved) {
    std::string const base = file({category(u"c", {label(u"1"), label(u"2")})});
    EXPECT_EQ(merged(base, file({category(u"c", {label(u"2")})}), file({category(u"c", {label(u"1")})})),
              file({}));
    EXPECT_EQ(merged(base, file({}), file({category(u"c", {label(u"2")})})), file({}));
}

TEST(TextMergeNested, aCategoryThatOneSideLeftEmptyStays) {
    std::string const base = file({category(u"c", {label(u"1")})});
    std::string const emptied = file({category(u"c", {})});
    EXPECT_EQ(merged(base, emptied, base), emptied);
    EXPECT_EQ(merged(base, base, emptied), emptied);
}

TEST(TextMergeNested, aLabelThatOneSideRemovedAndTheOtherChangedIsAConflict) {
    std::string const base = file({category(u"c", {label(u"1")})});
    std::string const changed = file({category(u"c", {label(u"1", {{u"Value", u"v"}})})});
    TextMerge const merge = mergeTexts(base, file({category(u"c", {label(u"2")})}), changed);
    ASSERT_EQ(described(merge.conflicts()), "Nested at a in Category c/Label 1, removed by ours");
    EXPECT_EQ(described(merge.conflicts()[0].nodes.base), "Label(UUID=1;)");
    EXPECT_EQ(merge.conflicts()[0].nodes.ours, nullptr);
    EXPECT_EQ(described(merge.conflicts()[0].nodes.theirs), "Label(UUID=1;Value=v;)");
    EXPECT_EQ(merged(base, file({}), changed), "Nested at a in Category c/Label 1, removed by ours");
    EXPECT_EQ(merged(base, changed, file({})), "Nested at a in Category c/Label 1, removed by theirs");
}

TEST(TextMergeNested, aNestedNodeWithMoreThanItsIdentityIsRemovedAsAWhole) {
    std::string const base = file({category(u"c", {label(u"1")}, {{u"k", u"v"}})});
    std::string const more = file({category(u"c", {label(u"1"), label(u"2")}, {{u"k", u"v"}})});
    EXPECT_EQ(merged(base, file({}), more), "Nested at a in Category c, removed by ours");
    EXPECT_EQ(merged(base, file({}), base), file({}));
}

TEST(TextMergeNested, aFileThatOneSideRemovedAndTheOtherRemovedALabelFromIsRemoved) {
    std::string const base =
        file({category(u"c", {label(u"1"), label(u"2")}), category(u"d", {label(u"3")})});
    std::string const less = file({category(u"c", {label(u"2")})});
    std::string const more = file({category(u"c", {label(u"2"), label(u"4")})});
    EXPECT_EQ(merged(base, textWith({}), less), textWith({}));
    EXPECT_EQ(merged(base, less, textWith({})), textWith({}));
    EXPECT_EQ(merged(base, more, textWith({})), "Subtree at a, removed by theirs, changed a");
}

TEST(TextMergeNested, aNestedNodeThatOneSideRemovedAndTheOtherRemovedFromIsRemoved) {
    std::string const base = file({label(u"1", {{u"k", u"1"}, {u"l", u"1"}})});
    EXPECT_EQ(merged(base, file({}), file({label(u"1", {{u"k", u"1"}})})), file({}));
}

TEST(TextMergeNested, nestedKeysAreMergedOneByOne) {
    std::string const base = file({category(u"c", {label(u"1", {{u"k", u"1"}, {u"l", u"1"}})})});
    std::string const ours = file({category(u"c", {label(u"1", {{u"k", u"2"}, {u"l", u"1"}})})});
    EXPECT_EQ(merged(base, ours, file({category(u"c", {label(u"1", {{u"k", u"1"}, {u"l", u"2"}})})})),
              file({category(u"c", {label(u"1", {{u"k", u"2"}, {u"l", u"2"}})})}));
    EXPECT_EQ(merged(base, ours, file({category(u"c", {label(u"1", {{u"k", u"3"}, {u"l", u"1"}})})})),
              "Key k at a in Category c/Label 1");
}

TEST(TextMergeNested, extensionsAreMergedByTheirNames) {
    std::string const base = file({extension(u"color", u"red"), extension(u"size", u"1")});
    std::string const ours = file({extension(u"color", u"blue"), extension(u"size", u"1")});
    std::string const theirs =
        file({extension(u"color", u"red"), extension(u"shape", u"round"), extension(u"size", u"2")});
    EXPECT_EQ(merged(base, ours, theirs),
              file({extension(u"color", u"blue"), extension(u"shape", u"round"), extension(u"size", u"2")}));
    EXPECT_EQ(merged(base, ours, file({extension(u"size", u"1")})),
              "Nested at a in Extension color, removed by theirs");
}

TEST(TextMergeNested, nodesWithoutANameAreMergedByTheirContent) {
    Nested const one{u"T", {{u"k", u"1"}}, {}};
    Nested const two{u"T", {{u"k", u"2"}}, {}};
    Nested const three{u"T", {{u"k", u"3"}}, {}};
    EXPECT_EQ(merged(file({one}), file({one, two}), file({three})), file({two, three}));
    EXPECT_EQ(merged(file({}), file({one, two}), file({two})), file({one, two}));
}

TEST(TextMergeNested, deliberateDuplicatesAreCounted) {
    auto const times = [](std::size_t count) {
        return file({category(u"c", std::vector<Nested>(count, label(u"1")))});
    };
    EXPECT_EQ(merged(times(1), times(2), times(1)), times(2));
    EXPECT_EQ(merged(times(1), times(2), times(2)), times(2));
    EXPECT_EQ(merged(times(2), times(1), times(2)), times(1));
    EXPECT_EQ(merged(times(3), times(2), times(4)), times(3));
}

TEST(TextMergeNested, nodesOfOneNameAreMatchedInOrder) {
    Nested const first = label(u"1", {{u"Value", u"x"}});
    Nested const second = label(u"1", {{u"Value", u"y"}});
    std::string const base = file({category(u"c", {first, second})});
    std::string const ours = file({category(u"c", {first, label(u"1", {{u"Value", u"z"}})})});
    std::string const theirs = file({category(u"c", {first, label(u"1", {{u"Value", u"w"}})})});
    EXPECT_EQ(merged(base, ours, theirs), "Key Value at a in Category c/Label 1#1");
}

TEST(TextMergeNested, theOrderIsThatOfTheSideThatMovedThem) {
    Nested const one = label(u"1");
    Nested const two = label(u"2");
    Nested const three = label(u"3");
    std::string const base = file({one, two, three});
    std::string const moved = file({three, one, two});
    EXPECT_EQ(merged(base, moved, file({one, two, three, label(u"4")})),
              file({three, label(u"4"), one, two}));
    EXPECT_EQ(merged(base, moved, file({two, one, three})), file({two, one, three}));
}

TEST(TextMergeNested, anAdditionStaysBehindItsPredecessor) {
    Nested const one = label(u"1");
    Nested const two = label(u"2");
    std::string const base = file({one, two});
    EXPECT_EQ(merged(base, file({one, label(u"9"), two}), file({label(u"0"), one, label(u"5"), two})),
              file({label(u"0"), one, label(u"5"), label(u"9"), two}));
}

TEST(TextMergeNested, nodesNestedAsDeepAsTheyMayBeAreMerged) {
    auto const chain = [](std::u16string const& value) {
        Nested nested = label(u"x", {{u"k", value}});
        for (int level = 1; level < 100; ++level) {
            nested = category(u"c", {nested});
        }
        return file({nested});
    };
    EXPECT_EQ(merged(chain(u"1"), chain(u"2"), chain(u"1")), chain(u"2"));
    TextMerge const merge = mergeTexts(chain(u"1"), chain(u"2"), chain(u"3"));
    ASSERT_EQ(merge.conflicts().size(), 1U);
    EXPECT_EQ(merge.conflicts()[0].nested.size(), 100U);
    EXPECT_EQ(merge.text({MergeSide::Theirs}), chain(u"3"));
}

} // namespace

} // namespace project::stores
