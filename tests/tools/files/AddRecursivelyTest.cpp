#include <sys/socket.h>
#include <sys/un.h>
#include <unistd.h>

#include "tools/ToolTest.hpp"

namespace project::test {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

class AddRecursively : public ToolTest {
protected:
    void SetUp() override { initProject(); }
};

TEST_F(AddRecursively, addsTheContentsOfAFolderAtAnyDepth) {
    folder_.file(u"src/a/b/c/deep.cpp");
    folder_.file(u"src/main.cpp");
    folder_.folder(u"src/empty");
    folder_.file(u"other");

    EXPECT_THAT(tool({"add", "--recursive", "src"}), SucceedsSilently());

    EXPECT_THAT(list(), ElementsAre("src", "src/a", "src/a/b", "src/a/b/c", "src/a/b/c/deep.cpp", "src/empty",
                                    "src/main.cpp"));
}

TEST_F(AddRecursively, addsEverythingFromTheRoot) {
    folder_.file(u"src/main.cpp");
    folder_.file(u"readme");

    EXPECT_THAT(tool({"add", "-r", "."}), SucceedsSilently());

    EXPECT_THAT(list(), ElementsAre("readme", "src", "src/main.cpp"));
}

TEST_F(AddRecursively, acceptsAFile) {
    folder_.file(u"readme");

    EXPECT_THAT(tool({"add", "-r", "readme"}), SucceedsSilently());

    EXPECT_THAT(list(), ElementsAre("readme"));
}

TEST_F(AddRecursively, leavesOutFoldersOfSourceControl) {
    for (auto const* name : {".git", ".hg", ".svn", ".bzr", "_darcs", "CVS", ".jj"}) {
        folder_.addFile(std::filesystem::path("src") / name / "data");
    }
    folder_.file(u"src/.gitignore");

    EXPECT_THAT(tool({"add", "-r", "."}), SucceedsSilently());

    EXPECT_THAT(list(), ElementsAre("src", "src/.gitignore"));
}

TEST_F(AddRecursively, leavesOutTheFileWithWhichGitLinksAWorkingTree) {
    folder_.file(u"submodule/.git", "gitdir: elsewhere");
    folder_.file(u"submodule/CVS", "a file with that name is an ordinary file");

    EXPECT_THAT(tool({"add", "-r", "."}), SucceedsSilently());

    EXPECT_THAT(list(), ElementsAre("submodule", "submodule/CVS"));
}

TEST_F(AddRecursively, leavesOutTheStoresOfInnerProjects) {
    folder_.file(u"inner/file");
    ASSERT_THAT(toolFrom("inner", {"init"}), SucceedsSilently());

    EXPECT_THAT(tool({"add", "-r", "."}), SucceedsSilently());

    EXPECT_THAT(list(), ElementsAre("inner", "inner/file"));
}

TEST_F(AddRecursively, addsLinksAndDoesNotFollowThem) {
    folder_.file(u"real/file");
    folder_.addLink("link", "real");
    folder_.addLink("loop", ".");
    folder_.addLink("broken", "nowhere");

    EXPECT_THAT(tool({"add", "-r", "."}), SucceedsSilently());

    EXPECT_THAT(list(), ElementsAre("broken", "link", "loop", "real", "real/file"));
}

TEST_F(AddRecursively, doesNotFollowALinkThatIsItsArgument) {
    folder_.file(u"real/file");
    folder_.addLink("link", "real");

    EXPECT_THAT(tool({"add", "-r", "link"}), SucceedsSilently());

    EXPECT_THAT(list(), ElementsAre("link"));
}

TEST_F(AddRecursively, skipsPipesAndSockets) {
    folder_.file(u"src/file");
    ASSERT_EQ(mkfifo(inFolder("src/pipe").c_str(), 0600), 0);
    sockaddr_un address{AF_UNIX, {}};
    inFolder("src/socket").copy(&address.sun_path[0], sizeof address.sun_path - 1);
    auto const socketOnDisk = socket(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0);
    ASSERT_EQ(bind(socketOnDisk, reinterpret_cast<sockaddr*>(&address), sizeof address), 0);

    EXPECT_THAT(tool({"add", "-r", "src"}), SucceedsSilently());

    EXPECT_THAT(list(), ElementsAre("src", "src/file"));
    close(socketOnDisk);
}

TEST_F(AddRecursively, leavesOutNamesWithTwoDotsInTheRootAndReportsThem) {
    folder_.file(u"..config/file");
    folder_.file(u"..other");
    folder_.file(u"src/..inside");

    auto const result = tool({"add", "-r", "."});

    EXPECT_EQ(result.exitCode, 0);
    EXPECT_EQ(result.errors, "projectctl: left out \"..config\" and 1 more: a name that begins with two dots "
                             "cannot be added from the "
                             "project's root\n");
    EXPECT_THAT(list(), ElementsAre("src", "src/..inside"));
}

TEST_F(AddRecursively, addsOnlyNewFilesTheSecondTime) {
    folder_.file(u"src/old");
    ASSERT_THAT(tool({"add", "-r", "."}), SucceedsSilently());
    folder_.file(u"src/new");
    settings_.onTerminal = true;

    EXPECT_EQ(tool({"add", "-r", "."}).output, "1 added to the project\r\n");

    settings_.onTerminal = false;
    EXPECT_THAT(list(), ElementsAre("src", "src/new", "src/old"));
}

TEST_F(AddRecursively, keepsTheLabelsOfFilesThatAreInTheProject) {
    folder_.file(u"file");
    ASSERT_THAT(tool({"add", "file"}), SucceedsSilently());
    auto const labelled = R"({"file":"file","children":[{"type":"Category","keys":{"UUID":"c"}}]})";
    auto content = readText();
    writeText(content.replace(content.find("\"file\""), 6, labelled));

    EXPECT_THAT(tool({"add", "-r", "."}), SucceedsSilently());

    EXPECT_THAT(readText(), ::testing::HasSubstr(labelled));
}

TEST_F(AddRecursively, refusesAFolderOutsideWithoutWalkingIt) {
    EXPECT_THAT(tool({"add", "-r", "/"}), FailsWith(1, "outside the project's root folder"));
}

TEST_F(AddRecursively, addsNothingWhenAFolderCannotBeRead) {
    folder_.file(u"closed/file");
    folder_.file(u"good");
    std::filesystem::permissions(inFolder("closed"), std::filesystem::perms::none);
    dropPrivileges();

    EXPECT_THAT(tool({"add", "-r", "."}), FailsWith(1, '"' + inFolder("closed") + "\" cannot be read"));

    std::filesystem::permissions(inFolder("closed"), std::filesystem::perms::all);
    EXPECT_THAT(list(), IsEmpty());
}

TEST_F(AddRecursively, addsDeepFolders) {
    std::filesystem::path deep;
    for (int level = 0; level < 300; ++level) {
        deep /= "d";
    }
    folder_.addFolder(deep);

    EXPECT_THAT(tool({"add", "-r", "."}), SucceedsSilently());

    EXPECT_EQ(list().size(), 300U);
}

TEST_F(AddRecursively, addsThousandsOfFiles) {
    for (int number = 0; number < 1000; ++number) {
        folder_.addFile("folder" + std::to_string(number % 50) + "/file" + std::to_string(number));
    }

    EXPECT_THAT(tool({"add", "-r", "."}), SucceedsSilently());

    EXPECT_EQ(list().size(), 1050U);
}

} // namespace
} // namespace project::test
