#include "Verbs.hpp"
#include "cli/DeclaredTool.hpp"
#include "cli/VerbDescription.hpp"
#include "support/GlobalLocale.hpp"
#include "tools/texts/CatalogSource.hpp"

namespace project::test {
namespace {

using projectctl::VerbDescription;
using ::testing::IsEmpty;
using ::testing::Not;

class Catalogs : public ::testing::TestWithParam<char const*> {};

TEST_P(Catalogs, haveTheSameTextsWithTheSameArgumentsInBothLanguages) {
    auto const english = readTexts(GetParam(), "root");
    auto german = readTexts(GetParam(), "de");
    EXPECT_GT(english.size(), 30U);

    for (auto const& [key, text] : english) {
        if (key.ends_with(": example")) { // a call is the same in both languages
            EXPECT_FALSE(german.contains(key)) << key;
        } else {
            ASSERT_TRUE(german.contains(key)) << key;
            EXPECT_EQ(argumentsOf(german[key]), argumentsOf(text)) << key;
            EXPECT_FALSE(german[key].empty()) << key;
            german.erase(key);
        }
    }
    EXPECT_THAT(german, IsEmpty());
}

INSTANTIATE_TEST_SUITE_P(OfTheTool, Catalogs, ::testing::Values("verbs", "messages"));

/// The descriptions of a verb and its members, one after the other.
std::vector<VerbDescription> flattened(VerbDescription const& verb) {
    std::vector<VerbDescription> result{verb};
    for (auto const& member : verb.members) {
        auto const below = flattened(member);
        result.insert(result.end(), below.begin(), below.end());
    }
    return result;
}

TEST(VerbTexts, describeEachVerbOptionAndArgumentInBothLanguages) {
    projectctl::DeclaredTool tool(projectctl::verbs());
    auto const english = flattened(projectctl::describe(tool.parser()));
    GlobalLocale const locale("de");
    auto const german = flattened(projectctl::describe(tool.parser()));

    ASSERT_EQ(english.size(), german.size());
    for (std::size_t i = 0; i < english.size(); ++i) {
        EXPECT_THAT(english[i].summary, Not(IsEmpty())) << english[i].name;
        EXPECT_NE(english[i].summary, german[i].summary) << english[i].name;
        EXPECT_FALSE(english[i].summary.ends_with('.')) << english[i].summary;
        for (auto const list : {&VerbDescription::options, &VerbDescription::arguments}) {
            auto const& options = english[i].*list;
            ASSERT_EQ(options.size(), (german[i].*list).size());
            for (std::size_t j = 0; j < options.size(); ++j) {
                EXPECT_THAT(options[j].text, Not(IsEmpty()))
                    << english[i].name << ' ' << options[j].names.back();
                EXPECT_NE(options[j].text, (german[i].*list)[j].text)
                    << english[i].name << ' ' << options[j].names.back();
            }
        }
    }
}

} // namespace
} // namespace project::test
