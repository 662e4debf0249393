#include "tools/ToolTest.hpp"

namespace project::test {
namespace {

using ::testing::HasSubstr;
using ::testing::MatchesRegex;

class EntryCommand : public ToolTest {
protected:
    void SetUp() override {
        initProject();
        folder_.file(u"main.cpp");
        folder_.file(u"src/pump.cpp");
        ASSERT_THAT(tool({"add", "main.cpp", "src/pump.cpp"}), SucceedsSilently());
    }

    /// The output of `entry show` without the UUID, which is random.
    std::string show(std::string const& file) const {
        auto const result = tool({"entry", "show", file});
        EXPECT_EQ(result.exitCode, 0) << result.errors;
        return result.output.substr(0, result.output.find("uuid: "));
    }
};

TEST_F(EntryCommand, listsNothingInANewProject) {
    EXPECT_THAT(tool({"entry", "list"}), SucceedsSilently());
    EXPECT_THAT(tool({"entry", "list", "--json"}), Prints(document("entry-list", "entryPoints", {})));
}

TEST_F(EntryCommand, usesDefaultsForOptionsThatAreNotGiven) {
    ASSERT_THAT(tool({"entry", "set", "src/pump.cpp"}), SucceedsSilently());

    EXPECT_EQ(show("src/pump.cpp"), "name: pump\ntype: Basic\nvisible: yes\ngroup: Default\n");
}

TEST_F(EntryCommand, storesAllOptions) {
    ASSERT_THAT(tool({"group", "create", "Nightly"}), SucceedsSilently());
    ASSERT_THAT(tool({"entry", "set", "main.cpp", "--type", "Batch_Job", "--name", "All of it", "--hidden",
                      "--group", "Nightly", "--extension", "args=-v a=b", "--extension", "empty="}),
                SucceedsSilently());

    EXPECT_EQ(show("main.cpp"), "name: All of it\ntype: Batch_Job\nvisible: no\ngroup: Nightly\n"
                                "extension args: -v a=b\nextension empty: \n");
}

TEST_F(EntryCommand, changesOnlyTheGivenOptionsOfAnExistingEntryPoint) {
    ASSERT_THAT(tool({"entry", "set", "main.cpp", "--type", "Startup", "--hidden", "--extension", "a=1",
                      "--extension", "b=2"}),
                SucceedsSilently());
    auto const before = tool({"entry", "show", "main.cpp"}).output;

    ASSERT_THAT(tool({"entry", "set", "main.cpp", "--name", "Start", "--visible", "--no-extension", "a",
                      "--extension", "b=3"}),
                SucceedsSilently());

    EXPECT_EQ(show("main.cpp"), "name: Start\ntype: Startup\nvisible: yes\ngroup: Default\nextension b: 3\n");
    EXPECT_THAT(tool({"entry", "show", "main.cpp"}).output, HasSubstr(before.substr(before.find("uuid: "))));
}

TEST_F(EntryCommand, listsEntryPointsByTheirFiles) {
    ASSERT_THAT(tool({"entry", "set", "src/pump.cpp", "--type", "Shutdown"}), SucceedsSilently());
    ASSERT_THAT(tool({"entry", "set", "main.cpp", "--type", "StartUp", "--hidden"}), SucceedsSilently());

    EXPECT_THAT(tool({"entry", "list"}),
                Prints("main.cpp: Startup, main (hidden)\nsrc/pump.cpp: Shutdown, pump\n"));
}

TEST_F(EntryCommand, listsAllStoredDataAsJson) {
    ASSERT_THAT(tool({"entry", "set", "main.cpp", "--extension", "k\"=v", "--extension", "l="}),
                SucceedsSilently());

    for (auto const& command :
         {std::vector<std::string>{"entry", "list", "--json"}, {"entry", "show", "main.cpp", "--json"}}) {
        EXPECT_THAT(
            tool(command).output,
            MatchesRegex("\\{\"format\": \"projectctl-entry-list\", \"version\": 1, \"entryPoints\": "
                         "\\[\n\\{\"path\": \"main.cpp\", \"uuid\": \"[-0-9a-f]*\", \"type\": \"Basic\", "
                         "\"name\": \"main\", \"visible\": true, \"group\": "
                         "\\{\"uuid\": \"default\", \"name\": \"Default\"\\}, "
                         "\"extensions\": \\{\"k\\\\\"\": \"v\", \"l\": \"\"\\}\\}\n\\]\\}\n"));
    }
}

TEST_F(EntryCommand, removesEntryPointsAndLeavesTheFiles) {
    ASSERT_THAT(tool({"entry", "set", "main.cpp"}), SucceedsSilently());
    ASSERT_THAT(tool({"entry", "set", "src/pump.cpp"}), SucceedsSilently());

    ASSERT_THAT(tool({"entry", "remove", "main.cpp", "src"}), SucceedsSilently());

    EXPECT_THAT(tool({"entry", "list"}), Prints("src/pump.cpp: Basic, pump\n"));
    EXPECT_THAT(tool({"list"}), Prints("main.cpp\nsrc\nsrc/pump.cpp\n"));
    EXPECT_THAT(tool({"entry", "show", "main.cpp"}), FailsWith(1, "\"main.cpp\" is not an entry point."));
}

TEST_F(EntryCommand, requiresAFileOfTheProject) {
    folder_.file(u"new");
    ASSERT_THAT(tool({"entry", "set", "main.cpp"}), SucceedsSilently());
    auto const before = readText();

    EXPECT_THAT(tool({"entry", "set", "new"}), FailsWith(1, "/new\" is not in the project."));
    EXPECT_THAT(tool({"entry", "show", "new"}), FailsWith(1, "/new\" is not in the project."));
    EXPECT_THAT(tool({"entry", "remove", "main.cpp", "new"}), FailsWith(1, "/new\" is not in the project."));
    EXPECT_EQ(readText(), before);
}

TEST_F(EntryCommand, refusesInvalidOptions) {
    EXPECT_THAT(tool({"entry", "set", "main.cpp", "--type", "batch"}),
                FailsWith(1, "\"batch\" is not a type of entry point."));
    EXPECT_THAT(tool({"entry", "set", "main.cpp", "--group", "Nightly"}),
                FailsWith(1, "there is no entry point group \"Nightly\""));
    EXPECT_THAT(tool({"entry", "set", "main.cpp", "--extension", "args"}),
                FailsWith(1, "\"args\" is not an extension. Give it as KEY=VALUE"));
    EXPECT_THAT(tool({"entry", "set", "main.cpp", "--hidden", "--visible"}), FailsWith(2, "excludes"));
    EXPECT_THAT(tool({"entry", "set"}), FailsWith(2, "'projectctl entry set --help' shows the usage"));
    EXPECT_THAT(tool({"entry", "list"}), SucceedsSilently());
}

TEST_F(EntryCommand, refusesAFileWhoseEntryPointCouldNotBeFoundAgain) {
    folder_.addFile("back\\slash");
    ASSERT_THAT(tool({"add", "back\\slash"}), SucceedsSilently());

    EXPECT_THAT(tool({"entry", "set", "back\\slash"}), FailsWith(1, "because of the backslash in the path"));
    EXPECT_THAT(tool({"entry", "list"}), SucceedsSilently());
}

TEST_F(EntryCommand, keepsAnyBytesOfANameAndOfAnExtension) {
    folder_.addFile("two\nlines \xFF");
    ASSERT_THAT(tool({"add", "two\nlines \xFF"}), SucceedsSilently());

    ASSERT_THAT(tool({"entry", "set", "two\nlines \xFF", "--extension", "k\xFE=\xFD"}), SucceedsSilently());

    EXPECT_EQ(show("two\nlines \xFF"), "name: two\nlines \xFF\ntype: Basic\nvisible: yes\ngroup: Default\n"
                                       "extension k\xFE: \xFD\n");
}

TEST_F(EntryCommand, isRemovedWithItsFile) {
    ASSERT_THAT(tool({"entry", "set", "src/pump.cpp"}), SucceedsSilently());

    ASSERT_THAT(tool({"remove", "src"}), SucceedsSilently());

    EXPECT_THAT(tool({"entry", "list"}), SucceedsSilently());
    EXPECT_THAT(readText(), ::testing::Not(HasSubstr("EntryPoint")));
}

TEST_F(EntryCommand, isNotedByStatusAndCheckWhenItsFileIsNotInTheProject) {
    insertLineBefore("\"main.cpp\"",
                     R"({"at":["EntryPoints","Root","EntryPoint","e"],"keys":{"File":"no","Type":"Basic"}})");

    auto const text =
        "the entry point \"e\" of the file \"no\" is not shown, because the file is not in the project\n";
    EXPECT_THAT(tool({"status"}), Prints(std::string("note ") + text));
    EXPECT_THAT(tool({"check"}).output, HasSubstr(std::string(": note: ") + text));
    EXPECT_THAT(tool({"entry", "set", "no", "--name", "x"}), FailsWith(1, "/no\" is not in the project."));
}

TEST_F(EntryCommand, isNotedByStatusAndCheckWhenItsFileIsNotOnDisk) {
    ASSERT_THAT(tool({"entry", "set", "main.cpp"}), SucceedsSilently());
    folder_.remove(u"main.cpp");

    auto const text = "of the file \"main.cpp\" cannot be used, because the file is not on disk\n";
    EXPECT_THAT(tool({"status"}).output, HasSubstr(text));
    EXPECT_THAT(tool({"status"}).output, HasSubstr("gone main.cpp\n"));
    EXPECT_THAT(tool({"check"}).output, HasSubstr(text));
}

TEST_F(EntryCommand, isReportedByStatusAndCheckWhenItsGroupDoesNotExist) {
    ASSERT_THAT(tool({"group", "create", "Nightly"}), SucceedsSilently());
    ASSERT_THAT(tool({"entry", "set", "main.cpp", "--group", "Nightly"}), SucceedsSilently());
    ASSERT_THAT(tool({"group", "delete", "Nightly"}), SucceedsSilently());

    EXPECT_THAT(tool({"status"}).output,
                MatchesRegex("bad  the entry point \"[-0-9a-f]*\" of the file \"main.cpp\" "
                             "is in the group \"[-0-9a-f]*\", which does not exist\n"));
    EXPECT_EQ(tool({"check"}).exitCode, 3);
    EXPECT_EQ(show("main.cpp"), "name: main\ntype: Basic\nvisible: yes\n");
}

TEST_F(EntryCommand, isReportedByStatusAndCheckWhenItsFileHasAnother) {
    for (auto const* uuid : {"e1", "e2"}) {
        insertLineBefore("\"main.cpp\"", std::string(R"({"at":["EntryPoints","Root","EntryPoint",")") + uuid +
                                             R"("],"keys":{"File":"main.cpp","Name":"m","Type":"Basic"}})");
    }

    EXPECT_THAT(tool({"status"}),
                Prints("bad  the file \"main.cpp\" has 2 entry points, but only the first one "
                       "can be found by its path\n"));
    EXPECT_THAT(tool({"check"}).output, HasSubstr(": the file \"main.cpp\" has 2 entry points"));
    ASSERT_THAT(tool({"entry", "remove", "main.cpp"}), SucceedsSilently()); // both
    EXPECT_THAT(tool({"check"}), SucceedsSilently());
}

TEST_F(EntryCommand, failsOnAnUnknownStoredType) {
    insertLineBefore(
        "\"main.cpp\"",
        R"({"at":["EntryPoints","Root","EntryPoint","e"],"keys":{"File":"main.cpp","Type":"x"}})");

    EXPECT_THAT(tool({"entry", "list"}), FailsWith(1, "\"x\" is not a type of entry point."));
}

} // namespace
} // namespace project::test
