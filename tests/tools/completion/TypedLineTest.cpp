#include "completion/TypedLine.hpp"

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <rapidcheck.h>
#include <rapidcheck/gtest.h>

namespace project::test {
namespace {

using projectctl::argumentsOf;
using projectctl::quotedForBash;
using projectctl::readTypedLine;
using projectctl::Shell;
using projectctl::TypedLine;
using ::testing::ElementsAre;
using Quote = TypedLine::Quote;

std::vector<std::string> wordsOf(std::string_view text, Shell shell) {
    return readTypedLine(text, shell).words;
}

TEST(TypedLine, endsWithTheWordThatIsBeingTyped) {
    EXPECT_THAT(wordsOf("projectctl list", Shell::Bash), ElementsAre("projectctl", "list"));
    EXPECT_THAT(wordsOf("projectctl  list ", Shell::Bash), ElementsAre("projectctl", "list", ""));
    EXPECT_THAT(wordsOf("", Shell::Fish), ElementsAre(""));
}

TEST(TypedLine, mayEndInsideQuotes) {
    auto const single = readTypedLine("list 'a b", Shell::Bash);
    auto const twice = readTypedLine("list \"a \\\" b\"'c", Shell::Bash);

    EXPECT_THAT(single.words, ElementsAre("list", "a b"));
    EXPECT_EQ(single.quote, Quote::Single);
    EXPECT_THAT(twice.words, ElementsAre("list", "a \" bc"));
    EXPECT_EQ(twice.quote, Quote::Single);
    EXPECT_EQ(readTypedLine("list \"a", Shell::Fish).quote, Quote::Double);
    EXPECT_EQ(readTypedLine("list \"a\"", Shell::Fish).quote, Quote::None);
}

TEST(TypedLine, hasTheEscapesOfItsShell) {
    EXPECT_THAT(wordsOf("a\\ b 'a\\' \"\\a\\$\" a\\nb \\", Shell::Bash),
                ElementsAre("a b", "a\\", "\\a$", "anb", ""));
    EXPECT_THAT(wordsOf("$'a\\n\\'\\x41\\102'c a\\\nb", Shell::Bash), ElementsAre("a\n'ABc", "ab"));
    EXPECT_THAT(wordsOf("a\\ b 'a\\'\\n' \"\\a\\$\" a\\nb\\x41 \\", Shell::Fish),
                ElementsAre("a b", "a'\\n", "\\a$", "a\nbA", ""));
}

TEST(TypedLine, hasArgumentsAfterVariablesAndTheProgram) {
    EXPECT_THAT(argumentsOf(readTypedLine("LC_ALL=C X= ./projectctl a=b ", Shell::Bash)),
                ElementsAre("a=b", ""));
    EXPECT_THAT(argumentsOf(readTypedLine("projectctl", Shell::Bash)), ElementsAre());
    EXPECT_THAT(argumentsOf(readTypedLine("", Shell::Bash)), ElementsAre());
}

RC_GTEST_PROP(TypedLine, readsWhatIsQuotedForBash, (std::string const& text)) {
    RC_ASSERT(wordsOf("x " + quotedForBash(text, Quote::None), Shell::Bash).at(1) == text);
    RC_ASSERT(wordsOf("x '" + quotedForBash(text, Quote::Single) + '\'', Shell::Bash).at(1) == text);
    RC_ASSERT(wordsOf("x \"" + quotedForBash(text, Quote::Double) + '"', Shell::Bash).at(1) == text);
}

RC_GTEST_PROP(TypedLine, canBeAnything, (std::string const& text, bool isFish)) {
    RC_ASSERT(!readTypedLine(text, isFish ? Shell::Fish : Shell::Bash).words.empty());
}

} // namespace
} // namespace project::test
