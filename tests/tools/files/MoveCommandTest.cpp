#include "support/GitFolder.hpp"
#include "tools/ToolTest.hpp"

namespace project::test {
namespace {

using ::testing::HasSubstr;

class MoveCommand : public ToolTest {
protected:
    void SetUp() override {
        initProject();
        folder_.file(u"a", "content of a\n");
        folder_.file(u"src/io/pump.cpp");
        folder_.file(u"src/main.cpp");
        ASSERT_THAT(tool({"add", "-r", "."}), SucceedsSilently());
        ASSERT_THAT(tool({"category", "create", "Status"}), SucceedsSilently());
        ASSERT_THAT(tool({"label", "create", "Status", "Done"}), SucceedsSilently());
        ASSERT_THAT(tool({"label", "put", "Status", "Done", "src/main.cpp"}), SucceedsSilently());
        git_.commitAll();
    }

    GitFolder const git_{folder_.onDisk()};
};

TEST_F(MoveCommand, movesAFolderWithItsLabelsInOneStep) {
    ASSERT_THAT(tool({"move", "src", "lib"}), SucceedsSilently());

    EXPECT_THAT(tool({"label", "find", "Status"}), Prints("lib/main.cpp\n"));
    EXPECT_EQ(git_.run({"status", "--porcelain"}), "M  .projectdata/project.jsonl\n"
                                                   "R  src/io/pump.cpp -> lib/io/pump.cpp\n"
                                                   "R  src/main.cpp -> lib/main.cpp\n");
    EXPECT_THAT(tool({"status"}), SucceedsSilently());
}

TEST_F(MoveCommand, movesSeveralFilesIntoAFolderFromAnyWorkingFolder) {
    ASSERT_THAT(toolFrom("src", {"move", "main.cpp", "../a", "io"}), SucceedsSilently());

    EXPECT_THAT(tool({"list"}), Prints("src\nsrc/io\nsrc/io/a\nsrc/io/main.cpp\nsrc/io/pump.cpp\n"));
}

TEST_F(MoveCommand, refusesAMoveThatIsNotPossibleAndSaysWhy) {
    EXPECT_THAT(tool({"move", "a", "src/main.cpp"}), FailsWith(1, "/src/main.cpp\" exists already"));
    EXPECT_THAT(tool({"move", "src", "src/io"}), FailsWith(1, "cannot be moved into itself"));
    EXPECT_THAT(tool({"move", "a", "../b"}), FailsWith(1, "is outside the project's folder"));
    EXPECT_THAT(tool({"move", "a", ".projectdata/b"}),
                FailsWith(1, "in the folder of the project's definition"));
    EXPECT_THAT(tool({"move", "a", "new/"}), FailsWith(1, "there is no folder"));
    EXPECT_THAT(tool({"move", "b", "c"}), FailsWith(1, "/b\" is not in the project"));
    EXPECT_THAT(tool({"move", ".", "c"}), FailsWith(1, "root folder"));
    EXPECT_THAT(tool({"move", "a"}), FailsWith(2, "DESTINATION is required"));
    EXPECT_EQ(git_.run({"status", "--porcelain"}), "");
}

TEST_F(MoveCommand, saysInGermanWhyItRefuses) {
    settings_.environment["LC_ALL"] = "de_DE.UTF-8";

    EXPECT_THAT(tool({"move", "a", "src/main.cpp"}), FailsWith(1, "/src/main.cpp\" gibt es schon"));
}

TEST_F(MoveCommand, ontoItselfDoesNothing) {
    EXPECT_THAT(tool({"move", "a", "a"}), SucceedsSilently());
    EXPECT_THAT(tool({"move", "a", "."}), SucceedsSilently());

    EXPECT_EQ(git_.run({"status", "--porcelain"}), "");
}

TEST_F(MoveCommand, isOneStepWithTheOtherCommandsOfABatch) {
    EXPECT_THAT(tool({"batch"}, "move src lib\nmove a lib/b\nlabel put Status Done lib/b\n"),
                SucceedsSilently());
    EXPECT_THAT(tool({"label", "find", "Status"}), Prints("lib/b\nlib/main.cpp\n"));
    git_.commitAll();

    EXPECT_NE(tool({"batch"}, "move lib src\nremove nothing\n").exitCode, 0);

    EXPECT_TRUE(std::filesystem::exists(inFolder("lib/main.cpp")));
    EXPECT_EQ(git_.run({"status", "--porcelain"}), "");
}

TEST_F(MoveCommand, writesThatItIsDoneInJson) {
    EXPECT_THAT(tool({"move", "a", "b", "--json"}).output, HasSubstr("{\"format\": \"projectctl-done\""));
}

TEST_F(MoveCommand, reportsAMoveOfAnotherProcessThatItHasRolledBack) {
    auto const local = folder_.onDisk() / ".projectdata" / "local";
    std::filesystem::create_directories(local);
    std::ofstream(local / "moves", std::ios::binary) << "a record that was not completed";

    EXPECT_THAT(tool({"status"}).errors, HasSubstr("a move was interrupted"));
    ASSERT_THAT(tool({"move", "a", "b"}), SucceedsSilently());

    EXPECT_EQ(tool({"status"}).errors, "");
}

} // namespace
} // namespace project::test
