#include <algorithm>
#include <array>
#include <cstdint>
#include <filesystem>
#include <optional>
#include <set>

#include <rapidcheck/gtest.h>

#include "fl/filesystem/Path.hpp"
#include "fl/filesystem/SystemName.hpp"
#include "support/TemporaryFolder.hpp"

namespace fl::filesystem {

namespace {

using project::test::TemporaryFolder;
using std::filesystem::filesystem_error;

/// Byte strings that are often almost UTF-8: first and last bytes of each kind of sequence, and ASCII.
rc::Gen<std::vector<std::uint8_t>> nameBytes() {
    return rc::gen::container<std::vector<std::uint8_t>>(rc::gen::element<std::uint8_t>(
        'a', '/', 0x01, 0x7F, 0x80, 0x8F, 0x90, 0x9F, 0xA0, 0xBF, 0xC0, 0xC1, 0xC2, 0xDF, 0xE0, 0xE1, 0xED,
        0xEE, 0xEF, 0xF0, 0xF1, 0xF4, 0xF5, 0xFF));
}

/// Code units with many escapes of bytes, and sometimes an invalid one.
rc::Gen<std::vector<std::uint16_t>> nameUnits() {
    auto const ordinary =
        rc::gen::element<std::uint16_t>('a', '/', 0x7F, 0x80, 0xE9, 0x7FF, 0x800, 0xD7FF, 0xE000, 0xFFFF);
    auto const escape =
        rc::gen::element<std::uint16_t>(0xDC80, 0xDC9F, 0xDCA9, 0xDCBF, 0xDCC3, 0xDCED, 0xDCF0, 0xDCFF);
    auto const surrogate = rc::gen::element<std::uint16_t>(0xD800, 0xDBFF, 0xDC00, 0xDC7F, 0xDD00, 0xDFFF);
    auto const unit = rc::gen::weightedOneOf<std::uint16_t>({{10, ordinary}, {10, escape}, {1, surrogate}});
    return rc::gen::scale(0.3, rc::gen::container<std::vector<std::uint16_t>>(unit));
}

template <typename Units>
std::string toBytes(Units const& units) {
    return {units.begin(), units.end()};
}

std::string bytesOf(Path const& path) {
    return toSystem(path).native();
}

std::u16string textOf(std::string const& bytes) {
    return fromSystem(bytes).native();
}

std::u16string escaped(std::string const& bytes) {
    std::u16string text;
    for (auto const byte : bytes) {
        text += static_cast<char16_t>(0xDC00U + static_cast<unsigned char>(byte));
    }
    return text;
}

/// The bytes of a code point according to the standard library, which has no escapes.
std::string encodedElsewhere(char32_t codePoint) {
    return std::filesystem::path(std::u32string(1, codePoint)).native();
}

} // namespace

TEST(SystemPath, validNamesAreUtf8OnDisk) {
    EXPECT_EQ(bytesOf(u"/a b/\u00E9\u20AC\U0001F600"), "/a b/\xC3\xA9\xE2\x82\xAC\xF0\x9F\x98\x80");
    EXPECT_EQ(textOf("/a b/\xC3\xA9\xE2\x82\xAC\xF0\x9F\x98\x80"), u"/a b/\u00E9\u20AC\U0001F600");
    EXPECT_EQ(bytesOf(u""), "");
    EXPECT_EQ(textOf(""), u"");
}

TEST(SystemPath, aBackslashIsAnOrdinaryCharacter) {
    EXPECT_EQ(bytesOf(u"a\\b"), "a\\b");
    EXPECT_EQ(textOf("a\\b"), u"a\\b");
}

TEST(SystemPath, everyCodePointHasTheBytesOfTheStandardLibrary) {
    for (char32_t codePoint = 1; codePoint <= 0x10FFFF; codePoint += codePoint < 0x3000 ? 1 : 61) {
        if (codePoint >= 0xD800 && codePoint <= 0xDFFF) {
            continue;
        }
        auto const bytes = encodedElsewhere(codePoint);

        auto const text = textOf(bytes);

        ASSERT_EQ(text, std::filesystem::path(bytes).u16string()) << std::hex << std::uint32_t{codePoint};
        ASSERT_EQ(bytesOf(text), bytes) << std::hex << std::uint32_t{codePoint};
    }
}

TEST(SystemPath, eachByteThatIsNotValidUtf8BecomesOneLoneSurrogate) {
    for (auto const* bytes :
         {"\x80", "\xBF", "\xFF", "\xC3", "\xE2\x82", "\xF0\x9F\x98",        // parts of sequences
          "\xC0\x80", "\xC1\xBF", "\xE0\x9F\xBF", "\xF0\x8F\xBF\xBF",        // longer than needed
          "\xED\xA0\x80", "\xED\xBF\xBF",                                    // surrogates
          "\xF4\x90\x80\x80", "\xF5\x80\x80\x80", "\xF8\x88\x80\x80\x80"}) { // too large
        EXPECT_EQ(textOf(bytes), escaped(bytes));
        EXPECT_EQ(bytesOf(escaped(bytes)), bytes);
    }
}

TEST(SystemPath, validUtf8BesideAStrayByteIsDecoded) {
    EXPECT_EQ(textOf("a\xC3(b"), u"a\xDCC3(b");
    EXPECT_EQ(textOf("\xE2\x82\xC3\xA9"), u"\xDCE2\xDC82\u00E9");
    EXPECT_EQ(textOf("\xC3\xA9\xA9"), u"\u00E9\xDCA9");
}

TEST(SystemPath, otherLoneSurrogatesHaveNoNameOnDisk) {
    for (auto const* text :
         {u"\xD800", u"a\xDBFFz", u"\xDC00", u"\xDC7F", u"\xDD00", u"\xDFFF", u"\xDC80\xD800"}) {
        EXPECT_THROW(toSystem(text), filesystem_error);
    }
}

TEST(SystemPath, escapesThatFormAValidSequenceTogetherHaveNoNameOnDisk) {
    EXPECT_THROW(toSystem(u"\xDCC3\xDCA9"), filesystem_error);
    EXPECT_THROW(toSystem(u"a\xDCFF\xDCF0\xDC9F\xDC98\xDC80"), filesystem_error);
}

TEST(SystemPath, aHighSurrogateBeforeAnEscapeIsAnOrdinaryPair) {
    EXPECT_EQ(bytesOf(u"\xD800\xDC80"), encodedElsewhere(0x10080));
}

TEST(SystemPath, aNulHasNoNameOnDisk) {
    EXPECT_THROW(toSystem(std::u16string(1, u'\0')), filesystem_error);
    EXPECT_THROW(toSystem(std::u16string(u"a\0b", 3)), filesystem_error);
}

TEST(SystemPath, theErrorSaysItsKindAndTheName) {
    try {
        toSystem(u"folder/\xD800");
        FAIL() << "a lone surrogate was given a name";
    } catch (filesystem_error const& error) {
        EXPECT_EQ(error.code(), std::errc::illegal_byte_sequence);
        EXPECT_EQ(error.path1().native(), "folder/\xEF\xBF\xBD");
    }
}

TEST(SystemPath, allPairsOfBytesSurviveARoundTrip) {
    for (int first = 1; first <= 0xFF; ++first) {
        for (int second = 1; second <= 0xFF; ++second) {
            std::string const bytes = {static_cast<char>(first), static_cast<char>(second)};
            ASSERT_EQ(bytesOf(textOf(bytes)), bytes);
        }
    }
}

RC_GTEST_PROP(SystemPath, allBytesSurviveARoundTrip, ()) {
    auto const bytes = toBytes(*nameBytes());

    RC_ASSERT(bytesOf(textOf(bytes)) == bytes);
}

RC_GTEST_PROP(SystemPath, textSurvivesARoundTripOrHasNoName, ()) {
    auto const units = *nameUnits();
    std::u16string const text(units.begin(), units.end());
    try {
        auto const bytes = bytesOf(text);
        RC_TAG("has a name");
        RC_ASSERT(textOf(bytes) == text);
    } catch (filesystem_error const&) {
        RC_TAG("has none");
    }
}

TEST(SystemPath, unusualNamesOnDiskSurviveARoundTrip) {
    TemporaryFolder const folder;
    std::set<Path> const names = {u"with space",
                                  u"line\nbreak",
                                  u"\u05E9\u05DC\u05D5\u05DD \u0645\u0631\u062D\u0628\u0627",
                                  u"\u202Eright-to-left mark",
                                  u"stray\xDCFF",
                                  u"\xDCC3(",
                                  u"\xDCED\xDCA0\xDC80",
                                  u"\U0001F600",
                                  u"back\\slash",
                                  u" ",
                                  u"\t"};
    for (auto const& name : names) {
        folder.addFile(toSystem(name));
    }

    std::set<Path> found;
    for (auto const& entry : std::filesystem::directory_iterator(folder.onDisk())) {
        found.insert(fromSystem(entry.path().filename()));
    }

    EXPECT_EQ(found, names);
}

RC_GTEST_PROP(SystemName, isTheResultOfToSystem, ()) {
    auto const units = *nameUnits();
    Path const path(std::u16string(units.begin(), units.end()));
    std::optional<std::string> expected;
    try {
        expected = bytesOf(path);
    } catch (filesystem_error const&) {
    }

    SystemName const name(path);

    auto const given = name.get() == nullptr ? std::nullopt : std::optional<std::string>(name.get());
    RC_ASSERT(given == expected);
}

TEST(SystemName, containsTheLongestNameThatTheSystemAccepts) {
    for (auto const* last : {u"a", u"\u00E9", u"\u20AC", u"\U0001F600", u"\xDCFF"}) {
        auto const lastLength = bytesOf(last).size();
        std::u16string const longest = std::u16string(PATH_MAX - 1 - lastLength, u'x') + last;
        Path const longestPath = longest;
        Path const tooLongPath = u"x" + longest;

        SystemName const name(longestPath);
        SystemName const tooLong(tooLongPath);

        ASSERT_NE(name.get(), nullptr);
        EXPECT_EQ(name.get(), bytesOf(longestPath));
        EXPECT_EQ(tooLong.get(), nullptr);
    }
}

TEST(SystemName, hasNoneForATextFarBeyondTheLimit) {
    EXPECT_EQ(SystemName(std::u16string(100'000, u'x')).get(), nullptr);
    EXPECT_EQ(SystemName(std::u16string(100'000, u'\u20AC')).get(), nullptr);
}

TEST(Canonical, resolvesLinksAsFarAsThePathExistsAndNormalisesTheRest) {
    TemporaryFolder const folder;
    folder.addFile("real/file");
    folder.addLink("link", "real");
    auto const root = folder.path();

    EXPECT_EQ(canonical(root / u"link/file", {}), root / u"real/file");
    EXPECT_EQ(canonical(root / u"link/../link//./file", {}), root / u"real/file");
    EXPECT_EQ(canonical(root / u"link/none/./a/../b", {}), root / u"real/none/b");
    EXPECT_EQ(canonical(root / u"real/file/below/..", {}), root / u"real/file");
}

TEST(Canonical, goesUpFromTheTargetOfALink) {
    TemporaryFolder const folder;
    folder.addFolder("far/away/target");
    folder.addLink("link", "far/away/target");

    EXPECT_EQ(canonical(folder.path() / u"link/../beside", {}), folder.path() / u"far/away/beside");
}

TEST(Canonical, keepsADanglingLink) {
    TemporaryFolder const folder;
    folder.addLink("dangling", "none");

    EXPECT_EQ(canonical(folder.path() / u"dangling/a", {}), folder.path() / u"dangling/a");
}

TEST(Canonical, hasNoTrailingSeparator) {
    TemporaryFolder const folder;
    folder.addFolder("a");
    auto const root = folder.path();

    EXPECT_EQ(canonical(root / u"a//", {}), root / u"a");
    EXPECT_EQ(canonical(root / u"none/", {}), root / u"none");
    EXPECT_EQ(canonical(root / u"none/.", {}), root / u"none");
    EXPECT_EQ(canonical(root / u"none/a/..", {}), root / u"none");
}

TEST(Canonical, theRootStaysTheRoot) {
    for (auto const* text : {u"/", u"//", u"/..", u"/./", u"/../../none/.."}) {
        EXPECT_EQ(canonical(text, {}), Path(u"/"));
    }
    EXPECT_EQ(canonical(u"//none", {}), Path(u"/none"));
}

TEST(Canonical, aRelativePathIsRelativeToTheBase) {
    TemporaryFolder const folder;
    folder.addFolder("a");
    folder.addLink("link", "a");

    EXPECT_EQ(canonical(u"x/../y", folder.path() / u"link/"), folder.path() / u"a/y");
    EXPECT_EQ(canonical(u"", folder.path() / u"link"), folder.path() / u"a");
    EXPECT_EQ(canonical(folder.path() / u"a", u"/none"), folder.path() / u"a");
}

TEST(Canonical, anEmptyOrRelativeBaseIsRelativeToTheWorkingFolder) {
    auto const working = fromSystem(std::filesystem::canonical(std::filesystem::current_path()));

    EXPECT_EQ(canonical(u"", {}), working);
    EXPECT_EQ(canonical(u"none", {}), working / u"none");
    EXPECT_EQ(canonical(u"none", u"base"), working / u"base/none");
}

TEST(Canonical, acceptsAnAbsolutePathAfterTheWorkingFolderWasDeleted) {
    TemporaryFolder const folder;
    auto const before = std::filesystem::current_path();
    std::filesystem::current_path(folder.addFolder("gone"));
    std::filesystem::remove(folder.onDisk() / "gone");

    auto const path = canonical(folder.path() / u"a/..", {});
    EXPECT_THROW(canonical(u"relative", {}), filesystem_error);

    std::filesystem::current_path(before);
    EXPECT_EQ(path, folder.path());
}

TEST(Canonical, throwsForALoopOfLinksAndForTextThatHasNoName) {
    TemporaryFolder const folder;
    folder.addLink("one", "two");
    folder.addLink("two", "one");

    EXPECT_THROW(canonical(folder.path() / u"one/a", {}), filesystem_error);
    EXPECT_THROW(canonical(u"/\xD800", {}), filesystem_error);
    EXPECT_THROW(canonical(u"a", u"/\xD800"), filesystem_error);
}

TEST(Canonical, acceptsNamesThatAreNotUtf8) {
    TemporaryFolder const folder;
    folder.addFolder("stray\xFF");
    folder.addLink("link", "stray\xFF");

    EXPECT_EQ(canonical(folder.path() / u"link/none\xDCFE", {}), folder.path() / u"stray\xDCFF/none\xDCFE");
}

} // namespace fl::filesystem
