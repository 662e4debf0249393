// Resolution of conflicts: by choosing sides, or in a text with markers.
#include "project/stores/TextMerge.hpp"

#include <ostream>
#include <stdexcept>

#include "stores/merge/MergeSamples.hpp"
#include "support/TextStore.hpp"
#include "text/TextLines.hpp"

namespace project::stores {

namespace {

using namespace samples;

constexpr MergeSide ours = MergeSide::Ours;
constexpr MergeSide theirs = MergeSide::Theirs;

TEST(TextMergeChoice, eachConflictIsResolvedIndependently) {
    TextMerge const merge =
        mergeTexts(bodyOf({R"({"file":"a","keys":{"k":"1","l":"1"}})", R"("b")", R"("b/x")"}),
                   bodyOf({R"({"file":"a","keys":{"k":"2","l":"2","o":"2"}})"}),
                   bodyOf({R"({"file":"a","keys":{"k":"3","l":"3"}})", R"("b")", R"("b/x")", R"("b/y")"}));
    ASSERT_EQ(described(merge.conflicts()),
              "Key k at a\nKey l at a\nSubtree at b, removed by ours, changed b/y");
    EXPECT_EQ(merge.text({ours, ours, ours}), bodyOf({R"({"file":"a","keys":{"k":"2","l":"2","o":"2"}})"}));
    EXPECT_EQ(merge.text({ours, theirs, theirs}),
              bodyOf({R"({"file":"a","keys":{"k":"2","l":"3","o":"2"}})", R"("b")", R"("b/x")", R"("b/y")"}));
    EXPECT_EQ(merge.text({theirs, ours, ours}), bodyOf({R"({"file":"a","keys":{"k":"3","l":"2","o":"2"}})"}));
}

TEST(TextMergeChoice, aRemovedKeyOrNestedNodeOrNodeIsRemovedOrKept) {
    std::string const base = bodyOf({R"({"file":"a","keys":{"k":"1"}})"});
    TextMerge const key = mergeTexts(base, bodyOf({R"("a")"}), bodyOf({R"({"file":"a","keys":{"k":"2"}})"}));
    EXPECT_EQ(key.text({ours}), bodyOf({R"("a")"}));
    EXPECT_EQ(key.text({theirs}), bodyOf({R"({"file":"a","keys":{"k":"2"}})"}));

    auto const extension = [](std::string const& value) {
        return bodyOf(
            {R"({"file":"a","children":[{"type":"E","keys":{"Name":"n","V":")" + value + R"("}}]})"});
    };
    TextMerge const nested = mergeTexts(extension("1"), extension("2"), bodyOf({R"("a")"}));
    EXPECT_EQ(nested.text({ours}), extension("2"));
    EXPECT_EQ(nested.text({theirs}), bodyOf({R"("a")"}));

    TextMerge const node = mergeTexts(base, bodyOf({}), bodyOf({R"({"file":"a","keys":{"k":"2"}})"}));
    EXPECT_EQ(node.text({ours}), bodyOf({}));
    EXPECT_EQ(node.text({theirs}), bodyOf({R"({"file":"a","keys":{"k":"2"}})"}));
}

TEST(TextMergeChoice, asManyChoicesAsConflictsAreNeeded) {
    TextMerge const clean = mergeTexts(bodyOf({}), bodyOf({}), bodyOf({}));
    EXPECT_THROW(clean.text({ours}), std::invalid_argument);
    TextMerge const merge =
        mergeTexts("", bodyOf({R"({"file":"a","keys":{"k":"1"}})"}), bodyOf({R"({"file":"a","type":"T"})"}));
    ASSERT_EQ(described(merge.conflicts()), "Type at a");
    EXPECT_THROW(merge.text(), std::invalid_argument);
    EXPECT_EQ(merge.text({theirs}), bodyOf({R"({"file":"a","type":"T","keys":{"k":"1"}})"}));
}

class TextMergeMarkers : public test::TextStore {
protected:
    std::string const base = bodyOf({R"({"file":"a","keys":{"k":"1"}})", R"("b")", R"("b/x")", R"("c")"});
    std::string const one = bodyOf({R"({"file":"a","keys":{"k":"2","o":"2"}})", R"("c")", R"("d")"});
    std::string const two = bodyOf({R"({"file":"a","keys":{"k":"3"}})", R"("b")", R"("b/x")", R"("b/y")"});
    std::string const marked = bodyOf({
        "<<<<<<< ours",
        R"({"file":"a","keys":{"k":"2","o":"2"}})",
        "||||||| base",
        R"({"file":"a","keys":{"k":"1"}})",
        "=======",
        R"({"file":"a","keys":{"k":"3","o":"2"}})",
        ">>>>>>> theirs",
        "<<<<<<< ours",
        "||||||| base",
        R"("b")",
        R"("b/x")",
        "=======",
        R"("b")",
        R"("b/x")",
        R"("b/y")",
        ">>>>>>> theirs",
        R"("d")",
    });
};

TEST_F(TextMergeMarkers, encloseTheConflictsAndTheRestIsMerged) {
    EXPECT_EQ(mergeTexts(base, one, two).textWithMarkers(), marked);
}

TEST_F(TextMergeMarkers, areReadWithBothSides) {
    ProjectText const text = readWhole(mergeTexts(base, one, two).textWithMarkers());
    EXPECT_EQ(described(text.faults()), "Conflict 2, Conflict 9");
    EXPECT_EQ(text.rewrittenWith({}).body(), bodyOf({R"({"file":"a","keys":{"k":"3","o":"2"}})", R"("b")",
                                                     R"("b/x")", R"("b/y")", R"("d")"}));
}

TEST_F(TextMergeMarkers, letAStoreOpenAndRefuseWrites) {
    prepareText(mergeTexts(base, one, two).textWithMarkers());
    auto const store = open();
    EXPECT_TRUE(test::contentOf(*store).contains(fileAddress(u"b/y")));
    EXPECT_EQ(described(store->check()), "Conflict 2, Conflict 9");
    StoreError const error = test::errorOf([&] { test::commit(*store, test::addFiles({u"e"})); });
    EXPECT_EQ(error.line(), 2U);
    EXPECT_EQ(text(), marked);
}

TEST_F(TextMergeMarkers, areOmittedWithoutAConflict) {
    EXPECT_EQ(mergeTexts(base, one, base).textWithMarkers(), one);
}

TEST(TextMergeInput, versionsWithTailsAreMergedByContent) {
    ProjectText const common = readWhole(bodyOf({R"("a")", R"("b")", R"("c")"}));
    std::string const base = common.body() + common.tailFor({set(fileAddress(u"d"))});
    std::string const removed =
        common.body() + common.tailFor({set(fileAddress(u"d")), remove(fileAddress(u"b"))});
    std::string const added =
        common.body() + common.tailFor({set(fileAddress(u"d")), set(fileAddress(u"e"))});
    std::string const expected = bodyOf({R"("a")", R"("c")", R"("d")", R"("e")"});
    EXPECT_EQ(merged(base, removed, added), expected);
    EXPECT_EQ(merged(base, removed, bodyOf({R"("a")", R"("b")", R"("c")", R"("d")", R"("e")"})), expected);
    EXPECT_EQ(merged(base, base, base), bodyOf({R"("a")", R"("b")", R"("c")", R"("d")"}));
}

TEST(TextMergeInput, textsThatAreNotCanonicalAreMergedByContent) {
    std::string const base = bodyOf({R"("b")", R"("a")", "", R"( {"keys": {"k":"1"}, "file":"c"})"});
    EXPECT_EQ(
        merged(base, bodyOf({R"("a")", R"("b")", R"({"file":"c","keys":{"k":"1"}})"}), bodyOf({R"("b")"})),
        bodyOf({R"("b")"}));
    EXPECT_EQ(merged(base, bodyOf({R"("a")"}), base), bodyOf({R"("a")"}));
}

TEST(TextMergeInput, manyLinesAreMerged) {
    constexpr int files = 100'000;
    auto const without = [](int removed) {
        std::string text = std::string(firstLine) + '\n';
        for (int i = 0; i < files; ++i) {
            std::string const number = std::to_string(files + i);
            text += i % 1000 == removed ? "" : "\"folder" + number.substr(0, 4) + "/file" + number + "\"\n";
        }
        return text + std::string(endLine) + '\n';
    };
    std::string const text = merged(without(-1), without(1), without(2));
    EXPECT_EQ(text.size(), 2 * without(1).size() - without(-1).size());
    EXPECT_EQ(merged(without(1), without(-1), without(1)), without(-1));
}

TEST(TextMergeInput, addressesAsDeepAsTheyMayBeAreMerged) {
    std::string path = "p";
    for (int depth = 2; depth < 4094; ++depth) {
        path += "/p";
    }
    auto const line = [&](std::string const& name) { return "\"" + path + "/" + name + "\""; };
    EXPECT_EQ(merged(bodyOf({line("a")}), bodyOf({line("a"), line("b")}), bodyOf({})), bodyOf({line("b")}));
    EXPECT_EQ(merged(bodyOf({R"("p")", line("a")}), bodyOf({R"("p")", line("a"), line("b")}), bodyOf({})),
              "Subtree at p, removed by theirs, changed " + path + "/b");
}

TEST(TextMergeInput, tornTailsOfDeadWritersAreIgnored) {
    std::string const text = bodyOf({R"("a")"});
    EXPECT_EQ(merged(text, text + R"("b")", bodyOf({R"("a")", R"("c")"})), bodyOf({R"("a")", R"("c")"}));
}

struct BadText {
    char const* name;
    std::string text;
    std::size_t line;
    StoreError::Kind kind;

