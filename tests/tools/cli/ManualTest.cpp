#include <regex>

#include "Verbs.hpp"
#include "cli/Command.hpp"
#include "tools/ToolTest.hpp"

namespace project::test {
namespace {

using ::testing::AllOf;
using ::testing::HasSubstr;
using ::testing::StartsWith;

/// The manual pages, in a fresh folder.
class Manual : public ToolTest, public ::testing::WithParamInterface<char const*> {
protected:
    void SetUp() override {
        auto const written =
            runProgram({PROJECTCTL_MANUAL, GetParam(), inFolder("man/man1"), "November 2, 2026"}, settings_);
        ASSERT_EQ(written.exitCode, 0) << written.errors;
    }

    /// The messages of mandoc's check, except those on references to pages that are here: it searches for
    /// these in the system's own folders only.
    std::string mistakesIn(std::string const& page) const {
        static std::regex const reference(R"(.*referenced manual not found: Xr (\S+) 1)");
        auto const result = mandoc({"-T", "lint"}, page);
        std::string mistakes = result.errors;
        for (auto const& line : linesOf(result.output)) {
            std::smatch found;
            bool const isHere = std::regex_match(line, found, reference) &&
                                std::filesystem::exists(inFolder("man/man1/" + found[1].str() + ".1"));
            mistakes += isHere ? "" : line + '\n';
        }
        return mistakes;
    }

    ProgramResult mandoc(std::vector<std::string> const& options, std::string const& page) const {
        std::vector<std::string> command{"mandoc"};
        command.insert(command.end(), options.begin(), options.end());
        command.push_back(inFolder("man/man1/" + page + ".1"));
        return runProgram(command, settings_);
    }
};

TEST_P(Manual, hasAPageWithoutMistakesForEachVerb) {
    std::vector<std::string> pages{"projectctl"};
    for (auto const& verb : projectctl::verbs()) {
        if (std::string(verb.purpose) != projectctl::hiddenPurpose) {
            pages.push_back("projectctl-" + std::string(verb.name));
        }
    }
    for (auto const& page : pages) {
        EXPECT_EQ(mistakesIn(page), "") << page;
    }
    auto const files = std::filesystem::directory_iterator(inFolder("man/man1"));
    EXPECT_EQ(std::distance(begin(files), end(files)), static_cast<std::ptrdiff_t>(pages.size()));
}

INSTANTIATE_TEST_SUITE_P(InBothLanguages, Manual, ::testing::Values("en", "de"));

class EnglishManual : public Manual {
protected:
    /// The plain text of a page: bold and underlined letters are written with backspaces.
    std::string shown(std::string const& page) const {
        static std::regex const overstrike(".\b");
        return std::regex_replace(mandoc({"-T", "ascii", "-O", "width=200"}, page).output, overstrike, "");
    }
};

TEST_P(EnglishManual, showsTheTextsOfTheHelp) {
    EXPECT_THAT(shown("projectctl-list"),
                AllOf(HasSubstr("projectctl-list - List the files and folders of the project"),
                      HasSubstr("--tree"), HasSubstr("Write a tree, with a slash after each folder."),
                      HasSubstr("$ projectctl list --tree src")));
    EXPECT_THAT(shown("projectctl-label"), AllOf(HasSubstr("projectctl label put"),
                                                 HasSubstr("$ projectctl label find Status Open -0 |")));
}

INSTANTIATE_TEST_SUITE_P(OfVerbs, EnglishManual, ::testing::Values("en"));

class Guide : public ToolTest {};

TEST_F(Guide, hasThePageThatTheTextsOfTheHelpGive) {
    ASSERT_EQ(runProgram({PROJECTCTL_MANUAL, "--guide", inFolder("verbs.md")}, settings_).exitCode, 0);

    EXPECT_EQ(
        runProgram({"diff", "-u", PROJECTCTL_GUIDE "/verbs.md", inFolder("verbs.md")}, settings_).output, "")
        << "'scripts/guide' writes the page";
}

} // namespace
} // namespace project::test
