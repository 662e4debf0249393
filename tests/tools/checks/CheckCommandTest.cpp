#include "tools/ToolTest.hpp"

namespace project::test {
namespace {

using ::testing::AllOf;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::StartsWith;
using ::testing::UnorderedElementsAre;

class CheckCommand : public ToolTest {
protected:
    void SetUp() override {
        initProject();
        folder_.file(u"a");
        folder_.file(u"b");
        ASSERT_THAT(tool({"add", "a", "b"}), SucceedsSilently());
    }

    /// A line with the name of the text, without the number of a line, and with this part.
    auto reports(std::string const& part) const {
        return AllOf(StartsWith(text().string() + ": "), HasSubstr(part));
    }

    /// The line of a file with labels of a category.
    static std::string labelled(std::string const& file, std::string const& category,
                                std::vector<std::string> const& labels) {
        std::string nested;
        for (auto const& label : labels) {
            nested +=
                (nested.empty() ? "" : ",") + (R"({"type":"Label","keys":{"UUID":")" + label + R"("}})");
        }
        return R"({"file":")" + file + R"(","children":[{"type":"Category","keys":{"UUID":")" + category +
               R"("},"children":[)" + nested + "]}]}";
    }

    static constexpr auto beforeTheName = R"({"at":["Info","ProjectData"])";
    static constexpr auto beforeTheEnd = R"({"end":)";
};

TEST_F(CheckCommand, findsNothingInASoundProject) {
    EXPECT_THAT(tool({"check"}), SucceedsSilently());
}

TEST_F(CheckCommand, saysSoOnATerminal) {
    settings_.onTerminal = true;

    EXPECT_EQ(tool({"check"}).output, "The project has no faults.\r\n");
}

TEST_F(CheckCommand, showsTheRemedyOnATerminal) {
    auto const lastLine = [this] { return linesOf(tool({"check"}).output).back(); };
    auto const sound = readText();
    settings_.onTerminal = true;

    writeText(sound + "\"torn");
    EXPECT_EQ(lastLine(), "'projectctl tidy' corrects irregular lines and torn tails.\r");

    insertLineBefore("\"b\"", "nonsense");
    EXPECT_EQ(lastLine(), "'projectctl check --repair' sets damaged lines aside.\r");

    insertLineBefore("\"b\"", "<<<<<<< ours");
    EXPECT_EQ(lastLine(), "'projectctl resolve' resolves the conflicts.\r");

    writeText(sound);
    insertLineBefore(beforeTheName, "\"lost/file\"");
    EXPECT_EQ(lastLine(), "Correct these lines in an editor.\r");
}

TEST_F(CheckCommand, reportsAFileThatDoesNotBelongToTheStore) {
    folder_.file(u".projectdata/displaced-0123456789abcdef.jsonl");

    auto const result = tool({"check"});

    EXPECT_EQ(result.exitCode, 3);
    EXPECT_THAT(linesOf(result.output), ElementsAre(reports("displaced-0123456789abcdef.jsonl")));
}

TEST_F(CheckCommand, reportsEveryFaultOfTheTextWithItsLine) {
    insertLineBefore("\"b\"", "{\"file\":");
    insertLineBefore("\"b\"", "\"a\"");
    writeText(readText() + "\"torn");

    auto const result = tool({"check"});

    EXPECT_EQ(result.exitCode, 3);
    EXPECT_EQ(result.errors, "");
    auto const file = text().string();
    EXPECT_THAT(linesOf(result.output),
                ElementsAre(StartsWith(file + ":3: "), StartsWith(file + ":4: "), StartsWith(file + ":8: ")));
}

TEST_F(CheckCommand, reportsConflictMarkers) {
    auto content = readText();
    content.replace(content.find("\"b\"\n"), 4, "<<<<<<< ours\n\"b\"\n=======\n\"c\"\n>>>>>>> theirs\n");
    writeText(content);

    auto const result = tool({"check"});

    EXPECT_EQ(result.exitCode, 3);
    EXPECT_THAT(result.output, StartsWith(text().string() + ":3: "));
}

TEST_F(CheckCommand, findsEveryAddressWithoutANode) {
    insertLineBefore("\"a\"", R"({"at":["Categories","Root","Category","c1"],"node":false})");
    insertLineBefore("\"a\"", R"({"at":["Categories","Root","Category","c2"]})");
    insertLineBefore("\"a\"", R"({"at":["Categories","Root","Category","c2","Label","l1"],"node":false})");
    insertLineBefore("\"a\"", R"({"at":["EntryPointGroups","Root","EntryPointGroup","g1"],"node":false})");
    insertLineBefore("\"a\"", R"({"at":["EntryPoints","Root","EntryPoint","e1"],"node":false})");
    insertLineBefore(beforeTheEnd, R"({"at":["ProjectPath","Root","Reference","p1"],"node":false})");
    insertLineBefore(beforeTheEnd, R"({"at":["References","Root","Reference","r1"],"node":false})");

    auto const result = tool({"check"});

    EXPECT_EQ(result.exitCode, 3);
    EXPECT_THAT(linesOf(result.output),
                UnorderedElementsAre(reports("category \"c1\""), reports("label \"l1\""),
                                     reports("group \"g1\""), reports("entry point \"e1\""),
                                     reports("reference \"p1\""), reports("reference \"r1\"")));
}

