#include <filesystem>
#include <map>
#include <regex>
#include <set>
#include <string>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "support/CatalogSource.hpp"

namespace project::test {
namespace {

using ::testing::IsEmpty;
using Texts = std::map<std::string, std::string>;

/// The sources of a layer.
class ErrorTexts : public ::testing::TestWithParam<char const*> {
protected:
    std::filesystem::path const folder_ = std::filesystem::path(PROJECT_CHECKOUT) / GetParam();
    std::map<std::string, std::string> const sources_ = sourcesBelow(folder_);
    Texts const english_ = readCatalog(folder_ / "texts" / "root.txt");
    std::map<std::string, Texts> const others_ = otherLanguages();

private:
    std::map<std::string, Texts> otherLanguages() const {
        std::map<std::string, Texts> result;
        for (auto const& file : std::filesystem::directory_iterator(folder_ / "texts")) {
            if (file.path().extension() == ".txt" && file.path().stem() != "root") {
                result.emplace(file.path().stem().string(), readCatalog(file));
            }
        }
        return result;
    }
};

std::set<std::string> namesOf(Texts const& texts) {
    std::set<std::string> names;
    for (auto const& [name, text] : texts) {
        names.insert(name);
    }
    return names;
}

/// A name of a text is written as one word with a capital letter. No other literal of the sources is, except
/// for these.
std::set<std::string> wordsIn(std::string const& source) {
    static std::regex const word(R"re("([A-Z][a-z]\w*)")re");
    auto words = matchesIn(withoutComments(source), word);
    words.erase("Name"); // a key of the tree
    return words;
}

/// Literals with at least two words, without those for programs.
std::set<std::string> sentencesIn(std::string const& source) {
    static std::regex const sentence(R"re("((?:[^"\\\n]|\\.)*[A-Za-z]{2,} [a-z]+(?:[^"\\\n]|\\.)*)")re");
    static std::regex const statement(R"(\b(SELECT|INSERT|FROM|WHERE|ORDER|AND|AS|THEN|CONFLICT|ROLE)\b)");
    std::set<std::string> const ofPrograms{
        R"(project.jsonl -text merge=project-definition\n)", // attributes for git
        "no password supplied",                              // a message of libpq
    };
    auto sentences = matchesIn(withoutComments(source), sentence);
    std::erase_if(sentences, [&](std::string const& text) {
        return ofPrograms.contains(text) || std::regex_search(text, statement);
    });
    return sentences;
}

TEST_P(ErrorTexts, areInTheCatalogsOnly) {
    for (auto const& [path, source] : sources_) {
        EXPECT_THAT(sentencesIn(source), IsEmpty()) << path;
    }
}

TEST_P(ErrorTexts, haveTheNamesThatTheSourcesUse) {
    std::set<std::string> used;
    for (auto const& [path, source] : sources_) {
        used.merge(wordsIn(source));
    }

    EXPECT_EQ(used, namesOf(english_));
}

TEST_P(ErrorTexts, existInEachLanguage) {
    EXPECT_TRUE(others_.contains("de"));
    for (auto const& [language, texts] : others_) {
        EXPECT_EQ(namesOf(texts), namesOf(english_)) << language;
    }
}

TEST_P(ErrorTexts, haveTheSameArgumentsInEachLanguage) {
    for (auto const& [language, texts] : others_) {
        for (auto const& [name, text] : texts) {
            EXPECT_EQ(argumentsOf(text), argumentsOf(english_.at(name))) << language << ": " << name;
        }
    }
}

TEST_P(ErrorTexts, areTranslated) {
    static std::regex const word("[A-Za-z]{2,} [A-Za-z]{2,}");
    for (auto const& [language, texts] : others_) {
        for (auto const& [name, text] : texts) {
            EXPECT_TRUE(text != english_.at(name) || !std::regex_search(text, word))
                << language << ": " << name;
        }
    }
}

/// An apostrophe alone begins a quotation in the other catalogs, which have the same form.
TEST_P(ErrorTexts, doubleTheirApostrophes) {
    static std::regex const alone("(^|[^'])'('')*([^']|$)");
    auto all = others_;
    all.emplace("root", english_);
    for (auto const& [language, texts] : all) {
        for (auto const& [name, text] : texts) {
            EXPECT_FALSE(std::regex_search(text, alone)) << language << ": " << name;
        }
    }
}

INSTANTIATE_TEST_SUITE_P(Layers, ErrorTexts,
                         ::testing::Values("platform/src", "stores/src", "session/src", "adapters/git/src",
                                           "adapters/postgresql/src"),
                         [](auto const& layer) {
                             return std::regex_replace(std::string(layer.param), std::regex("[^a-z]"), "_");
                         });

TEST(Sentences, areFoundInASource) {
    EXPECT_THAT(sentencesIn(R"(throw E("exists already");)"), ::testing::ElementsAre("exists already"));
    EXPECT_THAT(sentencesIn(R"("is not " + name)"), ::testing::ElementsAre("is not "));
    EXPECT_THAT(sentencesIn(R"(get("ExistsAlready"); // "exists already")"), IsEmpty());
}

} // namespace
} // namespace project::test
