#include "output/NameForms.hpp"

#include <gtest/gtest.h>

#include "fl/filesystem/Path.hpp"

namespace projectctl {
namespace {

std::string bytesOf(std::u16string_view name) {
    std::string result;
    appendBytes(result, name);
    return result;
}

std::string quoted(std::string_view bytes) {
    std::string result;
    appendQuoted(result, bytes);
    return result;
}

std::string json(std::u16string_view text) {
    std::string result;
    appendJsonString(result, text);
    return result;
}

TEST(NameForms, returnsTheBytesOfANameOnDisk) {
    for (std::string const name :
         {"plain", "caf\xE9", "\xD7\xA9", "\xF0\x9F\x98\x80", "\x80\xBF\xC0\xFF", ""}) {
        EXPECT_EQ(bytesOf(fl::filesystem::fromSystem(name).native()), name);
    }
}

TEST(NameForms, appendsToExistingText) {
    std::string text = "before ";
    appendBytes(text, u"caf\u00E9");
    appendBytes(text, u" after");

    EXPECT_EQ(text, "before caf\xC3\xA9 after");
}

TEST(NameForms, showsTextThatCannotBeAFileNameWithReplacementCharacters) {
    EXPECT_EQ(bytesOf(std::u16string{u'a', char16_t(0xD800)}), "a\xEF\xBF\xBD");
}

TEST(NameForms, quotesOnlyAmbiguousNames) {
    EXPECT_EQ(quoted("a b'c"), "a b'c");
    EXPECT_EQ(quoted("\xD7\xA9 \xE2\x82\xAC \xF0\x9F\x98\x80"), "\xD7\xA9 \xE2\x82\xAC \xF0\x9F\x98\x80");
    EXPECT_EQ(quoted("a\"b"), "\"a\\\"b\"");
    EXPECT_EQ(quoted("a\\b"), "\"a\\\\b\"");
    EXPECT_EQ(quoted("\a\b\t\n\v\f\r\x1B\x7F"), "\"\\a\\b\\t\\n\\v\\f\\r\\033\\177\"");
    EXPECT_EQ(quoted("\xC2\x9B[31m"), "\"\\302\\233[31m\"");
}

TEST(NameForms, quotesEachByteThatIsNotUtf8) {
    EXPECT_EQ(quoted("\x80"), "\"\\200\"");
    EXPECT_EQ(quoted("\xC0\xAF"), "\"\\300\\257\"");                   // longer than necessary
    EXPECT_EQ(quoted("\xE0\x80\xAF"), "\"\\340\\200\\257\"");          // likewise
    EXPECT_EQ(quoted("\xED\xA0\x80"), "\"\\355\\240\\200\"");          // a surrogate
    EXPECT_EQ(quoted("\xF4\x90\x80\x80"), "\"\\364\\220\\200\\200\""); // beyond the last character
    EXPECT_EQ(quoted("\xE2\x82"), "\"\\342\\202\"");                   // incomplete
    EXPECT_EQ(quoted("\xE2\x82\xAC\xFF"), "\"\xE2\x82\xAC\\377\"");
}

TEST(NameForms, writesAnyCodeUnitsAsJsonStrings) {
    EXPECT_EQ(json(u"a\"b\\c/d"), "\"a\\\"b\\\\c/d\"");
    EXPECT_EQ(json(u"\n\t\u0001\u007F\u0085"), "\"\\n\\t\\u0001\\u007f\\u0085\"");
    EXPECT_EQ(json(u"\u00E9\u20AC\U0001F600"), "\"\xC3\xA9\xE2\x82\xAC\xF0\x9F\x98\x80\"");
    EXPECT_EQ(json(std::u16string{char16_t(0xDC80)}), "\"\\udc80\"");
    EXPECT_EQ(json(std::u16string{char16_t(0xD800), u'a'}), "\"\\ud800a\"");
    EXPECT_EQ(json(std::u16string{char16_t(0xDC00), char16_t(0xD800)}), "\"\\udc00\\ud800\"");
}

TEST(NameForms, keepsTextOnOneLine) {
    EXPECT_EQ(withoutControls("a\nb\tc\x1B", false), "a\\nb\tc\\033");
    EXPECT_EQ(withoutControls("a\nb\tc\x1B", true), "a\nb\tc\\033");
    EXPECT_EQ(withoutControls("\xD7\xA9\xFF", false), "\xD7\xA9\xFF");
}

} // namespace
} // namespace projectctl
