#include <map>
#include <regex>
#include <set>

#include "support/CatalogSource.hpp"
#include "support/GlobalLocale.hpp"
#include "texts/Message.hpp"
#include "tools/texts/CatalogSource.hpp"

namespace project::test {
namespace {

using projectctl::Message;
using ::testing::HasSubstr;
using ::testing::IsEmpty;

/// The message with an argument in each place, which the text must show.
std::string formatted(std::string const& key, std::size_t count) {
    switch (count) {
    case 0:
        return Message(key).text();
    case 1:
        return Message(key, 71).text();
    case 2:
        return Message(key, 71, 72).text();
    case 3:
        return Message(key, 71, 72, 73).text();
    case 4:
        return Message(key, 71, 72, 73, 74).text();
    default:
        ADD_FAILURE() << key << " has too many arguments for this test";
        return {};
    }
}

class Messages : public ::testing::TestWithParam<char const*> {};

TEST_P(Messages, showTheirArguments) {
    GlobalLocale const locale(GetParam());
    for (auto const& [key, pattern] : readTexts("messages", "root")) {
        auto const arguments = argumentsOf(pattern);
        auto const text = formatted(key, arguments.empty() ? 0 : std::stoul(*arguments.rbegin()) + 1);
        EXPECT_FALSE(text.empty() || text == key) << key;
        EXPECT_EQ(text.find_first_of("{}"), std::string::npos) << key << ": " << text;
        for (auto const& argument : arguments) {
            EXPECT_THAT(text, HasSubstr(std::to_string(71 + std::stoul(argument)))) << key;
        }
    }
}

/// Whether a text about one thing differs from that about two in more than the number.
template <class... Rest>
bool hasSingular(char const* key, Rest const&... rest) {
    auto const one = Message(key, 1, rest...).text();
    return std::regex_replace(one, std::regex("1"), "2") != Message(key, 2, rest...).text();
}

TEST_P(Messages, haveASingularForOneThing) {
    GlobalLocale const locale(GetParam());
    for (auto const* const key :
         {"AmbiguousLeft", "ConflictsLeft", "GuessesLeft", "LogEntriesDeleted", "PersonalTidied"}) {
        EXPECT_TRUE(hasSingular(key)) << key;
    }
    for (auto const* const key : {"Imported", "SyncRuleSet"}) {
        EXPECT_TRUE(hasSingular(key, 3)) << key;
    }
    for (auto const* const key : {"MoveCompleted", "MoveRolledBack"}) {
        EXPECT_TRUE(hasSingular(key, "old", "new")) << key;
    }
}

INSTANTIATE_TEST_SUITE_P(InBothLanguages, Messages, ::testing::Values("en", "de"));

TEST(MessageKeys, ofTheSourcesAreInTheCatalogAndNoOthers) {
    static std::regex const used(R"re(Message\(\s*"(\w+)"\s*[,)])re");
    static std::regex const word(R"re("([A-Z]\w+)")re");
    auto const texts = readTexts("messages", "root");
    std::set<std::string> words;
    for (auto const& [path, source] : sourcesBelow(PROJECTCTL_SOURCES)) {
        for (auto const& key : matchesIn(source, used)) {
            EXPECT_TRUE(texts.contains(key)) << path << ": " << key;
        }
        words.merge(matchesIn(source, word));
    }
    for (auto const& [key, text] : texts) {
        bool const isComposed = key.starts_with("ExitCode") || key.starts_with("Unknown") ||
                                key.starts_with("UnexpectedArgument"); // from a word and a number or "Meant"
        EXPECT_TRUE(isComposed || words.contains(key)) << key << " is not used";
    }
}

/// Texts of at least three words are for people. Those of programs are listed here.
TEST(Sentences, areInTheCatalogsOnly) {
    static std::regex const sentence(
        R"re("((?:[^"\\\n]|\\.)*[A-Za-z]{2,} [a-z]{2,} [a-z]{2,}(?:[^"\\\n]|\\.)*)")re");
    std::set<std::string> const ofPrograms{
        "git/MergeSetup.cpp",       // the configuration of git
        "merge/RenamesOfMerge.cpp", // what git says
        "manual/ManualPage.cpp",    // mdoc
        "manual/GuidePage.cpp",     // a page in English
        "manual.cpp",               // a program of the build
    };
    for (auto const& [path, source] : sourcesBelow(PROJECTCTL_SOURCES)) {
        if (!ofPrograms.contains(path)) {
            EXPECT_THAT(matchesIn(withoutComments(source), sentence), IsEmpty()) << path;
        }
    }
}

} // namespace
} // namespace project::test
