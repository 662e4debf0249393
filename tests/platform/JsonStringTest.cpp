#include "fl/i18n/JsonString.hpp"

#include <gtest/gtest.h>

namespace fl::i18n {

namespace {

std::string contentOf(std::u16string_view text, JsonEscapes escapes = JsonEscapes::Required) {
    std::string content;
    appendJsonContent(content, text, escapes);
    return content;
}

TEST(JsonString, onlyRequiredCharactersAreEscaped) {
    EXPECT_EQ(contentOf(u""), "");
    EXPECT_EQ(contentOf(u"a/b\x7F"), "a/b\x7F");
    EXPECT_EQ(contentOf(u"\"\\"), R"(\"\\)");
    EXPECT_EQ(contentOf(u"\b\f\n\r\t"), R"(\b\f\n\r\t)");
    EXPECT_EQ(contentOf(std::u16string_view(u"\0\x1F\v", 3)), R"(\u0000\u001f\u000b)");
    EXPECT_EQ(contentOf(u"\u0085\u00E4\u05D0\uFFFF"), "\xC2\x85\xC3\xA4\xD7\x90\xEF\xBF\xBF");
}

TEST(JsonString, theControlCharactersOfTerminalsAreEscapedOnRequest) {
    EXPECT_EQ(contentOf(u"~\x7F\u0080\u009F\u00A0", JsonEscapes::Controls), "~\\u007f\\u0080\\u009f\xC2\xA0");
    EXPECT_EQ(contentOf(u"\n\x1B", JsonEscapes::Controls), R"(\n\u001b)");
}

TEST(JsonString, surrogatePairsAreUtf8AndLoneSurrogatesAreEscaped) {
    for (auto const escapes : {JsonEscapes::Required, JsonEscapes::Controls}) {
        EXPECT_EQ(contentOf(u"\xD83D\xDE00", escapes), "\xF0\x9F\x98\x80");
        EXPECT_EQ(contentOf(u"\xDE00\xD83D", escapes), R"(\ude00\ud83d)");
        EXPECT_EQ(contentOf(u"\xD83D\xD83D\xDE00", escapes), "\\ud83d\xF0\x9F\x98\x80");
        EXPECT_EQ(contentOf(u"a\xD83Dz", escapes), R"(a\ud83dz)");
    }
}

TEST(JsonString, plainAndEscapedPartsAreAppendedInOrder) {
    std::string out = "before ";
    appendJsonString(out, u"plain \u00E9 plain\n\"end\"");

    EXPECT_EQ(out, "before \"plain \xC3\xA9 plain\\n\\\"end\\\"\"");
}

} // namespace

} // namespace fl::i18n
