// Merges in criss-cross histories. Two branches have merged each other, and each has resolved the conflicts
// in its own way. When they are merged again, git first merges the two common versions, and the result
// contains markers.
#include "project/stores/TextMerge.hpp"

#include "stores/merge/MergeSamples.hpp"
#include "support/TextStore.hpp"

namespace project::stores {

namespace {

using namespace samples;

/// The merge of the common versions, as git passes it to the merge driver.
std::string unfinished(std::string const& base, std::string const& ours, std::string const& theirs) {
    TextMerge const merge = mergeTexts(base, ours, theirs);
    EXPECT_FALSE(merge.conflicts().empty());
    return merge.textWithMarkers();
}

/// A file with one key.
std::string keyed(std::string const& value) {
    return bodyOf({R"({"file":"a","keys":{"k":")" + value + R"("}})"});
}

/// A file with a nested node that has a value.
std::string nested(std::string const& value) {
    return bodyOf({R"({"file":"a","children":[{"type":"E","keys":{"Name":"n","V":")" + value + R"("}}]})"});
}

class DisputedKey : public ::testing::Test {
protected:
    std::string const base = unfinished(keyed("1"), keyed("2"), keyed("3"));
    std::string const without = bodyOf({R"("a")"});
};

TEST_F(DisputedKey, isTakenOverIfBothSidesAgree) {
    EXPECT_EQ(merged(base, keyed("2"), keyed("2")), keyed("2"));
    EXPECT_EQ(merged(base, keyed("4"), keyed("4")), keyed("4"));
    EXPECT_EQ(merged(base, without, without), without);
}

TEST_F(DisputedKey, isAConflictIfTheSidesDiffer) {
    EXPECT_EQ(merged(base, keyed("2"), keyed("3")), "Key k at a");
    EXPECT_EQ(merged(base, keyed("3"), keyed("2")), "Key k at a");
    EXPECT_EQ(merged(base, keyed("4"), keyed("3")), "Key k at a");
}

TEST_F(DisputedKey, isAConflictIfOneSideRemovedIt) {
    EXPECT_EQ(merged(base, keyed("2"), without), "Key k at a, removed by theirs");
    EXPECT_EQ(merged(base, without, keyed("3")), "Key k at a, removed by ours");
    EXPECT_EQ(merged(base, keyed("2"), bodyOf({})), "Subtree at a, removed by theirs, changed a");
}

TEST_F(DisputedKey, isAConflictIfOnlyOneCommonVersionHasIt) {
    std::string const disputed = unfinished(keyed("1"), keyed("2"), without);
    EXPECT_EQ(merged(disputed, keyed("2"), without), "Key k at a, removed by theirs");
    EXPECT_EQ(merged(disputed, keyed("2"), keyed("2")), keyed("2"));
    EXPECT_EQ(merged(disputed, without, without), without);
}

TEST_F(DisputedKey, doesNotAffectTheRest) {
    auto const a = [](std::string const& value) {
        return R"({"file":"a","keys":{"k":")" + value + R"(","l":"1"}})";
    };
    std::string const disputed =
        unfinished(bodyOf({a("1"), R"("b")", R"("c")"}), bodyOf({a("2"), R"("b")", R"("c")", R"("d")"}),
                   bodyOf({a("3"), R"("c")", R"("e")"}));

    // Since the earlier merges, ours removed c, theirs removed d and added f.
    EXPECT_EQ(merged(disputed, bodyOf({a("2"), R"("d")", R"("e")"}),
                     bodyOf({a("2"), R"("c")", R"("e")", R"("f")"})),
              bodyOf({a("2"), R"("e")", R"("f")"}));
    EXPECT_EQ(merged(disputed, keyed("2"), bodyOf({a("2")})), keyed("2"))
        << "a key that is not disputed can be removed";
}

TEST(DisputedType, isAConflictIfTheSidesDiffer) {
    auto const typed = [](std::string const& type) {
        return bodyOf({R"({"file":"a","type":")" + type + R"("})"});
    };
    std::string const base = unfinished(typed("R"), typed("S"), typed("T"));
    EXPECT_EQ(merged(base, typed("S"), typed("T")), "Type at a");
    EXPECT_EQ(merged(base, typed("T"), typed("T")), typed("T"));
}

class DisputedAddress : public ::testing::Test {
protected:
    std::string const kept = bodyOf({R"("d")", R"("d/x")", R"("d/y")"});
    std::string const removed = bodyOf({});
    std::string const base = unfinished(bodyOf({R"("d")", R"("d/x")"}), removed, kept);
};

TEST_F(DisputedAddress, isTakenOverIfBothSidesAgree) {
    EXPECT_EQ(merged(base, kept, kept), kept);
    EXPECT_EQ(merged(base, removed, removed), removed);
}

TEST_F(DisputedAddress, isAConflictIfOneSideRemovedIt) {
    EXPECT_EQ(merged(base, kept, removed),
              "Subtree at d, removed by theirs, changed d, changed d/x, changed d/y");
    EXPECT_EQ(merged(base, removed, kept),
              "Subtree at d, removed by ours, changed d, changed d/x, changed d/y");
    EXPECT_EQ(merged(base, bodyOf({R"("d")", R"("d/x")"}), kept),
              "Subtree at d/y, removed by ours, changed d/y");
}

TEST_F(DisputedAddress, canBeExtendedByBothSides) {
    EXPECT_EQ(merged(base, bodyOf({R"("d")", R"("d/x")", R"("d/y")", R"("d/z")"}),
                     bodyOf({R"("d")", R"({"file":"d/x","keys":{"k":"1"}})", R"("d/y")"})),
              bodyOf({R"("d")", R"({"file":"d/x","keys":{"k":"1"}})", R"("d/y")", R"("d/z")"}));
}

TEST(DisputedNestedNode, isTakenOverIfBothSidesAgreeAndElseAConflict) {
    std::string const none = bodyOf({R"("a")"});
    std::string const base = unfinished(nested("1"), nested("2"), none);
    EXPECT_EQ(merged(base, nested("2"), nested("2")), nested("2"));
    EXPECT_EQ(merged(base, none, none), none);
    EXPECT_EQ(merged(base, nested("2"), none), "Nested at a in E n, removed by theirs");
    EXPECT_EQ(merged(base, none, nested("2")), "Nested at a in E n, removed by ours");
    EXPECT_EQ(merged(base, nested("2"), nested("3")), "Key V at a in E n");
}

/// Without the merge driver, git puts markers around lines that the driver would have merged.
TEST(DisputedNestedNode, withNothingButItsIdentityIsKept) {
    auto const labelled = [](std::string const& labels) {
        return R"({"file":"a","children":[)" + labels + "]}";
    };
    std::string const one = R"({"type":"L","keys":{"UUID":"1"}})";
    std::string const two = R"({"type":"L","keys":{"UUID":"2"}})";
    std::string const base =
        bodyOf({"<<<<<<< HEAD", labelled(one), "=======", labelled(two), ">>>>>>> hers"});
    std::string const both = bodyOf({labelled(one + ',' + two)});
    EXPECT_EQ(merged(base, both, bodyOf({labelled(one)})), both);
    EXPECT_EQ(merged(base, bodyOf({labelled(two)}), both), both);
}

TEST(DisputedNestedNode, withAnEmptyUuidIsIdentifiedByItsName) {
    auto const node = [](std::string const& value) {
        return bodyOf({R"({"file":"a","children":[{"type":"E","keys":{"Name":"n","UUID":"","V":")" + value +
                       R"("}}]})"});
    };
    std::string const none = bodyOf({R"("a")"});
    std::string const base = unfinished(node("1"), node("2"), none);
    EXPECT_EQ(merged(base, node("2"), none), "Nested at a in E n, removed by theirs");
    EXPECT_EQ(merged(base, none, node("2")), "Nested at a in E n, removed by ours");
    EXPECT_EQ(merged(base, node("2"), node("2")), node("2"));
}

