#include "tools/ToolTest.hpp"

namespace project::test {
namespace {

using ::testing::ElementsAre;

class ListCommand : public ToolTest {
protected:
    void SetUp() override {
        initProject();
        folder_.file(u"src/io/pump.cpp");
        folder_.file(u"src/main.cpp");
        folder_.file(u"src.txt");
        ASSERT_EQ(tool({"add", "-r", "."}).exitCode, 0);
    }
};

TEST_F(ListCommand, writesOnePathPerLineAFolderBeforeItsContents) {
    EXPECT_THAT(tool({"list"}), Prints("src\nsrc/io\nsrc/io/pump.cpp\nsrc/main.cpp\nsrc.txt\n"));
}

TEST_F(ListCommand, listsTheWholeProjectFromAnyFolder) {
    EXPECT_THAT(toolFrom("src/io", {"list"}), Prints("..\n.\npump.cpp\n../main.cpp\n../../src.txt\n"));
    EXPECT_THAT(toolFrom("src/io", {"list", "--full-name"}),
                Prints("src\nsrc/io\nsrc/io/pump.cpp\nsrc/main.cpp\nsrc.txt\n"));
}

TEST_F(ListCommand, listsAPartOfTheProject) {
    EXPECT_THAT(tool({"list", "src/io"}), Prints("src/io\nsrc/io/pump.cpp\n"));
    EXPECT_THAT(toolFrom("src", {"list", "main.cpp"}), Prints("main.cpp\n"));
    EXPECT_THAT(toolFrom("src", {"list", ".."}), Prints(".\nio\nio/pump.cpp\nmain.cpp\n../src.txt\n"));
}

TEST_F(ListCommand, reportsAPathThatIsNotInTheProject) {
    folder_.file(u"new");

    EXPECT_THAT(tool({"list", "new"}), FailsWith(1, '"' + inFolder("new") + "\" is not in the project"));
}

TEST_F(ListCommand, showsATree) {
    EXPECT_THAT(tool({"list", "--tree"}), Prints("src/\n  io/\n    pump.cpp\n  main.cpp\nsrc.txt\n"));
    EXPECT_THAT(tool({"list", "--tree", "src/io"}), Prints("src/io/\n  pump.cpp\n"));
}

TEST_F(ListCommand, writesJsonWithKinds) {
    EXPECT_THAT(tool({"list", "--json"}),
                Prints(document("list", "files",
                                {"{\"path\": \"src\", \"kind\": \"folder\"}",
                                 "{\"path\": \"src/io\", \"kind\": \"folder\"}",
                                 "{\"path\": \"src/io/pump.cpp\", \"kind\": \"file\"}",
                                 "{\"path\": \"src/main.cpp\", \"kind\": \"file\"}",
                                 "{\"path\": \"src.txt\", \"kind\": \"file\"}"})));
}

TEST_F(ListCommand, listsADeletedFolderStillAsAFolder) {
    folder_.remove(u"src");

    EXPECT_THAT(tool({"list", "--json", "src/io"}),
                Prints(document("list", "files",
                                {"{\"path\": \"src/io\", \"kind\": \"folder\"}",
                                 "{\"path\": \"src/io/pump.cpp\", \"kind\": \"file\"}"})));
}

TEST_F(ListCommand, endsPathsWithZeroBytes) {
    EXPECT_THAT(tool({"list", "-0", "src/io"}), Prints(withZeros({"src/io", "src/io/pump.cpp"})));
}

TEST_F(ListCommand, refusesTwoFormsAtOnce) {
    EXPECT_THAT(tool({"list", "--tree", "--json"}), FailsInJsonWith(2, "--tree excludes --json"));
    EXPECT_THAT(tool({"list", "--json", "-0"}), FailsInJsonWith(2, "excludes"));
    EXPECT_THAT(tool({"list", "--tree", "-0"}), FailsWith(2, "excludes"));
}

TEST_F(ListCommand, listsTheSameFilesAsTheFileManager) {
    insertLineBefore("\"src/\"", "\"lost/file\""); // the folder above it is not in the project

    EXPECT_THAT(list(), ElementsAre("src", "src/io", "src/io/pump.cpp", "src/main.cpp", "src.txt"));
}

class ListCommandOfAnEmptyProject : public ToolTest {};

TEST_F(ListCommandOfAnEmptyProject, writesNothing) {
    initProject();

    EXPECT_THAT(tool({"list"}), SucceedsSilently());
    EXPECT_THAT(tool({"list", "--json"}), Prints(document("list", "files", {})));
}

} // namespace
} // namespace project::test
