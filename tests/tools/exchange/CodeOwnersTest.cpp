#include "exchange/CodeOwners.hpp"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "exchange/CompileCommands.hpp"
#include "output/NameForms.hpp"

namespace project::test {
namespace {

using projectctl::CodeOwners;
using projectctl::CodeOwnersPattern;

bool matches(std::string_view pattern, std::string_view path) {
    return CodeOwnersPattern(pattern).matches(projectctl::textOf(std::string(path)));
}

TEST(CodeOwnersPattern, withoutASlashMatchesInEveryFolder) {
    EXPECT_TRUE(matches("*", "a/b/c"));
    EXPECT_TRUE(matches("*.js", "a/b.js"));
    EXPECT_FALSE(matches("*.js", "a/b.jsx"));
    EXPECT_TRUE(matches("docs", "a/docs/b"));
    EXPECT_TRUE(matches("apps/", "x/apps/y/z"));
    EXPECT_FALSE(matches("apps/", "x/apps"));
}

TEST(CodeOwnersPattern, withASlashMatchesFromTheRoot) {
    EXPECT_TRUE(matches("/docs/", "docs/a/b"));
    EXPECT_FALSE(matches("/docs/", "x/docs/a"));
    EXPECT_TRUE(matches("build/logs", "build/logs/a"));
    EXPECT_FALSE(matches("build/logs", "x/build/logs/a"));
    EXPECT_TRUE(matches("/a", "a"));
    EXPECT_FALSE(matches("/a", "b/a"));
}

TEST(CodeOwnersPattern, thatEndsWithAStarDoesNotMatchBelowFolders) {
    EXPECT_TRUE(matches("docs/*", "docs/a.md"));
    EXPECT_FALSE(matches("docs/*", "docs/a/b.md"));
    EXPECT_TRUE(matches("docs/**", "docs/a/b.md"));
    EXPECT_FALSE(matches("/*", "a/b"));
    EXPECT_TRUE(matches("docs/*/", "docs/a/b.md")); // of folders, with everything below them
    EXPECT_FALSE(matches("docs/*/", "docs/a.md"));
}

TEST(CodeOwnersPattern, mayHaveTwoStarsForFolders) {
    EXPECT_TRUE(matches("**/logs", "logs"));
    EXPECT_TRUE(matches("**/logs", "a/b/logs/c"));
    EXPECT_TRUE(matches("a/**/z", "a/z"));
    EXPECT_TRUE(matches("a/**/z", "a/b/c/z"));
    EXPECT_FALSE(matches("a/**", "a"));
}

TEST(CodeOwnersPattern, quotesWithBackslashesAndHasNoBrackets) {
    EXPECT_TRUE(matches("/a\\*b", "a*b"));
    EXPECT_FALSE(matches("/a\\*b", "axb"));
    EXPECT_TRUE(matches("/[a]", "[a]"));
    EXPECT_FALSE(matches("/[a]", "a"));
    EXPECT_TRUE(matches("/\\[a]", "[a]"));
    EXPECT_TRUE(matches("/?", "\xC3\xA9"));
    EXPECT_TRUE(matches("/?", "\xFF"));
    EXPECT_TRUE(matches("/a*b*c*d*e", "aaabbbbbccccdddde"));
    EXPECT_FALSE(matches("/a*a*a*a*a*a*a*a*a*b", std::string(200, 'a')));
}

TEST(CodeOwners, decideByTheLastPatternThatMatches) {
    CodeOwners const owners("* @all\r\n/src/ @src\n/src/none\n");

    EXPECT_THAT(owners.ruleOf(u"a")->owners, ::testing::ElementsAre("@all"));
    EXPECT_THAT(owners.ruleOf(u"src/a")->owners, ::testing::ElementsAre("@src"));
    EXPECT_THAT(owners.ruleOf(u"src/none")->owners, ::testing::IsEmpty());
    EXPECT_EQ(CodeOwners("/x @y").ruleOf(u"a"), nullptr);
}

TEST(CompileCommands, nameTheFolderOfATarget) {
    EXPECT_EQ(projectctl::targetFolderOf("src/CMakeFiles/engine.dir/io/a.cpp.o"), "src/engine");
    EXPECT_EQ(projectctl::targetFolderOf("CMakeFiles/engine.dir/a.cpp.o"), "engine");
    EXPECT_EQ(projectctl::targetFolderOf("obj/engine/a.o"), "obj/engine");
    EXPECT_EQ(projectctl::targetFolderOf("a.o"), "");
    EXPECT_EQ(projectctl::targetFolderOf("MyCMakeFiles/engine.dir/a.o"), "MyCMakeFiles/engine.dir");
}

} // namespace
} // namespace project::test