    friend void PrintTo(BadText const& bad, std::ostream* out) { *out << bad.name; }
};

class TextMergeRefusal : public ::testing::TestWithParam<BadText> {};

TEST_P(TextMergeRefusal, namesTheVersionAndTheLine) {
    std::string const good = bodyOf({R"("a")"});
    std::string const& bad = GetParam().text;
    auto const expect = [](StoreError const& error, std::string const& version) {
        EXPECT_EQ(error.file(), version);
        EXPECT_EQ(error.line(), GetParam().line);
        EXPECT_EQ(error.kind(), GetParam().kind) << error.what();
    };
    expect(test::errorOf([&] { mergeTexts(bad, good, good); }), "base");
    expect(test::errorOf([&] { mergeTexts(good, bad, good); }), "ours");
    expect(test::errorOf([&] { mergeTexts(good, good, bad); }), "theirs");
}

INSTANTIATE_TEST_SUITE_P(
    Texts, TextMergeRefusal,
    ::testing::Values(
        BadText{"noJson", bodyOf({R"("a")", "nonsense"}), 3, StoreError::Kind::Damaged},
        BadText{"unknownMember", bodyOf({R"({"file":"a","color":"red"})"}), 2, StoreError::Kind::Damaged},
        BadText{"brokenLine", std::string(firstLine) + "\n\"a", 2, StoreError::Kind::Damaged},
        BadText{"noLastLine", std::string(firstLine) + "\n\"a\"\n", 2, StoreError::Kind::Damaged},
        BadText{"laterVersion", "{\"format\":\"project-definition\",\"version\":2}\n", 1,
                StoreError::Kind::Refused},
        BadText{"somethingElse", "\n\n", 1, StoreError::Kind::Damaged}));

TEST(TextMergeInput, conflictMarkersInASideAreRefused) {
    std::string const good = bodyOf({R"("a")"});
    std::string const marked = bodyOf({R"("a")", "<<<<<<< ours", "=======", ">>>>>>> theirs"});
    for (auto const& [error, version] :
         {std::pair{test::errorOf([&] { mergeTexts(good, marked, good); }), "ours"},
          std::pair{test::errorOf([&] { mergeTexts(good, good, marked); }), "theirs"}}) {
        EXPECT_EQ(error.kind(), StoreError::Kind::Conflict);
        EXPECT_EQ(error.file(), version);
        EXPECT_EQ(error.line(), 3U);
    }
}

TEST(TextMergeInput, anEmptyTextIsNotAVersionOfAProject) {
    std::string const good = bodyOf({R"("a")"});
    EXPECT_EQ(test::errorOf([&] { mergeTexts(good, "", good); }).file(), "ours");
    EXPECT_EQ(test::errorOf([&] { mergeTexts(good, good, ""); }).file(), "theirs");
}

TEST(TextMergeInput, aDamagedTailIsRefused) {
    ProjectText const text = readWhole(bodyOf({R"("a")"}));
    std::string tail = text.tailFor({set(fileAddress(u"b"))}) + text.tailFor({set(fileAddress(u"c"))});
    tail[1] = 'x';
    StoreError const error = test::errorOf([&] { mergeTexts("", text.body() + tail, text.body()); });
    EXPECT_EQ(error.kind(), StoreError::Kind::Damaged);
    EXPECT_EQ(error.line(), 5U);
}

} // namespace

} // namespace project::stores
