#include <cstddef>

#include "Verbs.hpp"
#include "cli/DeclaredTool.hpp"
#include "cli/ExitCode.hpp"
#include "cli/HelpFormatter.hpp"
#include "cli/WrappedText.hpp"
#include "support/GlobalLocale.hpp"
#include "tools/SampleProject.hpp"

namespace project::test {
namespace {

using ::testing::AllOf;
using ::testing::HasSubstr;
using ::testing::Le;
using ::testing::StartsWith;

class Help : public ToolTest {};

TEST_F(Help, ofAVerbIsTheSameAsItsOption) {
    EXPECT_THAT(tool({"help", "label", "put"}), Prints(tool({"label", "put", "--help"}).output));
    EXPECT_THAT(tool({"help", "list"}), Prints(tool({"list", "-h"}).output));
    EXPECT_THAT(tool({"help"}), Prints(tool({"--help"}).output));
}

TEST_F(Help, ofAnUnknownVerbIsRefused) {
    EXPECT_THAT(tool({"help", "lsit"}), FailsWith(2, "Did you mean \"list\"?"));
    EXPECT_THAT(tool({"help", "label", "putt"}), FailsWith(2, "Did you mean \"put\"?"));
}

TEST_F(Help, isInTheLanguageOfTheEnvironment) {
    settings_.environment["LANG"] = "de_DE.UTF-8";

    EXPECT_THAT(tool({"list", "--help"}).output,
                AllOf(StartsWith("Die Dateien und Ordner des Projekts auflisten."),
                      HasSubstr("\nAufruf: projectctl list [OPTIONEN]"),
                      HasSubstr("\nBeispiel:\n  $ projectctl list")));
}

TEST_F(Help, showsTheVerbsByPurpose) {
    auto const help = tool({"--help"}).output;

    EXPECT_LT(help.find("\nIts files:\n  add "), help.find("\nLabels on files:\n  category "));
    EXPECT_LT(help.find("\nLabels on files:\n"), help.find("\n  label "));
}

void expectNarrow(projectctl::VerbDescription const& verb) {
    for (auto const& line : SampleProject::linesOf(projectctl::helpOf(verb))) {
        if (!line.starts_with("  $ ")) { // an example is not broken
            EXPECT_THAT(projectctl::columnsOf(line), Le(80U)) << verb.name << ": " << line;
        }
    }
    for (auto const& member : verb.members) {
        expectNarrow(member);
    }
}

TEST_F(Help, isNotWiderThan80Columns) {
    projectctl::DeclaredTool tool(projectctl::verbs());
    for (auto const* language : {"en", "de"}) {
        GlobalLocale const locale(language);
        expectNarrow(projectctl::describe(tool.parser()));
    }
}

TEST(WrappedText, breaksLinesAtBlanksAndCountsCharacters) {
    std::string out = "x ";
    projectctl::appendWrapped(out, std::string(76, 'a') + " ü bb", 2, 4);
    EXPECT_EQ(out, "x " + std::string(76, 'a') + " ü\n    bb\n");

    std::string longWord;
    projectctl::appendWrapped(longWord, "a " + std::string(100, 'b'), 0, 2);
    EXPECT_EQ(longWord, "a\n  " + std::string(100, 'b') + '\n');
}

class Example : public SampleProject {
protected:
    void runAll(projectctl::VerbDescription const& verb) const {
        if (!verb.name.empty()) {
            EXPECT_THAT(verb.example, HasSubstr("projectctl " + verb.name)) << "example of " << verb.name;
            auto const result = runInCopy(verb.example);
            EXPECT_EQ(result.exitCode, exitCodeOf(verb)) << verb.example << '\n' << result.errors;
        }
        for (auto const& member : verb.members) {
            runAll(member);
        }
    }

    /// The sample is not on a server, which the examples of shared projects need: they fail when they look
    /// for it.
    static int exitCodeOf(projectctl::VerbDescription const& verb) {
        constexpr int interrupted = 124; // of `timeout`
        if (verb.name == "copy" || verb.name.starts_with("shared")) {
            return projectctl::exit_code::failed;
        }
        return verb.name == "watch" ? interrupted : projectctl::exit_code::done;
    }
};

TEST_F(Example, ofEachVerbWorksInTheSampleProject) {
    projectctl::DeclaredTool tool(projectctl::verbs());
    runAll(projectctl::describe(tool.parser()));
}

} // namespace
} // namespace project::test
