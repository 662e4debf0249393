#include <csignal>

#include "tools/ToolTest.hpp"

namespace project::test {
namespace {

using ::testing::AllOf;
using ::testing::HasSubstr;
using ::testing::Not;

/// A project that is used from its folder "src/io".
class ShownPaths : public ToolTest {
protected:
    void SetUp() override {
        initProject();
        for (auto const* name : {u"readme", u"docs/guide", u"src/main.cpp", u"src/io/pump.cpp"}) {
            folder_.file(name);
        }
        ASSERT_THAT(tool({"add", "-r", "."}), SucceedsSilently());
        settings_.folder /= "src/io";
    }

    /// Creates the category "Status" with the label "Open", and puts that on files.
    void label(std::vector<std::string> files) const {
        ASSERT_THAT(tool({"category", "create", "Status"}), SucceedsSilently());
        ASSERT_THAT(tool({"label", "create", "Status", "Open"}), SucceedsSilently());
        files.insert(files.begin(), {"label", "put", "Status", "Open"});
        ASSERT_THAT(tool(std::move(files)), SucceedsSilently());
    }

    /// Runs a line of the shell, in which `projectctl` is the tool.
    ProgramResult shell(std::string const& line) const {
        return RunningProgram({"sh", "-c", "projectctl() { " PROJECTCTL " \"$@\"; }; " + line}, settings_)
            .finish();
    }