TEST_F(CheckCommand, findsValuesThatNoManagerAccepts) {
    insertLineBefore("\"a\"", R"({"at":["Categories","Root","Category","c"]})");
    for (auto const* state : {"", "READ_ONLY", "WRITABLE", "INHERITED", "Writable", "1"}) {
        insertLineBefore("\"a\"", std::string(R"({"at":["Categories","Root","Category","c","Label","l)") +
                                      state + R"("],"keys":{"ReadOnly":")" + state + R"("}})");
    }
    for (auto const* type :
         {"Basic", "Startup", "StartUp", "Shutdown", "Batch_Job", "Batch Job", "batch", ""}) {
        insertLineBefore("\"a\"", std::string(R"({"at":["EntryPoints","Root","EntryPoint","e)") + type +
                                      R"("],"keys":{"File":"a","Type":")" + type + R"("}})");
    }
    tool({"tidy"});

    auto const result = tool({"check"});

    EXPECT_EQ(result.exitCode, 3);
    EXPECT_THAT(linesOf(result.output),
                UnorderedElementsAre(reports("label \"lWritable\""), reports("label \"l1\""),
                                     reports("entry point \"ebatch\""), reports("entry point \"e\""),
                                     reports("the file \"a\" has 8 entry points")));
}

TEST_F(CheckCommand, findsFilesWhoseFolderIsNotInTheProject) {
    insertLineBefore(beforeTheName, "\"lost/deep/file\"");

    auto const result = tool({"check"});

    EXPECT_EQ(result.exitCode, 3);
    EXPECT_THAT(linesOf(result.output), ElementsAre(reports("\"lost/deep/file\"")));
}

TEST_F(CheckCommand, findsSuchFilesInOtherScopesToo) {
    insertLineBefore("\"a\"", R"({"at":["Files","Notes","File","lost","File","file"]})");

    auto const result = tool({"check"});

    EXPECT_EQ(result.exitCode, 3);
    EXPECT_THAT(linesOf(result.output), ElementsAre(reports("\"lost/file\"")));
}

TEST_F(CheckCommand, findsNamesThatNoFileCanHave) {
    insertLineBefore("\"a\"", R"({"at":["Files","Root","File","\u0000"]})");
    insertLineBefore("\"a\"", R"("..")");
    insertLineBefore("\"a\"", R"({"at":["Files","Root","File","a/b"]})");
    insertLineBefore("\"a\"", R"({"at":["Files","Root","File","."]})");
    insertLineBefore("\"a\"", R"({"at":["Files","Root","File",""]})");
    tool({"tidy"});

    auto const result = tool({"check"});

    EXPECT_EQ(result.exitCode, 3);
    EXPECT_THAT(linesOf(result.output),
                UnorderedElementsAre(reports("name \"\\000\""), reports("name \"..\""),
                                     reports("name \"a/b\""), reports("name \".\""), reports("name \"\"")));
}

TEST_F(CheckCommand, notesANameWithABackslash) {
    folder_.addFile("sub\\folder/file");
    folder_.addFile("back\\slash");
    ASSERT_THAT(tool({"add", "sub\\folder/file", "back\\slash"}), SucceedsSilently());

    auto const result = tool({"check"});

    EXPECT_EQ(result.exitCode, 0);
    EXPECT_THAT(linesOf(result.output),
                UnorderedElementsAre(reports(R"(note: "back\slash" has a backslash in its name)"),
                                     reports(R"(note: "sub\folder" has a backslash in its name)")));
    EXPECT_THAT(linesOf(tool({"status"}).output),
                UnorderedElementsAre(StartsWith(R"(note "back\slash" has a backslash in its name)"),
                                     StartsWith(R"(note "sub\folder" has a backslash in its name)")));
}

TEST_F(CheckCommand, findsLabelsOnFilesThatDoNotExist) {
    insertLineBefore("\"a\"", R"({"at":["Categories","Root","Category","c"]})");
    insertLineBefore("\"a\"", R"({"at":["Categories","Root","Category","c","Label","known"]})");
    insertLineBefore(beforeTheName, labelled("c1", "c", {"known"}));
    insertLineBefore(beforeTheName, labelled("c2", "c", {"unknown"}));
    insertLineBefore(beforeTheName, labelled("c3", "gone", {"known"}));

    auto const result = tool({"check"});

    EXPECT_EQ(result.exitCode, 3);
    EXPECT_THAT(linesOf(result.output), ElementsAre(AllOf(reports("\"c2\""), HasSubstr("\"unknown\"")),
                                                    AllOf(reports("\"c3\""), HasSubstr("\"gone\""))));
}