TEST(DisputedNestedNode, thatIsThereTwiceIsKeptOnce) {
    auto const labelled = [](std::string const& labels) {
        return R"({"file":"a","children":[)" + labels + "]}";
    };
    std::string const one = R"({"type":"Label","keys":{"UUID":"1"}})";
    std::string const two = R"({"type":"Label","keys":{"UUID":"2"}})";
    std::string const changed = R"({"type":"Label","keys":{"UUID":"2","k":"2"}})";
    std::string const twins = labelled(changed + ',' + one + ',' + two);
    std::string const base =
        bodyOf({"<<<<<<< ours", labelled(one + ',' + two), "=======", twins, ">>>>>>> theirs"});

    TextMerge const merge = mergeTexts(base, bodyOf({twins}), bodyOf({R"("a")"}));

    EXPECT_EQ(merge.conflicts().size(), 1U); // the one with a key; the other one is a plain addition
    EXPECT_EQ(merge.text({MergeSide::Theirs}), bodyOf({labelled(two)}));
}

TEST(DisputedBase, isMergedEvenIfASideContainsTheTextForDisputedValues) {
    std::string const base = unfinished(keyed("1"), keyed("2"), keyed("3"));
    EXPECT_EQ(merged(base, keyed("(disputed)"), keyed("(disputed))")), "Key k at a");
    EXPECT_EQ(merged(base, keyed("(disputed)"), keyed("(disputed)")), keyed("(disputed)"));
}

TEST(DisputedBase, isRefusedIfItIsDamaged) {
    std::string const base = bodyOf({"<<<<<<< ours", R"("a")", "=======", "nonsense", ">>>>>>> theirs"});
    StoreError const error = test::errorOf([&] { mergeTexts(base, bodyOf({}), bodyOf({})); });
    EXPECT_EQ(error.kind(), StoreError::Kind::Damaged);
    EXPECT_EQ(error.file(), "base");
    EXPECT_EQ(error.line(), 5U);
}

} // namespace

} // namespace project::stores
