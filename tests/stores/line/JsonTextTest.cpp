#include "line/JsonText.hpp"

#include <rapidcheck/gtest.h>

#include "support/TextGenerators.hpp"

namespace project::stores {

namespace {

std::string contentOfText(std::u16string_view text) {
    std::string content;
    appendJsonContent(content, text);
    return content;
}

JsonContentScan scanAlone(std::string const& content) {
    return scanJsonContent(content + '"', 0);
}

TEST(JsonText, everyCodeUnitIsReadBackUnchanged) {
    for (unsigned unit = 0; unit <= 0xFFFF; ++unit) {
        std::u16string const text(1, static_cast<char16_t>(unit));
        std::string const content = contentOfText(text);
        ASSERT_EQ(decodeJsonContent(content), text) << unit;
        ASSERT_EQ(scanAlone(content).end, content.size()) << unit;
        ASSERT_TRUE(scanAlone(content).isCanonical) << unit;
    }
}

TEST(JsonText, onlyNecessaryCharactersAreEscaped) {
    EXPECT_EQ(contentOfText(u"a/b\x7F"), "a/b\x7F");
    EXPECT_EQ(contentOfText(u"\"\\"), R"(\"\\)");
    EXPECT_EQ(contentOfText(u"\b\f\n\r\t"), R"(\b\f\n\r\t)");
    EXPECT_EQ(contentOfText(std::u16string_view(u"\0\x1F\v", 3)), R"(\u0000\u001f\u000b)");
    EXPECT_EQ(contentOfText(u"\u00E4\u05D0\uFFFF"), "\xC3\xA4\xD7\x90\xEF\xBF\xBF");
}

TEST(JsonText, surrogatePairsAreUtf8AndLoneSurrogatesAreEscaped) {
    EXPECT_EQ(contentOfText(u"\xD83D\xDE00"), "\xF0\x9F\x98\x80");
    EXPECT_EQ(contentOfText(u"\xDE00\xD83D"), R"(\ude00\ud83d)");
    EXPECT_EQ(contentOfText(u"\xD83D\xD83D\xDE00"), "\\ud83d\xF0\x9F\x98\x80");
}

TEST(JsonText, contentOfOtherProgramsIsReadAndRecognised) {
    struct {
        char const* content;
        char16_t const* text;
    } const cases[] = {
        {R"(\u0041)", u"A"},    {R"(a\/b)", u"a/b"},      {R"(\u000A)", u"\n"},
        {R"(\u001F)", u"\x1F"}, {R"(\uD800)", u"\xD800"}, {R"(\ud83d\ude00)", u"\xD83D\xDE00"},
        {R"(\u0022)", u"\""},   {R"(\u00e4)", u"\u00E4"},
    };

    for (auto const& [content, text] : cases) {
        JsonContentScan const scan = scanAlone(content);
        EXPECT_EQ(scan.problem, nullptr) << content;
        EXPECT_FALSE(scan.isCanonical) << content;
        EXPECT_EQ(decodeJsonContent(content), text) << content;
    }
}

TEST(JsonText, invalidContentIsRefused) {
    char const* const wrong[] = {
        "a\nb",
        "\x01",
        R"(\x)",
        R"(\u12)",
        R"(\u12g4)",
        R"(\ud8)",
        "\x80",
        "\xC0\xAF",
        "\xC1\xBF",
        "\xE0\x80\xAF",
        "\xED\xA0\x80",
        "\xED\xBF\xBF",
        "\xF0\x80\x80\xAF",
        "\xF4\x90\x80\x80",
        "\xF5\x80\x80\x80",
        "\xC3",
        "\xE2\x82",
        "\xF0\x9F\x98",
        "\xFF",
    };
    for (char const* const content : wrong) {
        EXPECT_NE(scanAlone(content).problem, nullptr) << content;
    }
    EXPECT_NE(scanJsonContent("abc", 0).problem, nullptr);
    EXPECT_NE(scanJsonContent("abc\\", 0).problem, nullptr);
    EXPECT_NE(scanJsonContent("abc\\\"", 0).problem, nullptr);
}

RC_GTEST_PROP(JsonText, anyTextIsReadBackUnchanged, ()) {
    std::u16string const text = *samples::anyText();
    std::string const content = contentOfText(text);
    RC_ASSERT(decodeJsonContent(content) == text);
    JsonContentScan const scan = scanAlone(content);
    RC_ASSERT(scan.problem == nullptr);
    RC_ASSERT(scan.isCanonical);
    RC_ASSERT(scan.end == content.size());
}

RC_GTEST_PROP(JsonText, contentsHaveTheOrderOfTheirTexts, ()) {
    std::u16string const common = *samples::anyText();
    std::u16string const left = common + *samples::anyText();
    std::u16string const right = common + *samples::anyText();
    RC_ASSERT(compareJsonContents(contentOfText(left), contentOfText(right)) == (left.compare(right) <=> 0));
}

TEST(JsonText, theFirstDifferenceIsFoundAtEveryPosition) {
    std::string const text(40, 'x');
    for (std::size_t i = 0; i < text.size(); ++i) {
        std::string other = text;
        other[i] = 'y';
        EXPECT_EQ(firstDifference(text, other), i);
        EXPECT_EQ(firstDifference(text, text.substr(0, i)), i);
    }
}

} // namespace

} // namespace project::stores