TEST_F(CheckCommand, acceptsOnlyCategoriesAndLabelsAsSuch) {
    insertLineBefore("\"a\"", R"({"at":["Categories","Root","Category","c"]})");
    insertLineBefore("\"a\"", R"({"at":["Categories","Root","Category","c","Mark","l"]})");
    insertLineBefore("\"a\"", R"({"at":["Categories","Root","Group","g"]})");
    insertLineBefore(beforeTheName, labelled("c1", "c", {"l"}));
    insertLineBefore(beforeTheName, labelled("c2", "g", {"l"}));

    auto const result = tool({"check"});

    EXPECT_EQ(result.exitCode, 3);
    EXPECT_THAT(linesOf(result.output), ElementsAre(AllOf(reports("\"c1\""), HasSubstr("label \"l\"")),
                                                    AllOf(reports("\"c2\""), HasSubstr("category \"g\""))));
}

TEST_F(CheckCommand, findsLabelsThatAFileHasTooOften) {
    insertLineBefore("\"a\"", R"({"at":["Categories","Root","Category","many"]})");
    insertLineBefore("\"a\"", R"({"at":["Categories","Root","Category","many","Label","l"]})");
    insertLineBefore("\"a\"", R"({"at":["Categories","Root","Category","one"],"keys":{"SingleValued":"1"}})");
    insertLineBefore("\"a\"", R"({"at":["Categories","Root","Category","one","Label","l"]})");
    insertLineBefore(beforeTheName, labelled("c1", "many", {"l", "l"}));
    insertLineBefore(beforeTheName, labelled("c2", "one", {"l"}));
    insertLineBefore(beforeTheName, labelled("c3", "one", {"l", "l"}));

    auto const result = tool({"check"});

    EXPECT_EQ(result.exitCode, 3);
    EXPECT_THAT(linesOf(result.output),
                ElementsAre(AllOf(reports("\"c3\""), HasSubstr("has 2 labels")), // the worst first
                            AllOf(reports("note: "), HasSubstr("\"c1\" has the label"))));
}

TEST_F(CheckCommand, acceptsDataOfFilesThatNoReaderUses) {
    insertLineBefore("\"a\"", R"({"at":["Categories","Root","Category","c"]})");
    for (auto const* nested : {R"({"type":"Note","keys":{"UUID":"gone"}})", R"({"type":"Category"})",
                               R"({"type":"Category","keys":{"UUID":"c"},"children":[{"type":"Label"}]})",
                               R"({"type":"Category","keys":{"UUID":"c"},)"
                               R"("children":[{"type":"Mark","keys":{"UUID":"gone"}}]})"}) {
        auto const before = readText();
        insertLineBefore(beforeTheName, std::string(R"({"file":"c1","children":[)") + nested + "]}");

        EXPECT_THAT(tool({"check"}), SucceedsSilently()) << nested;
        writeText(before);
    }
}

TEST_F(CheckCommand, onlyNotesUnknownData) {
    insertLineBefore("\"a\"",
                     R"({"at":["EntryPoints","Root","EntryPoint","e"],"keys":{"File":"no","Type":"Basic"}})");
    insertLineBefore(beforeTheEnd, R"({"at":["References","Root","Reference","r"],"keys":{"Type":"Cloud"}})");
    insertLineBefore(beforeTheEnd, R"({"at":["Simulation","Root"],"keys":{"Solver":"x"}})");

    auto const result = tool({"check"});

    EXPECT_EQ(result.exitCode, 0);
    EXPECT_THAT(linesOf(result.output),
                UnorderedElementsAre(reports("note: this version does not use the data at (\"Simulation\""),
                                     reports("note: the entry point \"e\""),
                                     reports("note: the reference \"r\"")));
}

TEST_F(CheckCommand, setsDamagedLinesAsideWithRepair) {
    insertLineBefore("\"b\"", "{\"file\":");

    auto const result = tool({"check", "--repair"});

    EXPECT_EQ(result.exitCode, 0);
    EXPECT_EQ(result.errors, "");
    auto const lines = linesOf(result.output);
    ASSERT_THAT(lines,
                ElementsAre(AllOf(StartsWith("the damaged lines are now in "), HasSubstr("damaged-"))));
    std::ifstream aside(lines[0].substr(lines[0].find('/')));
    std::string damaged;
    std::getline(aside, damaged);
    EXPECT_EQ(damaged, "{\"file\":");
    EXPECT_THAT(tool({"check"}), SucceedsSilently());
    EXPECT_THAT(list(), ElementsAre("a", "b"));
}

