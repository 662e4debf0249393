#include "Glob.hpp"

#include <regex>

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

namespace project::session {
namespace {

bool isMatch(std::u16string_view pattern, std::u16string_view path) {
    return Glob(pattern).isMatch(path);
}

TEST(Glob, comparesTheWholePathFromTheRoot) {
    EXPECT_TRUE(isMatch(u"src/main.cpp", u"src/main.cpp"));
    EXPECT_FALSE(isMatch(u"main.cpp", u"src/main.cpp"));
    EXPECT_FALSE(isMatch(u"src", u"src/main.cpp"));
    EXPECT_FALSE(isMatch(u"src/main.cpp", u"src"));
    EXPECT_FALSE(isMatch(u"", u"src"));
    EXPECT_FALSE(isMatch(u"SRC", u"src"));
}

TEST(Glob, aStarAndAQuestionMarkDoNotCrossASeparator) {
    EXPECT_TRUE(isMatch(u"*.cpp", u"main.cpp"));
    EXPECT_TRUE(isMatch(u"*", u".hidden"));
    EXPECT_FALSE(isMatch(u"*.cpp", u"src/main.cpp"));
    EXPECT_TRUE(isMatch(u"src/*", u"src/main.cpp"));
    EXPECT_FALSE(isMatch(u"src/*", u"src/io/pump.cpp"));
    EXPECT_FALSE(isMatch(u"src?main.cpp", u"src/main.cpp"));
    EXPECT_TRUE(isMatch(u"a*b*c", u"axbxbxc"));
    EXPECT_FALSE(isMatch(u"a*b*c", u"axbxbx"));
    EXPECT_TRUE(isMatch(u"a**c", u"abc")); // not a whole element
    EXPECT_FALSE(isMatch(u"a**c", u"a/c"));
}

TEST(Glob, twoStarsMatchAnyNumberOfElements) {
    EXPECT_TRUE(isMatch(u"**", u"a/b/c"));
    EXPECT_TRUE(isMatch(u"**/*.cpp", u"main.cpp"));
    EXPECT_TRUE(isMatch(u"**/*.cpp", u"src/io/pump.cpp"));
    EXPECT_TRUE(isMatch(u"src/**/pump.cpp", u"src/pump.cpp"));
    EXPECT_TRUE(isMatch(u"src/**/pump.cpp", u"src/a/b/pump.cpp"));
    EXPECT_TRUE(isMatch(u"**/io/**/x", u"io/a/io/b/x"));
    EXPECT_FALSE(isMatch(u"**/io/**/x", u"a/b/x"));
}

TEST(Glob, twoStarsAtTheEndMatchEverythingBelowAFolderAndNotTheFolder) {
    EXPECT_TRUE(isMatch(u"src/**", u"src/a/b"));
    EXPECT_FALSE(isMatch(u"src/**", u"src"));
    EXPECT_FALSE(isMatch(u"src/**", u"srcs/a"));
}

TEST(Glob, bracketsMatchOneOfTheirCharacters) {
    EXPECT_TRUE(isMatch(u"[a-c]x", u"bx"));
    EXPECT_FALSE(isMatch(u"[a-c]x", u"dx"));
    EXPECT_TRUE(isMatch(u"[!a-c]x", u"dx"));
    EXPECT_FALSE(isMatch(u"[!a-c]x", u"bx"));
    EXPECT_TRUE(isMatch(u"[^a]", u"b"));
    EXPECT_TRUE(isMatch(u"[]]", u"]"));
    EXPECT_TRUE(isMatch(u"[a-]", u"-"));
    EXPECT_TRUE(isMatch(u"[\\]a]", u"]"));
    EXPECT_TRUE(isMatch(u"[a", u"[a")); // not closed
    EXPECT_FALSE(isMatch(u"[a", u"a"));
}

TEST(Glob, aBackslashQuotesACharacter) {
    EXPECT_TRUE(isMatch(u"\\*", u"*"));
    EXPECT_FALSE(isMatch(u"\\*", u"a"));
    EXPECT_TRUE(isMatch(u"a\\", u"a\\"));
}

TEST(Glob, aCharacterIsACodePointOrAByteThatIsNotUtf8) {
    EXPECT_TRUE(isMatch(u"?", u"\U0001F600"));
    EXPECT_TRUE(isMatch(u"[\U0001F600-\U0001F610]", u"\U0001F605"));
    EXPECT_TRUE(isMatch(u"?", std::u16string{0xDC80}));
    EXPECT_TRUE(isMatch(u"??", std::u16string{0xDC80, 0xDC81}));
    EXPECT_FALSE(isMatch(u"?", u"ab"));
}

TEST(Glob, aPatternWithManyStarsIsFastOnANameThatDoesNotMatch) {
    std::u16string pattern;
    for (int count = 0; count < 200; ++count) {
        pattern += u"*a**/"; // an exponential search would not end
    }
    std::u16string path;
    for (int count = 0; count < 1000; ++count) {
        path += u"aaaa/";
    }
    EXPECT_FALSE(isMatch(u"**/" + pattern + u"b", path + u"c"));
}

/// An expression that says the same.
std::string expressionFor(std::string const& pattern) {
    std::string result;
    for (std::size_t at = 0; at < pattern.size(); ++at) {
        bool const isElementBegin = at == 0 || pattern[at - 1] == '/';
        if (isElementBegin && pattern.compare(at, 3, "**/") == 0) {
            result += "(?:[^/]+/)*";
            at += 2;
        } else if (isElementBegin && pattern.substr(at) == "**") {
            result += "[^]+";
            ++at;
        } else if (pattern[at] == '*') {
            result += "[^/]*";
        } else if (pattern[at] == '?') {
            result += "[^/]";
        } else {
            result += pattern[at];
        }
    }
    return result;
}

RC_GTEST_PROP(Glob, agreesWithAnExpressionThatSaysTheSame, ()) {
    auto const someOf = [](std::string const& signs, std::size_t most) {
        return *rc::gen::resize(static_cast<int>(most),
                                rc::gen::container<std::string>(rc::gen::elementOf(signs)));
    };
    auto const pattern = someOf("ab*?/**/", 9);
    auto path = someOf("aab/", 9);
    while (path.find("//") != std::string::npos) {
        path.erase(path.find("//"), 1);
    }
    bool const isRelative = !path.empty() && path.front() != '/' && path.back() != '/';
    RC_PRE(isRelative); // RC_PRE evaluates both sides of an "and"
    bool const expected = std::regex_match(path, std::regex(expressionFor(pattern)));
    RC_CLASSIFY(expected, "match");
    RC_ASSERT(isMatch(std::u16string(pattern.begin(), pattern.end()),
                      std::u16string(path.begin(), path.end())) == expected);
}

} // namespace
} // namespace project::session
