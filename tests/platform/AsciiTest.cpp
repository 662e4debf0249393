#include "fl/i18n/Ascii.hpp"

#include <string>

#include <gtest/gtest.h>

namespace fl::i18n {
namespace {

constexpr std::size_t longest = 40; // several blocks, and every rest of one

bool isNarrowed(std::u16string const& text, std::string& copy) {
    copy.assign(text.size(), '?');
    return narrowAscii(text, copy.data());
}

bool isWidened(std::string const& bytes, std::u16string& copy) {
    copy.assign(bytes.size(), u'?');
    return widenAscii(bytes, copy.data());
}

std::string plainBytes(std::size_t length) {
    std::string result;
    for (std::size_t i = 0; i < length; ++i) {
        result += static_cast<char>('!' + i);
    }
    return result;
}

TEST(Ascii, textOfEachLengthIsCopiedInBothDirections) {
    for (std::size_t length = 0; length <= longest; ++length) {
        std::string const bytes = plainBytes(length);
        std::u16string const text(bytes.begin(), bytes.end());
        std::string narrow;
        std::u16string wide;
        EXPECT_TRUE(isNarrowed(text, narrow));
        EXPECT_EQ(narrow, bytes);
        EXPECT_TRUE(isWidened(bytes, wide));
        EXPECT_EQ(wide, text);
    }
}

TEST(Ascii, eachOtherCodeUnitIsFoundAtEachPosition) {
    std::string const bytes = plainBytes(longest);
    for (std::size_t at = 0; at < longest; ++at) {
        for (unsigned unit = 0; unit <= 0xFFFF; ++unit) {
            std::u16string text(bytes.begin(), bytes.end());
            text[at] = static_cast<char16_t>(unit);
            std::string copy;
            ASSERT_EQ(isNarrowed(text, copy), unit >= 1 && unit <= 0x7F) << unit << " at " << at;
        }
    }
}

TEST(Ascii, eachOtherByteIsFoundAtEachPosition) {
    for (std::size_t at = 0; at < longest; ++at) {
        for (int byte = 0; byte < 256; ++byte) {
            std::string bytes = plainBytes(longest);
            bytes[at] = static_cast<char>(byte);
            std::u16string copy;
            ASSERT_EQ(isWidened(bytes, copy), byte < 0x80) << byte << " at " << at;
        }
    }
}

} // namespace
} // namespace fl::i18n
