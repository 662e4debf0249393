#include "text/ProjectText.hpp"

#include <gmock/gmock.h>

#include "project/stores/StoreError.hpp"
#include "support/ProjectTextSamples.hpp"

namespace project::stores {

namespace {

using namespace samples;

std::string const body = bodyOf({R"("a")", R"("folder/b")", R"("folder/c")"});
std::string const zeros(1, '\0');

/// The lines and the closing line of a batch, written by hand.
std::string batchOf(std::vector<std::string> const& lines, std::string const& after) {
    std::string text;
    for (std::string const& line : lines) {
        text += line + "\n";
    }
    return text + closingOf(lines, after) + "\n";
}

/// The checksum in a batch's closing line.
std::string sumIn(std::string const& batch) {
    std::string_view const mark = R"("sum":")";
    return batch.substr(batch.rfind(mark) + mark.size(), 32);
}

std::string files(ProjectText const& text) {
    std::string names;
    for (Child const& child : text.children(addressOf({u"Files", u"Root"}))) {
        std::u16string const& name = child.element.getLocation();
        names += std::string(name.begin(), name.end()) + ' ';
    }
    return names;
}

TEST(TextTail, aBatchIsItsLinesAndAClosingLine) {
    std::string const tail =
        readWhole(body).tailFor({set(fileAddress(u"d")), remove(fileAddress(u"folder"))});
    EXPECT_EQ(tail, batchOf({R"("d")", R"({"remove":"folder"})"}, sumOf(body)));
    EXPECT_EQ(files(readWhole(body + tail)), "a d ");
    EXPECT_EQ(described(readWhole(body + tail).faults()), "");
}

TEST(TextTail, batchesChain) {
    std::string const one = readWhole(body).tailFor({set(fileAddress(u"d"))});
    std::string const two = readWhole(body + one).tailFor({remove(fileAddress(u"d"))});
    EXPECT_THAT(two, testing::HasSubstr(R"("after":")" + sumIn(one)));
    ProjectText const text = readWhole(body + one + two);
    EXPECT_EQ(described(text.faults()), "");
    EXPECT_EQ(files(text), "a folder ");
    EXPECT_FALSE(text.isTidy());
    EXPECT_EQ(text.rewrittenWith({}).body(), body);
}

TEST(TextTail, laterLinesWin) {
    std::string const key1 = R"({"file":"a","keys":{"k":"1"}})";
    std::string const key2 = R"({"file":"a","keys":{"l":"2"}})";
    std::string const one = batchOf({key1, R"({"remove":"folder"})", R"("folder/d")"}, sumOf(body));
    ProjectText const text = readWhole(body + one + batchOf({key2}, sumIn(one)));
    EXPECT_EQ(contentOf(text),
              (Content{{fileAddress(u"a"), "Info(l=2;)"}, {fileAddress(u"folder/d"), "Info()"}}));
}

TEST(TextTail, checksumsIgnoreLineEnds) {
    std::string text = body + batchOf({R"("d")"}, sumOf(body));
    for (std::size_t at = 0; (at = text.find('\n', at)) != text.npos; at += 2) {
        text.insert(at, 1, '\r');
    }
    EXPECT_EQ(described(readWhole(text).faults()), "");
    EXPECT_EQ(files(readWhole(text)), "a d folder ");
}

TEST(TextTail, linesWithoutAClosingLineAreTorn) {
    std::string const one = batchOf({R"("d")"}, sumOf(body));
    for (std::string const torn : {"\"e\"\n", "\"e\"", "\"e\"\n\"f\"\n{\"batch\":{\"lines\":2,\"aft", "\n"}) {
        ProjectText const text = readWhole(body + one + torn);
        EXPECT_EQ(described(text.faults()), "TornTail 8") << torn;
        EXPECT_EQ(files(text), "a d folder ") << torn;
        EXPECT_EQ(text.damagedLines(), "") << torn;
        EXPECT_EQ(described(text.rewrittenWith({}).faults()), "") << torn;
    }
}

TEST(TextTail, aLastBatchWithHolesIsTorn) {
    std::string one = batchOf({R"("d")", R"("e")"}, sumOf(body));
    one.replace(one.find("\"d\""), 4, 4, '\0');
    ProjectText const text = readWhole(body + one);
    EXPECT_EQ(described(text.faults()), "TornTail 6");
    EXPECT_EQ(files(text), "a folder ");
}

TEST(TextTail, aBatchOfReadableLinesWithAWrongChecksumIsDamage) {
    std::string one = batchOf({R"("d")", R"("e")"}, sumOf(body));
    one.replace(one.find("\"d\""), 3, "\"x\"");
    ProjectText const text = readWhole(body + one);
    EXPECT_EQ(described(text.faults()), "Damage 8");
    EXPECT_EQ(files(text), "a folder ");
    EXPECT_EQ(text.damagedLines(), one);
}

TEST(TextTail, aBatchWithHolesBeforeAValidOneIsDamage) {
    std::string one = batchOf({R"("d")", R"("e")"}, sumOf(body));
    std::string const two = batchOf({R"("f")"}, sumIn(one));
    one.replace(one.find("\"d\""), 2, 2, '\0');
    ProjectText const text = readWhole(body + one + two);
    EXPECT_EQ(described(text.faults()), "Damage 6");
    EXPECT_EQ(files(text), "a f folder ");
    EXPECT_EQ(text.damagedLines(), one);
    EXPECT_EQ(text.rewrittenWith({}).body(), bodyOf({R"("a")", R"("f")", R"("folder/b")", R"("folder/c")"}));
}

TEST(TextTail, linesOutsideABatchAreDamageBeforeAValidOne) {
    std::string const two = batchOf({R"("f")"}, sumOf(body));
    ProjectText const text = readWhole(body + "\"lost\"\n" + two);
    EXPECT_EQ(described(text.faults()), "Damage 6");
    EXPECT_EQ(files(text), "a f folder ");
    EXPECT_EQ(text.damagedLines(), "\"lost\"\n");
}

TEST(TextTail, aValidBatchWithAnUnreadableLineIsDamage) {
    ProjectText const text = readWhole(body + batchOf({R"("d")", R"({"more":1})"}, sumOf(body)));
    EXPECT_EQ(described(text.faults()), "Damage 7");
    EXPECT_EQ(files(text), "a folder ");
}

TEST(TextTail, damageBeforeATornEndStaysDamage) {
    std::string wrong = batchOf({R"("d")"}, sumOf(body));
    wrong.replace(wrong.find("\"d\""), 3, "\"x\"");
    ProjectText const text = readWhole(body + wrong + "\"e\"\n");
    EXPECT_EQ(described(text.faults()), "Damage 7, TornTail 8");
    EXPECT_EQ(text.damagedLines(), wrong);
}

TEST(TextTail, severalUnreadableBatchesAtTheEndAreOneTornTail) {
    std::string one = batchOf({R"("d")"}, sumOf(body));
    std::string two = batchOf({R"("e")"}, sumIn(one));
    for (std::string* const batch : {&one, &two}) {
        batch->replace(1, 1, 1, '\0');
    }
    ProjectText const text = readWhole(body + one + two);
    EXPECT_EQ(described(text.faults()), "TornTail 6");
    EXPECT_EQ(text.damagedLines(), "");
}

TEST(TextTail, anUnreadableBatchBeforeAReadableOneWithAWrongChecksumIsDamage) {
    std::string one = batchOf({R"("d")"}, sumOf(body));
    std::string two = batchOf({R"("e")"}, sumIn(one));
    one.replace(1, 1, 1, '\0');
    two.replace(1, 1, "x");
    ProjectText const text = readWhole(body + one + two);
    EXPECT_EQ(described(text.faults()), "Damage 6, Damage 9");
    EXPECT_EQ(text.damagedLines(), one + two);
}

TEST(TextTail, aValidBatchAfterDamageReplacesWhateverItChainsTo) {
    std::string const key = R"({"file":"a","keys":{"k":"1"}})";
    std::string const next = R"({"file":"a","keys":{"l":"2"}})";
    std::string const one = batchOf({key}, sumOf(body));
    std::string const two = batchOf({next}, std::string(32, '0'));
    ProjectText const text = readWhole(body + one + "\"lost\"\n" + two);
    EXPECT_EQ(described(text.faults()), "Damage 8");
    EXPECT_EQ(contentOf(text).at(fileAddress(u"a")), "Info(l=2;)");
}

TEST(TextTail, aRemovalDiscardsNodesThatAreBeingJoinedBelowIt) {
    std::string const key = R"({"file":"folder/b","keys":{"k":"1"}})";
    std::string const other = R"({"file":"folder/c","keys":{"l":"2"}})";
    std::string const unchained = batchOf({key, R"({"remove":"folder"})", other}, std::string(32, '0'));
    ProjectText const text = readWhole(body + unchained);
    EXPECT_EQ(described(text.faults()), "Irregular 9");
    EXPECT_EQ(contentOf(text),
              (Content{{fileAddress(u"a"), "Info()"}, {fileAddress(u"folder/c"), "Info(l=2;)"}}));
}

TEST(TextTail, aValidBatchThatDoesNotChainIsJoined) {
    std::string const key1 = R"({"file":"a","keys":{"k":"1","l":"1"}})";
    std::string const key2 = R"({"file":"a","keys":{"k":"2"}})";
    std::string const ours = batchOf({key1, R"({"file":"made","node":false})"}, sumOf(body));
    std::string const theirs = batchOf({key2, R"("made")", R"({"remove":"folder/b"})"}, sumOf(body));
    ProjectText const text = readWhole(body + ours + theirs);
    EXPECT_EQ(described(text.faults()), "Irregular 12");
    EXPECT_EQ(contentOf(text), (Content{{fileAddress(u"a"), "Info(k=2;l=1;)"},
                                        {fileAddress(u"folder/c"), "Info()"},
                                        {fileAddress(u"made"), "Info()"}}));
}

TEST(TextTail, aBatchAfterOneThatDoesNotChainReplacesAgain) {
    std::string const other = batchOf({R"({"file":"a","keys":{"k":"1"}})"}, std::string(32, '0'));
    std::string const next = batchOf({R"({"file":"a","keys":{"l":"2"}})"}, sumIn(other));
    ProjectText const text = readWhole(body + other + next);
    EXPECT_EQ(described(text.faults()), "Irregular 7");
    EXPECT_EQ(contentOf(text).at(fileAddress(u"a")), "Info(l=2;)");
}

TEST(TextTail, aClosingLineWithoutLineEndCountsAndIsIrregular) {
    std::string const one = batchOf({R"("d")"}, sumOf(body));
    ProjectText text = readWhole(body + one.substr(0, one.size() - 1));
    EXPECT_EQ(described(text.faults()), "Irregular 7");
    EXPECT_EQ(files(text), "a d folder ");
    EXPECT_FALSE(text.extend("\n").has_value());
}

TEST(TextTail, appendedBatchesAreAccepted) {
    ProjectText text = readWhole(body);
    std::string const one = text.tailFor({set(fileAddress(u"d")), set(fileAddress(u"a"))});
    std::string const two = readWhole(body + one).tailFor({remove(fileAddress(u"folder"))});
    auto const differences = text.extend(one + two);
    ASSERT_TRUE(differences.has_value());
    EXPECT_EQ(addressesOf(*differences),
              (std::vector{fileAddress(u"d"), fileAddress(u"folder/b"), fileAddress(u"folder/c")}));
    EXPECT_TRUE(text.hasSameBytes(body + one + two));
    EXPECT_EQ(contentOf(text), contentOf(readWhole(body + one + two)));
    EXPECT_EQ(text.tailFor({set(fileAddress(u"e"))}),
              readWhole(body + one + two).tailFor({set(fileAddress(u"e"))}));
}

TEST(TextTail, aBatchWithMoreBytesThanPermittedHasNoLines) {
    ProjectText const text = readWhole(body);
    Batch const batch{set(fileAddress(u"d")), set(fileAddress(u"e"))};
    std::string const lines = text.tailFor(batch);
    EXPECT_EQ(text.tailFor(batch, lines.size()), lines);
    for (std::size_t const most : {lines.size() - 1, std::size_t{10}, std::size_t{0}}) {
        EXPECT_EQ(text.tailFor(batch, most), "");
    }
}

TEST(TextTail, nothingElseIsAcceptedAndTheTextIsUnchanged) {
    std::string const one = batchOf({R"("d")"}, sumOf(body));
    std::string const wrongs[] = {
        "x",
        "\n",
        "\"d\"\n",
        one.substr(0, one.size() - 1),
        one + "\"e\"\n",
        one + one,
        batchOf({R"("d")"}, std::string(32, '0')),
        batchOf({R"({"more":1})"}, sumOf(body)),
        zeros,
    };
    for (std::string const& added : wrongs) {
        ProjectText text = readWhole(body);
        EXPECT_FALSE(text.extend(added).has_value()) << added;
        EXPECT_TRUE(text.hasSameBytes(body)) << added;
        EXPECT_EQ(contentOf(text), contentOf(readWhole(body))) << added;
        EXPECT_TRUE(text.extend(one).has_value()) << added;
    }
    ProjectText text = readWhole(body);
    EXPECT_TRUE(text.extend("").value().empty());
}

TEST(TextTail, nothingIsAcceptedAfterATornOrDamagedText) {
    std::string const one = batchOf({R"("d")"}, sumOf(body));
    EXPECT_FALSE(readWhole(body + "\"torn\"\n").extend(one).has_value());
    EXPECT_FALSE(readWhole(bodyOf({"damaged"})).extend(one).has_value());
    EXPECT_FALSE(readWhole(body.substr(0, body.size() - 1)).extend(one).has_value());
}

TEST(TextTail, nodesThatCouldNotBeReadAgainAreNotWritten) {
    Address deep = addressOf({u"Files", u"Root"});
    while (deep.depth() <= 4096) {
        deep = deep.child({u"File", u"a"});
    }
    EXPECT_THROW(readWhole(body).tailFor({set(deep)}), StoreError);
    EXPECT_THROW(readWhole(body).rewrittenWith({set(deep)}), StoreError);
}

} // namespace

} // namespace project::stores
