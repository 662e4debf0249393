// The merge of addresses, and of the keys and types of their nodes.
#include "project/stores/TextMerge.hpp"

#include <gtest/gtest.h>

#include "stores/merge/MergeSamples.hpp"

namespace project::stores {

namespace {

using namespace samples;

TEST(TextMerge, additionsOfEitherSideAreMerged) {
    std::string const base = bodyOf({R"("b")"});
    EXPECT_EQ(merged(base, bodyOf({R"("a")", R"("b")"}), bodyOf({R"("b")", R"("c")"})),
              bodyOf({R"("a")", R"("b")", R"("c")"}));
}

TEST(TextMerge, additionsOfBothSidesAreMergedOnce) {
    std::string const both = bodyOf({R"("a")", R"("a/")", R"("a/x")"});
    EXPECT_EQ(merged(bodyOf({}), both, both), both);
}

TEST(TextMerge, removalsOfEitherSideAreMerged) {
    std::string const base = bodyOf({R"("a")", R"("b")", R"("c")"});
    EXPECT_EQ(merged(base, bodyOf({R"("b")", R"("c")"}), bodyOf({R"("a")", R"("b")"})), bodyOf({R"("b")"}));
}

TEST(TextMerge, removalsOfBothSidesAreMerged) {
    EXPECT_EQ(merged(bodyOf({R"("a")", R"("a/")", R"("a/x")"}), bodyOf({}), bodyOf({})), bodyOf({}));
}

TEST(TextMerge, aNodeThatOneSideChangedIsTakenFromThatSide) {
    std::string const base = bodyOf({R"({"file":"a","keys":{"k":"1"}})", R"("b")"});
    std::string const changed = bodyOf({R"({"file":"a","keys":{"k":"2"}})", R"("b")"});
    EXPECT_EQ(merged(base, changed, base), changed);
    EXPECT_EQ(merged(base, base, changed), changed);
    EXPECT_EQ(merged(base, changed, changed), changed);
}

TEST(TextMerge, keysAreMergedOneByOne) {
    std::string const base =
        bodyOf({R"({"file":"a","keys":{"gone":"1","kept":"1","ours":"1","same":"1","theirs":"1"}})"});
    std::string const ours =
        bodyOf({R"({"file":"a","keys":{"kept":"1","new":"3","ours":"2","same":"2","theirs":"1"}})"});
    std::string const theirs = bodyOf(
        {R"({"file":"a","keys":{"gone":"1","kept":"1","new":"3","ours":"1","other":"4","same":"2"}})"});
    EXPECT_EQ(merged(base, ours, theirs),
              bodyOf({R"({"file":"a","keys":{"kept":"1","new":"3","other":"4","ours":"2","same":"2"}})"}));
}

TEST(TextMerge, aKeyThatBothSidesSetToDifferentValuesIsAConflict) {
    TextMerge const merge =
        mergeTexts(bodyOf({R"({"file":"a","keys":{"k":"1"}})"}), bodyOf({R"({"file":"a","keys":{"k":"2"}})"}),
                   bodyOf({R"({"file":"a","keys":{"k":"3"}})"}));
    ASSERT_EQ(described(merge.conflicts()), "Key k at a");
    EXPECT_EQ(merge.conflicts()[0].values.base, u"1");
    EXPECT_EQ(merge.conflicts()[0].values.ours, u"2");
    EXPECT_EQ(merge.conflicts()[0].values.theirs, u"3");
}

TEST(TextMerge, aKeyThatOneSideRemovedAndTheOtherChangedIsAConflict) {
    std::string const base = bodyOf({R"({"file":"a","keys":{"k":"1"}})"});
    std::string const removed = bodyOf({R"("a")"});
    std::string const changed = bodyOf({R"({"file":"a","keys":{"k":"2"}})"});
    EXPECT_EQ(merged(base, removed, changed), "Key k at a, removed by ours");
    EXPECT_EQ(merged(base, changed, removed), "Key k at a, removed by theirs");
    EXPECT_EQ(mergeTexts(base, removed, changed).conflicts()[0].values.ours, std::nullopt);
}

TEST(TextMerge, anEmptyValueIsAValue) {
    std::string const base = bodyOf({R"({"file":"a","keys":{"k":"1","l":"1"}})"});
    std::string const emptied = bodyOf({R"({"file":"a","keys":{"k":"","l":"1"}})"});
    std::string const other = bodyOf({R"({"file":"a","keys":{"k":"1","l":"2"}})"});
    EXPECT_EQ(merged(base, emptied, other), bodyOf({R"({"file":"a","keys":{"k":"","l":"2"}})"}));
}

TEST(TextMerge, twoTypesForOneNodeAreAConflict) {
    std::string const base = bodyOf({R"("a")"});
    std::string const ours = bodyOf({R"({"file":"a","type":"T"})"});
    std::string const theirs = bodyOf({R"({"file":"a","keys":{"k":"1"}})"});
    EXPECT_EQ(merged(base, ours, theirs), bodyOf({R"({"file":"a","type":"T","keys":{"k":"1"}})"}));
    EXPECT_EQ(merged(base, ours, bodyOf({R"({"file":"a","type":""})"})), "Type at a");
}

TEST(TextMerge, aNodeThatBothSidesAddedIsMergedByKey) {
    std::string const ours = bodyOf({R"({"file":"a","keys":{"k":"1","o":"1"}})"});
    std::string const theirs = bodyOf({R"({"file":"a","keys":{"k":"1","t":"1"}})"});
    EXPECT_EQ(merged(bodyOf({}), ours, theirs), bodyOf({R"({"file":"a","keys":{"k":"1","o":"1","t":"1"}})"}));
    EXPECT_EQ(merged(bodyOf({}), ours, bodyOf({R"({"file":"a","keys":{"k":"2"}})"})), "Key k at a");
}

TEST(TextMerge, anAddressThatOneSideCreatedGetsTheNodeOfTheOther) {
    std::string const made = bodyOf({R"({"at":["References","Root"],"node":false})"});
    std::string const node = bodyOf({R"({"at":["References","Root"],"keys":{"k":"1"}})"});
    EXPECT_EQ(merged(bodyOf({}), made, made), made);
    EXPECT_EQ(merged(bodyOf({}), made, node), node);
    EXPECT_EQ(merged(bodyOf({}), node, made), node);
    EXPECT_EQ(merged(made, node, bodyOf({})),
              R"(Subtree at "References","Root", removed by theirs, changed "References","Root")");
}

TEST(TextMerge, twoNodesForAnAddressThatWasCreatedAreMergedByKey) {
    std::string const base = bodyOf({R"({"file":"a","node":false})"});
    std::string const ours = bodyOf({R"({"file":"a","keys":{"o":"1"}})"});
    std::string const theirs = bodyOf({R"({"file":"a","keys":{"t":"1"}})"});
    EXPECT_EQ(merged(base, ours, theirs), bodyOf({R"({"file":"a","keys":{"o":"1","t":"1"}})"}));
}

TEST(TextMerge, aNodeThatOneSideRemovedFromItsAddressAndTheOtherChangedIsAConflict) {
    std::string const base = bodyOf({R"("a")", R"("b")"});
    std::string const ours = bodyOf({R"({"file":"a","node":false})", R"("b")"});
    std::string const theirs = bodyOf({R"({"file":"a","keys":{"k":"1"}})", R"("b")"});
    EXPECT_EQ(merged(base, ours, theirs), "Subtree at a, removed by ours, changed a");
    EXPECT_EQ(merged(base, ours, base), ours);
}

TEST(TextMerge, aFolderThatOneSideRemovedAndTheOtherPutAFileIntoIsAConflict) {
    std::string const base = bodyOf({R"("a")", R"("a/")", R"("a/x")", R"("b")"});
    std::string const removed = bodyOf({R"("b")"});
    std::string const added = bodyOf({R"("a")", R"("a/")", R"("a/x")", R"("a/y")", R"("b")"});
    TextMerge const merge = mergeTexts(base, removed, added);
    ASSERT_EQ(described(merge.conflicts()), "Subtree at a, removed by ours, changed a/y");
    EXPECT_EQ(described(merge.conflicts()[0].nodes.base), "Info()");
    EXPECT_EQ(merge.conflicts()[0].nodes.ours, nullptr);
    EXPECT_EQ(described(merge.conflicts()[0].nodes.theirs), "Info()");
    EXPECT_EQ(merged(base, added, removed), "Subtree at a, removed by theirs, changed a/y");
}

TEST(TextMerge, aFolderThatOneSideRemovedAndTheOtherLabelledAFileInIsAConflict) {
    std::string const base = bodyOf({R"("a")", R"("a/x")", R"("a/y")"});
    std::string const changed = bodyOf({R"("a")", R"({"file":"a/x","keys":{"k":"1"}})", R"("a/y")"});
    EXPECT_EQ(merged(base, bodyOf({}), changed), "Subtree at a, removed by ours, changed a/x");
}

TEST(TextMerge, onlyTheTopmostOfTheRemovedAddressesIsReported) {
    std::string const base = bodyOf({R"("a")", R"("a/b")", R"("a/b/x")", R"("a/c")"});
    std::string const added = bodyOf({R"("a")", R"("a/b")", R"("a/b/x")", R"("a/b/y")"});
    EXPECT_EQ(merged(base, bodyOf({}), added), "Subtree at a, removed by ours, changed a/b/y");
    EXPECT_EQ(merged(base, bodyOf({R"("a")", R"("a/c")"}), added),
              "Subtree at a/b, removed by ours, changed a/b/y");
}

TEST(TextMerge, aCategoryThatOneSideDeletedAndTheOtherCreatedALabelInIsAConflict) {
    std::string const category = R"({"at":["Categories","Root","Category","c"],"keys":{"Name":"Kind"}})";
    std::string const label =
        R"({"at":["Categories","Root","Category","c","Label","l"],"keys":{"Name":"Source"}})";
    EXPECT_EQ(merged(bodyOf({category}), bodyOf({}), bodyOf({category, label})),
              R"(Subtree at "Categories","Root","Category","c", removed by ours, )"
              R"(changed "Categories","Root","Category","c","Label","l")");
}

TEST(TextMerge, aFolderThatOneSideRemovedAndTheOtherRemovedFromIsRemoved) {
    std::string const base = bodyOf({R"("a")", R"("a/x")", R"("a/y")", R"("b")"});
    std::string const less = bodyOf({R"("a")", R"("a/y")", R"("b")"});
    EXPECT_EQ(merged(base, bodyOf({R"("b")"}), less), bodyOf({R"("b")"}));
    EXPECT_EQ(merged(base, less, bodyOf({R"("b")"})), bodyOf({R"("b")"}));
}

TEST(TextMerge, aNodeThatOneSideRemovedAndTheOtherRemovedFromIsRemoved) {
    std::string const base = bodyOf({R"("a")", R"({"file":"a/x","keys":{"k":"1","l":"1"}})"});
    std::string const less = bodyOf({R"("a")", R"({"file":"a/x","keys":{"k":"1"}})"});
    std::string const bare = bodyOf({R"("a")", R"({"file":"a/x","node":false})"});
    for (std::string const& other : {less, bare}) {
        EXPECT_EQ(merged(base, bodyOf({R"("a")"}), other), bodyOf({R"("a")"}));
        EXPECT_EQ(merged(base, other, bodyOf({})), bodyOf({}));
    }
    std::string const swapped = bodyOf({R"("a")", R"({"file":"a/x","keys":{"l":"2"}})"});
    EXPECT_EQ(merged(base, bodyOf({R"("a")"}), swapped), "Subtree at a/x, removed by ours, changed a/x");
}

TEST(TextMerge, anAddressThatDidNotExistIsNeverRemoved) {
    std::string const base = bodyOf({R"({"at":["Categories","Root","Category","c"]})"});
    std::string const other = bodyOf(
        {R"({"at":["Categories","Root","Category","c"]})", R"({"at":["Categories","Root","Category","d"]})"});
    EXPECT_EQ(merged(base, bodyOf({}), other), bodyOf({R"({"at":["Categories","Root","Category","d"]})"}));
    EXPECT_EQ(merged(bodyOf({R"("a/x")"}), bodyOf({}), bodyOf({R"("a/x")", R"("a/y")"})),
              bodyOf({R"("a/y")"}));
}

TEST(TextMerge, aNodeIsRemovedAloneIfSomethingBelowItStays) {
    std::string const base = bodyOf({R"("a")", R"("a/x")"});
    std::string const removed = bodyOf({R"("a/x")"});
    EXPECT_EQ(merged(base, removed, bodyOf({R"("a")", R"("a/x")", R"("a/y")"})),
              bodyOf({R"("a/x")", R"("a/y")"}));
    EXPECT_EQ(merged(base, removed, bodyOf({R"({"file":"a","keys":{"k":"1"}})", R"("a/x")"})),
              "Subtree at a, removed by ours, changed a");
}

TEST(TextMerge, aFileThatBecameAFolderOnOneSideKeepsWhatTheOtherPutOnIt) {
    std::string const base = bodyOf({R"("a")"});
    std::string const folder = bodyOf({R"("a")", R"("a/")", R"("a/x")"});
    std::string const changed = bodyOf({R"({"file":"a","keys":{"k":"1"}})"});
    EXPECT_EQ(merged(base, folder, changed),
              bodyOf({R"({"file":"a","keys":{"k":"1"}})", R"("a/")", R"("a/x")"}));
}

TEST(TextMerge, withoutACommonVersionBothProjectsAreInTheMergedOne) {
    std::string const ours =
        bodyOf({R"("a")", R"({"at":["Info","ProjectData"],"type":"","keys":{"Name":"P"}})"});
    std::string const theirs =
        bodyOf({R"("b")", R"({"at":["Info","ProjectData"],"type":"","keys":{"Name":"P"}})"});
    EXPECT_EQ(merged("", ours, theirs),
              bodyOf({R"("a")", R"("b")", R"({"at":["Info","ProjectData"],"type":"","keys":{"Name":"P"}})"}));
    std::string const other = bodyOf({R"({"at":["Info","ProjectData"],"type":"","keys":{"Name":"Q"}})"});
    EXPECT_EQ(merged("", ours, other), R"(Key Name at "Info","ProjectData")");
    EXPECT_EQ(merged("", ours, bodyOf({})), ours);
}

TEST(TextMerge, addressesAreSortedWhateverTheirForm) {
    std::string const base = bodyOf({});
    std::string const ours = bodyOf({R"("a/b")", R"("a.b")", R"({"at":["Info","x"]})"});
    std::string const theirs = bodyOf({R"({"at":["Categories","Root"]})", R"("a")", R"("a b")"});
    EXPECT_EQ(merged(base, ours, theirs), bodyOf({R"({"at":["Categories","Root"]})", R"("a")", R"("a/b")",
                                                  R"("a b")", R"("a.b")", R"({"at":["Info","x"]})"}));
    EXPECT_EQ(merged(base, ours, theirs), merged(base, theirs, ours));
}

} // namespace

} // namespace project::stores