    /// The same for a pipe from the tool to the tool, by way of xargs.
    ProgramResult pipe(std::string const& from, std::string const& to) const {
        return shell("projectctl " + from + " | xargs -0 " PROJECTCTL " " + to);
    }
};

TEST_F(ShownPaths, areRelativeToTheCurrentFolder) {
    EXPECT_THAT(tool({"list"}),
                Prints("../../docs\n../../docs/guide\n../../readme\n..\n.\npump.cpp\n../main.cpp\n"));
    EXPECT_THAT(tool({"list", ".."}), Prints("..\n.\npump.cpp\n../main.cpp\n"));
    EXPECT_THAT(toolFrom("../../docs", {"list", "."}), Prints(".\nguide\n"));
}

TEST_F(ShownPaths, areRelativeToTheRootWithFullName) {
    auto const all = "docs\ndocs/guide\nreadme\nsrc\nsrc/io\nsrc/io/pump.cpp\nsrc/main.cpp\n";

    EXPECT_THAT(tool({"list", "--full-name"}), Prints(all));
    EXPECT_THAT(tool({"--full-name", "list"}), Prints(all));
    EXPECT_THAT(tool({"list", "--full-name", "."}), Prints("src/io\nsrc/io/pump.cpp\n"));
}

TEST_F(ShownPaths, areRelativeToTheRootInJson) {
    EXPECT_THAT(tool({"list", "--json", "."}),
                Prints(document("list", "files",
                                {"{\"path\": \"src/io\", \"kind\": \"folder\"}",
                                 "{\"path\": \"src/io/pump.cpp\", \"kind\": \"file\"}"})));
}

TEST_F(ShownPaths, beginEachTreeOfAList) {
    EXPECT_THAT(tool({"list", "--tree"}),
                Prints("../../docs/\n  guide\n../../readme\n../\n  io/\n    pump.cpp\n  main.cpp\n"));
    EXPECT_THAT(tool({"list", "--tree", "."}), Prints("./\n  pump.cpp\n"));
    EXPECT_THAT(tool({"list", "--tree", "--full-name", "."}), Prints("src/io/\n  pump.cpp\n"));
}

TEST_F(ShownPaths, areThoseOfStatus) {
    folder_.file(u"src/new");
    folder_.file(u"src/io/more/new");
    folder_.remove(u"readme");

    EXPECT_THAT(tool({"status"}), Prints("new  more/\nnew  ../new\ngone ../../readme\n"));
    EXPECT_THAT(tool({"status", "--full-name"}), Prints("new  src/io/more/\nnew  src/new\ngone readme\n"));
    EXPECT_THAT(tool({"status", "--json"}).output, AllOf(HasSubstr("\"src/new\""), HasSubstr("\"readme\"")));
}

TEST_F(ShownPaths, nameACurrentFolderThatIsNotInTheProject) {
    folder_.file(u"new/inner/file");
    settings_.folder = folder_.onDisk() / "new/inner";

    EXPECT_THAT(tool({"status"}), Prints("new  ../\n"));
}

TEST_F(ShownPaths, areThoseOfProblemsInTheDefinition) {
    label({"../main.cpp"});
    ASSERT_THAT(tool({"entry", "set", "pump.cpp"}), SucceedsSilently());
    ASSERT_THAT(tool({"path", "add", "../../docs"}), SucceedsSilently());
    auto content = readText();
    auto const known = content.find("\"Label\",\""); // the address of the label in its category
    writeText(content.replace(known + 9, 1, "x"));
    folder_.remove(u"src/io/pump.cpp");
    folder_.remove(u"docs");

    for (auto const* command : {"status", "check"}) {
        EXPECT_THAT(tool({command}).output,
                    AllOf(HasSubstr("the file \"../main.cpp\" "), HasSubstr("of the file \"pump.cpp\" "),
                          HasSubstr("the reference \"../../docs\" in the project path")));
        EXPECT_THAT(tool({command, "--full-name"}).output,
                    AllOf(HasSubstr("the file \"src/main.cpp\" "),
                          HasSubstr("of the file \"src/io/pump.cpp\" "),
                          HasSubstr("the reference \"docs\" in the project path")));
    }
    EXPECT_THAT(tool({"status", "--json"}).output,
                AllOf(HasSubstr("the file \\\"src/main.cpp\\\" "),
                      HasSubstr("of the file \\\"src/io/pump.cpp\\\" "),
                      HasSubstr("the reference \\\"docs\\\" in the project path")));
}

TEST_F(ShownPaths, areThoseOfLabels) {
    label({".", "../../readme"});

    EXPECT_THAT(tool({"label", "find", "Status"}), Prints("../../readme\n.\n"));
    EXPECT_THAT(tool({"label", "find", "Status", "--full-name"}), Prints("readme\nsrc/io\n"));
    EXPECT_THAT(tool({"label", "find", "Status", "--json"}).output, HasSubstr("{\"path\": \"src/io\""));
    EXPECT_THAT(tool({"label", "show", ".", "../../readme"}),
                Prints(".: Status: Open\n../../readme: Status: Open\n"));
    EXPECT_THAT(tool({"label", "show", ".", "../../readme", "--full-name"}),
                Prints("src/io: Status: Open\nreadme: Status: Open\n"));
    EXPECT_THAT(tool({"label", "show", ".", "--json"}).output, HasSubstr("{\"path\": \"src/io\""));
}

TEST_F(ShownPaths, areThoseOfEntryPoints) {
    ASSERT_THAT(tool({"entry", "set", "../main.cpp"}), SucceedsSilently());

    EXPECT_THAT(tool({"entry", "list"}), Prints("../main.cpp: Basic, main\n"));
    EXPECT_THAT(tool({"entry", "list", "--full-name"}), Prints("src/main.cpp: Basic, main\n"));
    EXPECT_THAT(tool({"entry", "list", "--json"}).output, HasSubstr("{\"path\": \"src/main.cpp\""));
    EXPECT_THAT(tool({"entry", "show", "pump.cpp"}), FailsWith(1, "\"pump.cpp\" is not an entry point"));
}

TEST_F(ShownPaths, areThoseOfReferences) {
    ASSERT_THAT(tool({"path", "add", "../..", "."}), SucceedsSilently());
    ASSERT_THAT(tool({"reference", "add", "../../.."}), SucceedsSilently());
    ASSERT_THAT(tool({"reference", "add", "--absolute", "../../docs"}), SucceedsSilently());

    EXPECT_THAT(tool({"path", "list"}), Prints("../..\n.\n"));
    EXPECT_THAT(tool({"path", "list", "--full-name"}), Prints(".\nsrc/io\n"));
    EXPECT_THAT(tool({"path", "list", "--json"}).output, HasSubstr("{\"path\": \"src/io\""));
    EXPECT_THAT(tool({"reference", "list"}), Prints("../../..\n" + inFolder("docs") + "\n"));
    EXPECT_THAT(tool({"reference", "list", "--full-name"}), Prints("..\n" + inFolder("docs") + "\n"));
}

TEST_F(ShownPaths, areThoseOfEvents) {
    RunningProgram watching(commandFor({"watch"}), settings_);
    RunningProgram watchingJson(commandFor({"watch", "--json"}), settings_);
    ASSERT_TRUE(watching.waitUntilItSleeps());
    ASSERT_TRUE(watchingJson.waitUntilItSleeps());
    ASSERT_EQ(watching.readLine(), "ready\t2");
    ASSERT_THAT(watchingJson.readLine(), HasSubstr("\"ready\""));

    ASSERT_THAT(tool({"remove", "../main.cpp", "."}), SucceedsSilently());

    EXPECT_EQ(watching.readLine(), "fileListUpdate\t.\tpump.cpp\t../main.cpp");
    EXPECT_EQ(watchingJson.readLine(), "{\"event\": \"fileListUpdate\", \"files\": "
                                       "[\"src/io\", \"src/io/pump.cpp\", \"src/main.cpp\"]}");
}

TEST_F(ShownPaths, areThoseOfMessages) {
    folder_.file(u"..config");

    EXPECT_EQ(
        tool({"add", "-r", "../.."}).errors,
        "projectctl: left out \"../../..config\": a name that begins with two dots cannot be added from "
        "the project's root\n");
    EXPECT_THAT(tool({"list", "no"}), FailsWith(1, '"' + inFolder("src/io/no") + '"')); // errors are absolute
}

/// Names that a shell, a terminal or the tool could take for something else.
class PipedPaths : public ShownPaths {
protected:
    void SetUp() override {
        ShownPaths::SetUp();
        for (auto const& name : names_) {
            folder_.addFile("src/io" + ("/" + name));
            folder_.addFile("other/" + name);
        }
        ASSERT_THAT(tool({"add", "-r", "../.."}), SucceedsSilently());
    }

