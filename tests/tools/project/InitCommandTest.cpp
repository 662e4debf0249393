#include <set>

#include "tools/ToolTest.hpp"

namespace project::test {
namespace {

using ::testing::ElementsAre;

class InitCommand : public ToolTest {};

TEST_F(InitCommand, createsAProjectNamedAfterItsFolder) {
    folder_.folder(u"pump station");

    EXPECT_THAT(toolFrom("pump station", {"init"}), SucceedsSilently());

    EXPECT_THAT(toolFrom("pump station", {"name"}), Prints("pump station\n"));
    EXPECT_TRUE(
        std::filesystem::is_regular_file(folder_.onDisk() / "pump station/.projectdata/project.jsonl"));
}

TEST_F(InitCommand, usesTheGivenFolderAndName) {
    folder_.folder(u"a");

    EXPECT_THAT(tool({"init", "a", "--name", "Pump station"}), SucceedsSilently());

    EXPECT_THAT(toolFrom("a", {"name"}), Prints("Pump station\n"));
}

TEST_F(InitCommand, refusesAFolderThatContainsAProject) {
    initProject();
    auto const before = readText();

    EXPECT_THAT(tool({"init", "--name", "other"}),
                FailsWith(1, "there is already a project in \"" + folder_.onDisk().string()));

    EXPECT_EQ(readText(), before);
}

TEST_F(InitCommand, refusesAFolderThatDoesNotExist) {
    EXPECT_THAT(tool({"init", "missing"}), FailsWith(1, "there is no folder \"missing\""));
}

TEST_F(InitCommand, refusesAFile) {
    folder_.file(u"file");

    EXPECT_THAT(tool({"init", "file"}), FailsWith(1, "there is no folder \"file\""));
}

TEST_F(InitCommand, createsAProjectInsideAnother) {
    initProject();
    folder_.folder(u"inner");

    EXPECT_THAT(toolFrom("inner", {"init"}), SucceedsSilently());

    EXPECT_THAT(toolFrom("inner", {"name"}), Prints("inner\n"));
}

TEST_F(InitCommand, createsAProjectInAnEmptyStoreFolder) {
    folder_.folder(u".projectdata"); // as after a creation that was interrupted at once

    EXPECT_THAT(tool({"init"}), SucceedsSilently());
}

TEST_F(InitCommand, refusesAStoreWhoseTextIsMissing) {
    initProject();
    std::filesystem::remove(text());

    EXPECT_THAT(tool({"init"}), FailsWith(5, "the project's text is missing"));
}

TEST_F(InitCommand, followsALinkToAFolder) {
    folder_.folder(u"real");
    folder_.addLink("link", "real");

    EXPECT_THAT(tool({"init", "link"}), SucceedsSilently());

    EXPECT_THAT(toolFrom("real", {"name"}), Prints("real\n"));
}

TEST_F(InitCommand, createsOneProjectWhenTwoProcessesTryAtOnce) {
    for (int round = 0; round < 10; ++round) {
        settings_.folder = folder_.addFolder(std::to_string(round));
        RunningProgram first(commandFor({"init", "--name", "first"}), settings_);
        RunningProgram second(commandFor({"init", "--name", "second"}), settings_);

        auto const results = std::pair(first.finish(), second.finish());

        std::set<int> const codes{results.first.exitCode, results.second.exitCode};
        EXPECT_THAT(codes, ElementsAre(0, 1)) << results.first.errors << results.second.errors;
        EXPECT_THAT(tool({"name"}), Prints(results.first.exitCode == 0 ? "first\n" : "second\n"));
    }
}

TEST_F(InitCommand, refusesAProjectThatAnotherProcessIsCreating) {
    folder_.folder(u"other");
    ASSERT_EQ(toolFrom("other", {"init"}).exitCode, 0);
    folder_.addFile(".projectdata/.gitattributes"); // the text is the last file that is created
    auto settings = settings_;
    settings.inputStaysOpen = true;
    RunningProgram creator({"flock", ".projectdata", "sh", "-c", "echo locked; read line"}, settings);
    ASSERT_EQ(creator.readLine(), "locked");
    RunningProgram second(commandFor({"init"}), settings_);
    ASSERT_TRUE(second.waitUntilItSleeps()) << second.finish().errors;

    std::filesystem::copy(folder_.onDisk() / "other/.projectdata/project.jsonl", text());
    creator.finish("\n");

    EXPECT_THAT(second.finish(), FailsWith(1, "there is already a project in"));
}

TEST_F(InitCommand, leavesNoFilesBehindWhenNothingCanBeWritten) {
    settings_.fileSize = 0; // every file is too large

    auto const result = tool({"init"});

    EXPECT_THAT(result, FailsWith(7, ".projectdata"));
    EXPECT_TRUE(std::filesystem::is_empty(folder_.onDisk()));
}

TEST_F(InitCommand, addsTheWholeTreeExceptIgnoredFiles) {
    folder_.addFile("src/main.cpp");
    folder_.addFile("build/main.o");
    folder_.addFile(".gitignore", "build\n");
    ASSERT_EQ(runProgram({"/usr/bin/git", "init", "-q"}, settings_).exitCode, 0);

    EXPECT_THAT(tool({"init", "--add"}), SucceedsSilently());

    EXPECT_THAT(list(), ::testing::ElementsAre(".gitignore", "src", "src/main.cpp"));
}

TEST_F(InitCommand, addsTheWholeTreeWithoutARepository) {
    folder_.addFile("sub/build/main.o");
    folder_.addFile("sub/.gitignore", "build\n");

    EXPECT_THAT(tool({"init", "sub", "--add"}), SucceedsSilently());

    EXPECT_THAT(toolFrom("sub", {"list"}), Prints(".gitignore\nbuild\nbuild/main.o\n"));
}

} // namespace
} // namespace project::test
