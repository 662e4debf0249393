#include <regex>

#include "tools/ToolTest.hpp"

namespace project::test {
namespace {

using ::testing::ElementsAre;
using ::testing::HasSubstr;

/// A project with a category, used in German.
class German : public ToolTest {
protected:
    void SetUp() override {
        initProject();
        folder_.addFile("a");
        folder_.addFile("b");
        ASSERT_EQ(tool({"add", "a"}).exitCode, 0);
        ASSERT_EQ(tool({"category", "create", "Status", "--single-valued"}).exitCode, 0);
        ASSERT_EQ(tool({"label", "create", "Status", "Offen"}).exitCode, 0);
        settings_.environment["LANG"] = "de_DE.UTF-8";
    }

    /// Lists a file whose folder is not in the project.
    void addFault() const { insertLineBefore(R"({"at":["Info","ProjectData"])", "\"lost/file\""); }

    ProgramResult onTerminal(std::vector<std::string> const& arguments) {
        settings_.onTerminal = true;
        auto result = tool(arguments);
        settings_.onTerminal = false;
        return result;
    }
};

TEST_F(German, errorsAndTheirNextSteps) {
    EXPECT_THAT(tool({"init"}), FailsWith(1, "gibt es schon ein Projekt"));
    EXPECT_THAT(tool({"init", "fehlt"}), FailsWith(1, "es gibt keinen Ordner „fehlt“"));
    EXPECT_THAT(tool({"list", "--kind", "x"}),
                FailsWith(2, "„x“ ist keine Art. Die Arten sind file und folder"));
    EXPECT_THAT(tool({"check", "--format", "x"}), FailsWith(2, "„x“ ist keine Form"));
    EXPECT_THAT(tool({"list", ""}), FailsWith(1, "ein leerer Pfad benennt keine Datei"));
    EXPECT_THAT(tool({"list", "--color", "x"}), FailsWith(2, "--color ist auto, always oder never"));
    EXPECT_THAT(tool({"entry", "show", "a"}), FailsWith(1, "„a“ ist kein Einstiegspunkt"));
    EXPECT_THAT(tool({"path", "remove", "x"}),
                FailsWith(1, "„x“ ist nicht unter den Ordnern des Projektpfads"));
    EXPECT_THAT(tool({"shared", "status"}), FailsWith(1, "das Projekt ist kein gemeinsames"));
    EXPECT_THAT(tool({"setup"}), FailsWith(1, "ist nicht in einem git-Repository"));
    EXPECT_THAT(tool({"-C", "fehlt", "list"}),
                FailsWith(1, "der Wechsel in den Ordner „fehlt“ ist nicht möglich"));
    EXPECT_THAT(toolFrom("/", {"list"}), FailsWith(1, "kein Projekt in „/“ oder einem Ordner darüber"));
}

TEST_F(German, errorsOfABatch) {
    EXPECT_THAT(tool({"batch"}, "name 'x"),
                FailsWith(2, "Zeile 1: ein einfaches Anführungszeichen ist nicht"));
    EXPECT_THAT(tool({"batch"}, "name x\nlist c\n"), FailsWith(1, "Zeile 2: "));
    EXPECT_THAT(tool({"batch"}, "watch\n"),
                FailsWith(2, "„watch“ kann in dieser Form nicht Teil eines Stapels sein"));
}

TEST_F(German, confirmations) {
    EXPECT_THAT(onTerminal({"add", "b"}).output, HasSubstr("1 zum Projekt hinzugefügt"));
    EXPECT_THAT(onTerminal({"label", "put", "Status", "Offen", "a"}).output, HasSubstr("an 1 angebracht"));
    EXPECT_THAT(onTerminal({"label", "take", "Status", "Offen", "a"}).output, HasSubstr("von 1 entfernt"));
    EXPECT_THAT(onTerminal({"remove", "b"}).output, HasSubstr("1 vom Projekt entfernt"));
    EXPECT_THAT(onTerminal({"tidy"}).output, HasSubstr("Der Text des Projekts"));
    EXPECT_THAT(onTerminal({"check"}).output, HasSubstr("Das Projekt hat keine Mängel."));
}

TEST_F(German, wordsOfStatus) {
    std::filesystem::remove(inFolder("a"));

    EXPECT_THAT(linesOf(tool({"status"}).output), ElementsAre("neu    b", "weg    a"));
}

TEST_F(German, itemsThatCannotBeImported) {
    auto const result = tool({"import", "csv"}, "path,category,label,data\nfehlt,,,\na,,,x\n");

    EXPECT_EQ(result.exitCode, 3);
    EXPECT_THAT(linesOf(result.errors),
                ElementsAre("projectctl: -:2: „fehlt“ gibt es nicht",
                            "projectctl: -:3: Daten brauchen eine Kategorie und ein Etikett"));
}

TEST_F(German, warningsAndFindings) {
    addFault();

    auto const result = tool({"check"});

    EXPECT_EQ(result.exitCode, 3);
    EXPECT_THAT(result.output, HasSubstr("die Datei „lost/file“ ist im Projekt, aber ihr Ordner nicht"));
}

TEST_F(German, errorsOfTheStore) {
    insertLineBefore("\"a\"", "nonsense");

    EXPECT_THAT(tool({"add", "b"}),
                FailsWith(5,
                          ": die Zeile ist kein gültiges JSON. Ein beschädigter Text wird nicht geschrieben. "
                          "„projectctl check“ zeigt alle Schäden"));
    EXPECT_THAT(tool({"check"}).output, HasSubstr("die Zeile ist kein gültiges JSON"));
}

TEST_F(German, errorsOfTheStoreWithTheOtherVariablesOfTheLocale) {
    writeText("hello\n");
    for (auto const* variable : {"LC_MESSAGES", "LC_ALL"}) {
        settings_.environment["LANG"] = "C";
        settings_.environment[variable] = "de_DE.UTF-8";

        EXPECT_THAT(tool({"list"}), FailsWith(5, "die Datei ist keine Projektdefinition"));

        settings_.environment.erase(variable);
        EXPECT_THAT(tool({"list"}), FailsWith(5, "the file is not a project definition"));
    }
}

TEST_F(German, errorsOfGit) {
    ASSERT_EQ(runProgram({"git", "init", "-q"}, settings_).exitCode, 0);
    folder_.addFile(".git/index.lock");

    EXPECT_THAT(tool({"add", "b"}), FailsWith(4, "der Index ist gesperrt: git läuft in diesem Repository"));
}

TEST_F(German, aLineOfAnImport) {
    EXPECT_THAT(tool({"import", "jsonl"}, "nonsense\n").errors,
                HasSubstr("kein Objekt, dessen Mitglieder Texte sind: die Zeile ist kein gültiges JSON"));
}

TEST_F(German, documentsDifferFromEnglishOnesInTheirTextsOnly) {
    static std::regex const text(R"re("text": "(?:[^"\\]|\\.)*")re");
    addFault();
    insertLineBefore("\"a\"", "nonsense");
    auto const withoutTexts = [this](std::vector<std::string> const& arguments) {
        auto const result = tool(arguments);
        return std::regex_replace(result.output + result.errors, text, "");
    };
    for (auto const& arguments : std::vector<std::vector<std::string>>{{"check", "--json"},
                                                                       {"status", "--json"},
                                                                       {"list", "fehlt", "--json"},
                                                                       {"lsit", "--json"},
                                                                       {"add", "b", "--json"}}) {
        settings_.environment["LANG"] = "de_DE.UTF-8";
        auto const german = withoutTexts(arguments);
        settings_.environment["LANG"] = "C";
        EXPECT_EQ(withoutTexts(arguments), german);
        EXPECT_NE(german, "");
    }
}

} // namespace
} // namespace project::test
