#include "cli/CommandText.hpp"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "cli/CodedFailure.hpp"

namespace project::test {
namespace {

using projectctl::CommandText;
using projectctl::WrongUse;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

using Words = std::vector<std::string>;

std::vector<Words> commandsOf(std::string text) {
    CommandText rest(std::move(text));
    std::vector<Words> result;
    while (auto const line = rest.next()) {
        result.push_back(line->words);
    }
    return result;
}

std::string errorOf(std::string text) {
    try {
        commandsOf(std::move(text));
    } catch (WrongUse const& error) {
        return error.what();
    }
    return "no error";
}

TEST(CommandText, isSplitAtLineEndsAndBlanks) {
    EXPECT_THAT(commandsOf("add a  b\n\tlist\n"), ElementsAre(Words{"add", "a", "b"}, Words{"list"}));
    EXPECT_THAT(commandsOf("add a"), ElementsAre(Words{"add", "a"}));
}

TEST(CommandText, skipsEmptyLinesAndComments) {
    EXPECT_THAT(commandsOf("\n  \n# add\nlist # 'all\n#"), ElementsAre(Words{"list"}));
    EXPECT_THAT(commandsOf("add a#b ''# '#c'"), ElementsAre(Words{"add", "a#b", "#", "#c"}));
    EXPECT_THAT(commandsOf(""), IsEmpty());
}

TEST(CommandText, takesEveryByteBetweenSingleQuotes) {
    EXPECT_THAT(commandsOf("add 'a b' 'a\nb' '\"\\#$' ''\nlist"),
                ElementsAre(Words{"add", "a b", "a\nb", "\"\\#$", ""}, Words{"list"}));
}

TEST(CommandText, takesBackslashesBetweenDoubleQuotes) {
    EXPECT_THAT(commandsOf(R"(add "a 'b'" "\"\\\$\`" "\n\'" "a\)"
                           "\nb\"\nlist"),
                ElementsAre(Words{"add", "a 'b'", "\"\\$`", "\\n\\'", "ab"}, Words{"list"}));
}

TEST(CommandText, takesBackslashesOutsideOfQuotes) {
    EXPECT_THAT(commandsOf("add a\\ b \\'x\\\" \\\\ \\# c\\\nd \\\n e\n"),
                ElementsAre(Words{"add", "a b", "'x\"", "\\", "#", "cd", "e"}));
}

TEST(CommandText, joinsPartsThatAreQuotedDifferently) {
    EXPECT_THAT(commandsOf("add a' 'b\" \"c"), ElementsAre(Words{"add", "a b c"}));
}

TEST(CommandText, expandsNothing) {
    EXPECT_THAT(commandsOf("add $HOME * ~ {a,b} ; | & > \x80\xFF"),
                ElementsAre(Words{"add", "$HOME", "*", "~", "{a,b}", ";", "|", "&", ">", "\x80\xFF"}));
}

TEST(CommandText, numbersACommandByTheLineInWhichItBegins) {
    CommandText text("# one\n\nadd 'a\nb' \\\n c\nlist\n");

    EXPECT_EQ(text.next()->number, 3U);
    EXPECT_EQ(text.next()->number, 6U);
    EXPECT_FALSE(text.next());
}

TEST(CommandText, namesTheLineOfAFault) {
    EXPECT_EQ(errorOf("list\nadd 'a\nb\n"), "line 2: a single quote is not closed");
    EXPECT_EQ(errorOf("list\nadd 'a\nb' \"c\n\n"), "line 3: a double quote is not closed");
    EXPECT_EQ(errorOf("add \"a\\"), "line 1: a double quote is not closed");
    EXPECT_EQ(errorOf("list\nadd a\\"), "line 2: nothing follows the backslash");
    EXPECT_EQ(errorOf(std::string("list\n\nadd a\0b", 13)),
              "line 3: a zero byte cannot be part of a command");
}

} // namespace
} // namespace project::test