    /// As they are listed in a folder.
    std::string namesIn(std::string const& folder) const {
        std::string result;
        for (auto const& name : names_) {
            result += folder + name + '\0';
        }
        return result;
    }

    std::vector<std::string> const names_{" space ", "\"quoted\"", "-x", "line\nbreak", "tab\t", "\xFF"};
};

TEST_F(PipedPaths, ofListAreArguments) {
    EXPECT_THAT(tool({"list", "-0", "../../other"}),
                Prints(std::string("../../other") + '\0' + namesIn("../../other/")));

    EXPECT_THAT(pipe("list -0 .", "remove --"), SucceedsSilently());
    EXPECT_THAT(pipe("list -0 ../../other", "remove --"), SucceedsSilently());

    EXPECT_THAT(tool({"list", "--full-name"}), Prints("docs\ndocs/guide\nreadme\nsrc\nsrc/main.cpp\n"));
}

TEST_F(PipedPaths, ofListAreStandardInput) {
    EXPECT_THAT(shell("projectctl list -0 ../../other | projectctl remove -0"), SucceedsSilently());

    EXPECT_THAT(tool({"list", "../../other"}), FailsWith(1, "is not in the project"));
    EXPECT_THAT(tool({"list", "-0"}).output, HasSubstr("/main.cpp"));
}

TEST_F(PipedPaths, ofLabelFindAreArguments) {
    label({"."});
    ASSERT_THAT(pipe("list -0 ../../other", "label put Status Open --"), SucceedsSilently());
    ASSERT_THAT(pipe("list -0 .", "label put Status Open --"), SucceedsSilently());
    EXPECT_THAT(tool({"label", "find", "Status", "Open", "-0"}).output, HasSubstr(namesIn("../../other/")));

    EXPECT_THAT(pipe("label find Status Open -0", "label take Status Open --"), SucceedsSilently());

    EXPECT_THAT(tool({"label", "find", "Status"}), SucceedsSilently());
}

TEST_F(PipedPaths, ofEntryListAreArguments) {
    for (auto const& name : names_) {
        ASSERT_THAT(tool({"entry", "set", "--", name}), SucceedsSilently());
        ASSERT_THAT(tool({"entry", "set", "../../other/" + name}), SucceedsSilently());
    }
    EXPECT_THAT(tool({"entry", "list", "-0"}), Prints(namesIn("../../other/") + namesIn("")));

    EXPECT_THAT(pipe("entry list -0", "entry remove --"), SucceedsSilently());

    EXPECT_THAT(tool({"entry", "list"}), SucceedsSilently());
}

TEST_F(PipedPaths, ofReferencesAreArguments) {
    for (auto const& name : names_) {
        folder_.addFolder("src/io/folder" + name);
        folder_.addFolder("other/folder" + name);
        for (auto const* list : {"path", "reference"}) {
            ASSERT_THAT(tool({list, "add", "folder" + name, "../../other/folder" + name}),
                        SucceedsSilently());
        }
    }
    ASSERT_THAT(tool({"reference", "add", "--absolute", "../../docs"}), SucceedsSilently());

    for (auto const* list : {"path", "reference"}) {
        EXPECT_THAT(tool({list, "list", "-0"}).output,
                    HasSubstr("../../other/folder" + names_.back() + '\0'));
        EXPECT_THAT(pipe(std::string(list) + " list -0", std::string(list) + " remove"), SucceedsSilently());
        EXPECT_THAT(tool({list, "list"}), SucceedsSilently());
    }
}

TEST_F(PipedPaths, ofStatusAreArguments) {
    folder_.addFile("new/file");
    folder_.remove(u"src/main.cpp");
    folder_.remove(u"readme");

    EXPECT_THAT(shell("projectctl status | sed -n 's/^gone //p' | projectctl remove -"), SucceedsSilently());
    EXPECT_THAT(shell("projectctl status | sed -n 's/^new  //p' | projectctl add -r -"), SucceedsSilently());

    EXPECT_THAT(tool({"status"}), SucceedsSilently());
    EXPECT_THAT(tool({"list", "../../new"}), Prints("../../new\n../../new/file\n"));
}

TEST_F(PipedPaths, areQuotedOnATerminal) {
    settings_.onTerminal = true;

    EXPECT_THAT(tool({"list", "../../other"}).output,
                AllOf(HasSubstr("\"../../other/\\\"quoted\\\"\"\r\n"), HasSubstr("\r\n../../other/-x\r\n"),
                      HasSubstr("\r\n\"../../other/line\\nbreak\"\r\n")));
}

class RootCommand : public ShownPaths {};

TEST_F(RootCommand, printsTheRoot) {
    EXPECT_THAT(tool({"root"}), Prints(folder_.onDisk().string() + "\n"));
    EXPECT_THAT(toolFrom("../..", {"root"}), Prints(folder_.onDisk().string() + "\n"));
}

TEST_F(RootCommand, failsOutsideAnyProject) {
    settings_.folder = "/";

    EXPECT_THAT(tool({"root"}), FailsWith(1, "no project in \"/\""));
}

/// The option -C.
class AnotherFolder : public ShownPaths {};

TEST_F(AnotherFolder, isWhereACommandRuns) {
    EXPECT_THAT(tool({"-C", "../../docs", "list", "."}), Prints(".\nguide\n"));
    EXPECT_THAT(tool({"list", "-C", "../../docs", "."}), Prints(".\nguide\n"));
    EXPECT_THAT(tool({"list", ".", "-C", inFolder("docs")}), Prints(".\nguide\n"));
    EXPECT_THAT(tool({"label", "-C", "..", "find", "Status"}), FailsWith(1, "\"Status\""));
}

TEST_F(AnotherFolder, isWhereArgumentsAndInputBegin) {
    folder_.file(u"docs/new");

    ASSERT_THAT(tool({"-C", "../../docs", "add", "new"}), SucceedsSilently());
    ASSERT_THAT(tool({"-C", "../../docs", "remove", "-"}, "guide\n"), SucceedsSilently());

    EXPECT_THAT(tool({"-C", "../../docs", "list", "."}), Prints(".\nnew\n"));
}

TEST_F(AnotherFolder, isReachedInSteps) {
    EXPECT_THAT(tool({"-C", "..", "-C", "..", "-C", "docs", "list", "."}), Prints(".\nguide\n"));
    EXPECT_THAT(tool({"-C", "", "list", "."}), Prints(".\npump.cpp\n"));
}

TEST_F(AnotherFolder, canHaveAnyName) {
    for (auto const* name : {"-x", "[a,b]", "\xFF"}) {
        folder_.addFolder(std::filesystem::path("src/io") / name);
        ASSERT_THAT(tool({"-C", name, "add", "."}), SucceedsSilently());
        EXPECT_THAT(tool({"-C", name, "list", "."}), Prints(".\n"));
    }
}

TEST_F(AnotherFolder, isWhereAProjectIsCreated) {
    folder_.addFolder("src/io/inner");

    ASSERT_THAT(tool({"-C", "inner", "init"}), SucceedsSilently());

    EXPECT_THAT(tool({"-C", "inner", "root"}), Prints(inFolder("src/io/inner") + "\n"));
}

TEST_F(AnotherFolder, mustBeAFolder) {
    EXPECT_THAT(tool({"-C", "no", "list"}), FailsWith(1, "\"no\": No such file or directory"));
    EXPECT_THAT(tool({"-C", "pump.cpp", "list"}), FailsWith(1, "\"pump.cpp\": Not a directory"));
    EXPECT_THAT(tool({"list", "-C"}), FailsWith(2, "-C needs a folder"));
}

TEST_F(AnotherFolder, isAnOptionOnlyBeforeTwoDashes) {
    folder_.addFile("src/io/-C");

    EXPECT_THAT(tool({"add", "--", "-C"}), SucceedsSilently());

    EXPECT_THAT(tool({"list", "--", "-C"}), Prints("-C\n"));
}

TEST_F(AnotherFolder, isShownByTheHelpOfEveryCommand) {
    EXPECT_THAT(tool({"--help"}).output, AllOf(HasSubstr("-C"), HasSubstr("--full-name")));
    EXPECT_THAT(tool({"label", "find", "--help"}).output, AllOf(HasSubstr("-C"), HasSubstr("--full-name")));
}

} // namespace
} // namespace project::test