TEST_F(CheckCommand, repairsNothingInASoundProject) {
    auto const before = readText();

    EXPECT_THAT(tool({"check", "--repair"}), SucceedsSilently());

    EXPECT_EQ(readText(), before);
}

TEST_F(CheckCommand, doesNotRepairConflicts) {
    insertLineBefore("\"b\"", "<<<<<<< ours");

    EXPECT_THAT(tool({"check", "--repair"}), FailsWith(6, text().string() + ":3: "));
}

/// A project with a fault and a note: a label that does not exist, and a reference that cannot be followed.
class CheckForms : public ToolTest {
protected:
    void SetUp() override {
        initProject();
        folder_.file(u"a");
        folder_.folder(u"gone");
        ASSERT_EQ(tool({"batch"}, "add a\ncategory create Status\nlabel create Status Open\n"
                                  "label put Status Open a\nreference add gone\n")
                      .exitCode,
                  0);
        folder_.remove(u"gone");
        auto content = readText();
        auto const label = content.find("\"Label\",\"keys\":{\"UUID\":\"") + 24;
        ASSERT_NE(content.find("\"file\":\"a\""), std::string::npos);
        writeText(content.replace(label, 36, "lost"));
    }

    /// The number of the line that contains a text.
    std::string lineOf(std::string const& text) const {
        auto const content = readText();
        auto const end = content.begin() + static_cast<std::ptrdiff_t>(content.find(text));
        return std::to_string(std::count(content.begin(), end, '\n') + 1);
    }
};

TEST_F(CheckForms, gccShowsTheLineTheWeightAndTheCodeTheWorstFirst) {
    auto const result = tool({"check", "--format", "gcc"});

    EXPECT_EQ(result.exitCode, 3);
    auto const lines = linesOf(result.output);
    ASSERT_EQ(lines.size(), 2U) << result.output;
    EXPECT_EQ(lines[0],
              ".projectdata/project.jsonl:" + lineOf("\"file\":\"a\"") +
                  ": error: the file \"a\" has the label \"lost\" of the category \"Status\", which "
                  "does not exist [label-missing]");
    EXPECT_THAT(lines[1],
                ::testing::StartsWith(".projectdata/project.jsonl:" + lineOf("\"Ref\"") + ": note: "));
    EXPECT_THAT(lines[1], ::testing::EndsWith("[reference-folder-missing]"));
}

TEST_F(CheckForms, gitHubGetsOneCommandForEachFinding) {
    auto const result = tool({"check", "--format", "github"});

    EXPECT_EQ(result.exitCode, 3);
    auto const lines = linesOf(result.output);
    ASSERT_EQ(lines.size(), 2U) << result.output;
    EXPECT_EQ(lines[0], "::error file=.projectdata/project.jsonl,line=" + lineOf("\"file\":\"a\"") +
                            ",title=label-missing::the file \"a\" has the label \"lost\" of the category "
                            "\"Status\", which does not exist");
    EXPECT_THAT(lines[1], ::testing::StartsWith("::notice file=.projectdata/project.jsonl,line="));
}

TEST_F(CheckForms, gitHubGetsSpecialCharactersEscaped) {
    folder_.addFile("100%\nsure");
    ASSERT_EQ(tool({"batch"}, "add '100%\nsure'\nentry set '100%\nsure'\n").exitCode, 0);
    std::filesystem::remove(inFolder("100%\nsure"));

    EXPECT_THAT(tool({"check", "--format", "github"}).output, ::testing::HasSubstr("\"100%25%0Asure\""));
}

TEST_F(CheckForms, jsonHasCodePathLineAndSentenceRelativeToTheRoot) {
    std::filesystem::create_directory(inFolder("below"));
    auto const result = toolFrom("below", {"check", "--json"});

    EXPECT_EQ(result.exitCode, 3);
    EXPECT_THAT(
        result.output,
        ::testing::HasSubstr("{\"code\": \"label-missing\", \"fault\": true, \"path\": \"a\", \"line\": " +
                             lineOf("\"file\":\"a\"") + ", \"text\": \"the file \\\"a\\\" has"));
    EXPECT_THAT(tool({"status", "--json"}).output, ::testing::HasSubstr("{\"code\": \"label-missing\""));
}

TEST_F(CheckForms, refuseAnUnknownFormat) {
    EXPECT_THAT(tool({"check", "--format", "xml"}), FailsWith(2, "The formats are text, gcc and github"));
    EXPECT_THAT(tool({"check", "--format", "gcc", "--json"}), FailsInJsonWith(2, "excludes"));
}

} // namespace
} // namespace project::test
