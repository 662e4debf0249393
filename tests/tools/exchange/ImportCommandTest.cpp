#include "tools/labels/LabelToolTest.hpp"

namespace project::test {
namespace {

using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::UnorderedElementsAre;

/// A project with the files "a", "b" and "c", and a file "new" that is not in it.
class ImportCommand : public LabelToolTest {
protected:
    void SetUp() override {
        LabelToolTest::SetUp();
        folder_.addFile("new");
    }

    std::vector<std::string> errorLines(ProgramResult const& result) const { return linesOf(result.errors); }

    /// Expects that a second import succeeds and changes nothing.
    void expectNoFurtherChange(std::vector<std::string> const& command, std::string_view input = {}) const {
        auto const before = readText();
        EXPECT_THAT(tool(command, input), SucceedsSilently());
        EXPECT_EQ(readText(), before);
    }

    void git(std::vector<std::string> arguments) const {
        arguments.insert(arguments.begin(),
                         {"/usr/bin/git", "-c", "user.name=Ada", "-c", "user.email=ada@x.org"});
        ASSERT_EQ(runProgram(arguments, settings_).exitCode, 0);
    }
};

TEST_F(ImportCommand, addsFilesAndLabelsOfATable) {
    std::string const table = "path,category,label,data\r\n"
                              "new,Status,Open,\r\n"
                              "a,Status,Open,\r\n"
                              "a,Status,\"two \"\"words\"\"\",\r\n"
                              "b,Note,Text,\"1,\n2\"\r\n";

    EXPECT_THAT(tool({"import", "csv"}, table), SucceedsSilently());

    EXPECT_THAT(list(), ElementsAre("a", "b", "c", "new"));
    EXPECT_THAT(tool({"label", "show", "a"}), Prints("Status: Open\nStatus: two \"words\"\n"));
    EXPECT_THAT(tool({"label", "show", "b"}), Prints("Note: Text = 1,\n2\n"));
    EXPECT_THAT(tool({"category", "list"}), Prints("Note (type String)\nStatus\n"));
    expectNoFurtherChange({"import", "csv"}, table);
}

TEST_F(ImportCommand, acceptsColumnsInAnyOrderAndAByteOrderMark) {
    EXPECT_THAT(tool({"import", "csv", "-"}, "\xEF\xBB\xBFlabel,path,category\nOpen,a,Status\n\n"),
                SucceedsSilently());

    EXPECT_THAT(tool({"label", "show", "a"}), Prints("Status: Open\n"));
}

TEST_F(ImportCommand, listsItemsThatCannotBeInTheProjectWithTheirLines) {
    ASSERT_THAT(tool({"category", "create", "One", "--single-valued"}), SucceedsSilently());
    folder_.addFile("table.csv", "path,category,label,data\n"
                                 "gone,,,\n"
                                 "../outside,,,\n"
                                 "/tmp,,,\n"
                                 ".projectdata/project.jsonl,,,\n"
                                 "a,One,first,\n"
                                 "a,One,second,\n"
                                 "a,One,first,data\n"
                                 "a,,,data\n"
                                 "\"a\n\",One\n"
                                 "new,,,\n");

    auto const result = tool({"import", "csv", "table.csv"});

    EXPECT_EQ(result.exitCode, 3);
    EXPECT_THAT(
        errorLines(result),
        ElementsAre("projectctl: table.csv:2: \"gone\" does not exist",
                    "projectctl: table.csv:3: \"../outside\" is not a path below the root",
                    "projectctl: table.csv:4: \"/tmp\" is not a path below the root",
                    HasSubstr("table.csv:5: \".projectdata/project.jsonl\" belongs to the project's store"),
                    HasSubstr("table.csv:7: the category \"One\" allows one label per file"),
                    HasSubstr("table.csv:8: \"data\" is not data of the type \"None\""),
                    HasSubstr("table.csv:9: data needs a category and a label"),
                    HasSubstr("table.csv:10: 2 fields instead of 4")));
    EXPECT_THAT(tool({"label", "show", "a"}), Prints("One: first\n"));
    EXPECT_THAT(list(), ElementsAre("a", "b", "c", "new"));
}

TEST_F(ImportCommand, changesNothingIfTheDataIsNotOfTheForm) {
    auto const before = readText();

    EXPECT_THAT(tool({"import", "csv"}, "path\nnew\n\"b\n"), FailsWith(1, "line 3: a quote is not closed"));
    EXPECT_THAT(tool({"import", "csv"}, "path\nnew\nb\"\n"),
                FailsWith(1, "line 3: a quote is in a field without"));
    EXPECT_THAT(tool({"import", "csv"}, "path\n\"b\"c\n"),
                FailsWith(1, "line 2: text follows a field in quotes"));
    EXPECT_THAT(tool({"import", "csv"}, "path,size\n"), FailsWith(1, "\"size\" is not a column"));
    EXPECT_THAT(tool({"import", "csv"}, ""), FailsWith(1, "the first line must name the column path"));
    EXPECT_THAT(tool({"import", "csv", "none"}), FailsWith(1, "\"none\" cannot be read"));
    EXPECT_THAT(tool({"import", "compile-commands", "-"}, "{}"), FailsWith(1, "not a compilation database"));
    EXPECT_THAT(tool({"import", "compile-commands", "-"}, "[[]]"),
                FailsWith(1, "not a compilation database"));
    EXPECT_THAT(tool({"import", "compile-commands", "-"}, "1"), FailsWith(1, "not a compilation database"));
    EXPECT_THAT(tool({"import", "codeowners"}), FailsWith(1, "there is no file CODEOWNERS"));
    EXPECT_THAT(tool({"import", "git"}), FailsWith(1, "git cannot list its files"));

    EXPECT_EQ(readText(), before);
}

TEST_F(ImportCommand, showsTheChangesWithDryRun) {
    auto const before = readText();

    auto const result =
        tool({"import", "csv", "--dry-run"}, "path,category,label\nnew,Status,Open\ngone,,\n");

    EXPECT_THAT(result.output, HasSubstr("add new\n"));
    EXPECT_THAT(result.errors, HasSubstr("-:3: \"gone\" does not exist"));
    EXPECT_EQ(result.exitCode, 3);
    EXPECT_EQ(readText(), before);
}

TEST_F(ImportCommand, readsJsonLines) {
    std::string const lines = "{\"path\": \"new\", \"kind\": \"file\"}\n\n"
                              "{\"data\": \"d\", \"label\": \"L\", \"category\": \"C\", \"path\": \"a\"}\n";

    EXPECT_THAT(tool({"import", "jsonl"}, lines), SucceedsSilently());

    EXPECT_THAT(list(), ElementsAre("a", "b", "c", "new"));
    EXPECT_THAT(tool({"label", "show", "a"}), Prints("C: L = d\n"));
    expectNoFurtherChange({"import", "jsonl"}, lines);
}

TEST_F(ImportCommand, listsLinesThatAreNotSuchObjects) {
    auto const result = tool({"import", "jsonl"},
                             "[]\n{\"path\": 1}\n{\"path\": \"new\"}\n{\"path\": \"a\", \"path\": \"b\"}\n"
                             "{\"label\": \"x\"}\n{");

    EXPECT_EQ(result.exitCode, 3);
    EXPECT_THAT(errorLines(result),
                ElementsAre(HasSubstr("-:1: not an object"), HasSubstr("-:2: not an object"),
                            HasSubstr("-:4: the object has two members \"path\""),
                            HasSubstr("-:5: \"\" is not a path"), HasSubstr("-:6: not an object")));
    EXPECT_THAT(list(), ElementsAre("a", "b", "c", "new"));
}

TEST_F(ImportCommand, addsTheFilesThatGitTracks) {
    git({"init", "-q"});
    folder_.addFile("src/caf\xE9\n");
    folder_.addFile("deleted");
    git({"add", "a", "deleted", "src", ".projectdata"});
    folder_.remove(u"deleted");

    auto const result = tool({"import", "git"});

    EXPECT_EQ(result.exitCode, 3);
    EXPECT_THAT(errorLines(result), ElementsAre("projectctl: git: \"deleted\" does not exist"));
    EXPECT_THAT(tool({"list", "-0"}), Prints(withZeros({"a", "b", "c", "src", "src/caf\xE9\n"})));
}

TEST_F(ImportCommand, addsTheFilesOfACompilationDatabaseWithTheirTargets) {
    folder_.addFile("src/main.cpp");
    auto const root = folder_.onDisk().string();
    folder_.addFile("compile_commands.json",
                    "[\n{\"directory\": \"" + root +
                        "/build\", \"file\": \"../src/main.cpp\",\n"
                        " \"command\": \"c++ -o src/CMakeFiles/engine.dir/main.cpp.o -c x\"},\n"
                        "{\"directory\": \"" +
                        root +
                        "\", \"file\": \"a\", \"arguments\": [\"cc\", \"-o\", \"obj/a.o\"]},\n"
                        "{\"directory\": \"" +
                        root +
                        "\", \"file\": \"b\", \"output\": \"b.o\"},\n"
                        "{\"directory\": \"" +
                        root +
                        "\", \"file\": \"gone\"},\n"
                        "{\"file\": \"a\"}]\n");

    auto const result = tool({"import", "compile-commands"});

    EXPECT_EQ(result.exitCode, 3);
    EXPECT_THAT(errorLines(result),
                ElementsAre("projectctl: compile_commands.json:6: \"gone\" does not exist",
                            HasSubstr("compile_commands.json:7: the entry has no file, or no")));
    EXPECT_THAT(tool({"label", "show", "src/main.cpp"}), Prints("Target: src/engine\n"));
    EXPECT_THAT(tool({"label", "show", "a"}), Prints("Target: obj\n"));
    EXPECT_THAT(tool({"label", "show", "b"}), SucceedsSilently());
}

TEST_F(ImportCommand, leavesOutCompiledFilesThatGitIgnores) {
    git({"init", "-q"});
    folder_.addFile(".gitignore", "build\n");
    folder_.addFile("build/generated.cpp");
    auto const entry = "{\"directory\": \"" + folder_.onDisk().string() + "\", \"file\": ";

    EXPECT_THAT(tool({"import", "compile-commands", "-"},
                     '[' + entry + "\"new\"}," + entry + "\"build/generated.cpp\"}]"),
                SucceedsSilently());

    EXPECT_THAT(list(), ElementsAre("a", "b", "c", "new"));
}

TEST_F(ImportCommand, putsTheOwnersOfTheLastPatternOnFiles) {
    folder_.addFile("docs/x.md");
    ASSERT_THAT(tool({"add", "-r", "docs"}), SucceedsSilently());
    folder_.addFile("CODEOWNERS", "# everything\n* @all\n/docs/ @docs ann@x.org # both\n\nb\n/c @x bad\n");

    auto const result = tool({"import", "codeowners"});

    EXPECT_EQ(result.exitCode, 3);
    EXPECT_THAT(errorLines(result), ElementsAre(HasSubstr("CODEOWNERS:6: \"bad\" is not an owner")));
    EXPECT_THAT(tool({"label", "show", "a"}), Prints("Owner: @all\n"));
    EXPECT_THAT(tool({"label", "show", "b"}), SucceedsSilently());
    EXPECT_THAT(tool({"label", "show", "c"}), Prints("Owner: @all\n"));
    EXPECT_THAT(linesOf(tool({"label", "show", "docs/x.md"}).output),
                UnorderedElementsAre("Owner: @docs", "Owner: ann@x.org"));
    EXPECT_THAT(tool({"label", "show", "docs"}), SucceedsSilently());
}

TEST_F(ImportCommand, ofTheSameFilesTargetsAndOwnersChangesNothing) {
    git({"init", "-q"});
    folder_.addFile("src/new.cpp");
    git({"add", "a", "src"});
    folder_.addFile("CODEOWNERS", "* @all\n/src/ @src ann@x.org\n");
    folder_.addFile("compile_commands.json",
                    "[{\"directory\": \"" + folder_.onDisk().string() +
                        "\", \"file\": \"src/new.cpp\", \"output\": \"obj/new.o\"}]");

    for (auto const* const form : {"git", "compile-commands", "codeowners"}) {
        auto const before = readText();
        EXPECT_THAT(tool({"import", form}), SucceedsSilently()) << form;
        EXPECT_NE(readText(), before) << form;
        expectNoFurtherChange({"import", form}, {});
    }
}

TEST_F(ImportCommand, keepsTheLabelsOfFoldersAboveAddedFiles) {
    folder_.addFile("dir/one");
    folder_.addFile("dir/two");
    ASSERT_THAT(tool({"add", "dir/one"}), SucceedsSilently());
    createLabelled("Status", "Open", "dir");

    EXPECT_THAT(tool({"import", "csv"}, "path\ndir/two\n"), SucceedsSilently());

    EXPECT_THAT(tool({"label", "show", "dir"}), Prints("Status: Open\n"));
}

} // namespace
} // namespace project::test
