#include "fl/i18n/CodePoints.hpp"

#include <gtest/gtest.h>

#include <vector>

#include "fl/i18n/Utf8.hpp"

namespace fl::i18n {

namespace {

std::string utf8Of(char32_t codePoint) {
    std::string bytes;
    appendUtf8(bytes, codePoint);
    return bytes;
}

/// The well-formed sequences of UTF-8, as Unicode's table lists them: for each lead byte, the length and the
/// range of the second byte. All further bytes are 80 to BF.
struct Sequence {
    unsigned firstLead;
    unsigned lastLead;
    std::size_t length;
    unsigned firstSecond;
    unsigned lastSecond;
};

constexpr Sequence sequences[] = {
    {0xC2, 0xDF, 2, 0x80, 0xBF}, {0xE0, 0xE0, 3, 0xA0, 0xBF}, {0xE1, 0xEC, 3, 0x80, 0xBF},
    {0xED, 0xED, 3, 0x80, 0x9F}, {0xEE, 0xEF, 3, 0x80, 0xBF}, {0xF0, 0xF0, 4, 0x90, 0xBF},
    {0xF1, 0xF3, 4, 0x80, 0xBF}, {0xF4, 0xF4, 4, 0x80, 0x8F},
};

/// The length of a sequence with this lead byte and second byte, if all further bytes are continuations.
std::size_t expectedLength(unsigned lead, unsigned second) {
    if (lead < 0x80) {
        return 1;
    }
    for (auto const& sequence : sequences) {
        if (lead >= sequence.firstLead && lead <= sequence.lastLead) {
            return second >= sequence.firstSecond && second <= sequence.lastSecond ? sequence.length : 0;
        }
    }
    return 0;
}

TEST(CodePoints, everyCodePointSurvivesBothEncodings) {
    for (char32_t codePoint = 0; codePoint <= lastCodePoint; ++codePoint) {
        if (isSurrogate(codePoint)) {
            continue;
        }
        auto const bytes = utf8Of(codePoint);
        auto const decoded = decodeUtf8(bytes, 0);
        ASSERT_EQ(decoded.codePoint, codePoint);
        ASSERT_EQ(decoded.length, bytes.size()) << std::hex << unsigned{codePoint};

        std::u16string units;
        appendUtf16(units, codePoint);
        std::u16string_view rest = units;
        ASSERT_EQ(takeCodePoint(rest), codePoint);
        ASSERT_TRUE(rest.empty()) << std::hex << unsigned{codePoint};
    }
}

TEST(CodePoints, decodesExactlyTheWellFormedSequences) {
    for (unsigned lead = 0; lead <= 0xFF; ++lead) {
        for (unsigned second = 0; second <= 0xFF; ++second) {
            std::string const bytes = {static_cast<char>(lead), static_cast<char>(second), '\x80', '\xBF'};
            auto const expected = expectedLength(lead, second);
            ASSERT_EQ(decodeUtf8(bytes, 0).length, expected) << std::hex << lead << ' ' << second;
            ASSERT_EQ(decodeUtf8("ab" + bytes, 2).length, expected) << std::hex << lead << ' ' << second;
        }
    }
}

TEST(CodePoints, aSequenceThatIsCutOffOrHasAWrongByteIsNotWellFormed) {
    for (auto const codePoint : {U'\u00E9', U'\u20AC', U'\U0001F600'}) {
        auto const bytes = utf8Of(codePoint);
        for (std::size_t length = 1; length < bytes.size(); ++length) {
            EXPECT_EQ(decodeUtf8(bytes.substr(0, length), 0).length, 0U) << bytes << ' ' << length;
            for (char const wrong : {'a', '\xC3', '\xFF'}) {
                auto damaged = bytes;
                damaged[length] = wrong;
                EXPECT_EQ(decodeUtf8(damaged, 0).length, 0U) << bytes << ' ' << length;
            }
        }
    }
}

TEST(CodePoints, aSurrogateWithoutItsPartnerIsTakenAsItIs) {
    constexpr char16_t high = 0xD83D;
    constexpr char16_t low = 0xDE00;
    std::u16string const text = {low, high, high, low, u'a', high, u'b', high};
    std::u16string_view rest = text;
    std::vector<char32_t> taken;
    while (!rest.empty()) {
        taken.push_back(takeCodePoint(rest));
    }

    EXPECT_EQ(taken, (std::vector<char32_t>{low, high, 0x1F600, U'a', high, U'b', high}));
}

TEST(Utf8, textOfAllLengthsOfSequencesIsConvertedBothWays) {
    std::u16string const text = u"a\u00E9\u20AC\U0001F600 \u05D0\uFFFF";
    std::string const bytes = "a\xC3\xA9\xE2\x82\xAC\xF0\x9F\x98\x80 \xD7\x90\xEF\xBF\xBF";

    EXPECT_EQ(toUtf8(text), bytes);
    EXPECT_EQ(fromUtf8(bytes), text);
    EXPECT_EQ(toUtf8(u""), "");
    EXPECT_EQ(fromUtf8(""), u"");
}

TEST(Utf8, aLoneSurrogateAndEachStrayByteBecomeTheReplacementCharacter) {
    EXPECT_EQ(toUtf8(std::u16string{u'a', char16_t(0xD800), u'b', char16_t(0xDC80)}), "a\xEF\xBF\xBD"
                                                                                      "b\xEF\xBF\xBD");
    EXPECT_EQ(fromUtf8("a\x80"
                       "b\xFF"),
              u"a\uFFFDb\uFFFD");
    EXPECT_EQ(fromUtf8("\xE2\x82"), u"\uFFFD\uFFFD");
}

} // namespace

} // namespace fl::i18n
