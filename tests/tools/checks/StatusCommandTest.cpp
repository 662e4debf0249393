#include "tools/ToolTest.hpp"

namespace project::test {
namespace {

class StatusCommand : public ToolTest {
protected:
    void SetUp() override {
        initProject();
        folder_.file(u"src/io/pump.cpp");
        folder_.file(u"src/main.cpp");
        ASSERT_EQ(tool({"add", "-r", "."}).exitCode, 0);
    }
};

TEST_F(StatusCommand, showsNothingWhenProjectAndDiskAgree) {
    EXPECT_THAT(tool({"status"}), SucceedsSilently());
    EXPECT_THAT(tool({"status", "--json"}), Prints("{\"format\": \"projectctl-status\", \"version\": 1, "
                                                   "\"new\": [], \"gone\": [], \"findings\": []}\n"));
}

TEST_F(StatusCommand, saysSoOnATerminal) {
    settings_.onTerminal = true;

    EXPECT_EQ(tool({"status"}).output, "The project and the disk contain the same files.\r\n");
}

TEST_F(StatusCommand, showsNewAndMissingFiles) {
    folder_.file(u"src/new.cpp");
    folder_.file(u"a");
    folder_.remove(u"src/main.cpp");

    EXPECT_THAT(tool({"status"}), Prints("new  a\nnew  src/new.cpp\ngone src/main.cpp\n"));
}

TEST_F(StatusCommand, comparesTheWholeProjectFromAnyFolder) {
    folder_.file(u"src/new.cpp");

    EXPECT_THAT(toolFrom("src/io", {"status"}), Prints("new  ../new.cpp\n"));
}

TEST_F(StatusCommand, showsANewFolderInsteadOfItsContents) {
    folder_.file(u"docs/guide/first.md");
    folder_.file(u"docs/second.md");

    EXPECT_THAT(tool({"status"}), Prints("new  docs/\n"));
}

TEST_F(StatusCommand, comparesTheContentsOfAFolderThatIsPartlyInTheProject) {
    folder_.file(u"docs/guide/first.md");
    folder_.file(u"docs/second.md");
    ASSERT_THAT(tool({"add", "docs/second.md"}), SucceedsSilently());

    EXPECT_THAT(tool({"status"}), Prints("new  docs/guide/\n"));
}

TEST_F(StatusCommand, showsAllContentsOfADeletedFolder) {
    folder_.remove(u"src");

    EXPECT_THAT(tool({"status"}), Prints("gone src\ngone src/io\ngone src/io/pump.cpp\ngone src/main.cpp\n"));
}

TEST_F(StatusCommand, takesAFolderForNewWhoseContentsAloneAreInTheProject) {
    insertLineBefore(R"({"at":["Info","ProjectData"])", "\"z/deep/file\"");

    EXPECT_THAT(tool({"status"}), SucceedsSilently()) << "listings do not show it either";
    folder_.file(u"z/deep/file");
    EXPECT_THAT(tool({"status"}), Prints("new  z/\n"));
}

TEST_F(StatusCommand, showsMissingFilesBelowAFolderThatBecameAFile) {
    folder_.remove(u"src/io");
    folder_.file(u"src/io");

    EXPECT_THAT(tool({"status"}), Prints("gone src/io/pump.cpp\n"));
}

TEST_F(StatusCommand, doesNotReportALinkWhoseTargetWasDeleted) {
    folder_.addLink("link", "src/main.cpp");
    ASSERT_THAT(tool({"add", "link"}), SucceedsSilently());
    folder_.remove(u"src/main.cpp");

    EXPECT_THAT(tool({"status"}), Prints("gone src/main.cpp\n"));
}

TEST_F(StatusCommand, leavesOutTheSameFilesAsAdd) {
    folder_.file(u".git/config");
    folder_.file(u"src/.svn/entries");
    folder_.file(u"..hidden");
    folder_.file(u"inner/file");
    ASSERT_THAT(toolFrom("inner", {"init"}), SucceedsSilently());
    ASSERT_THAT(tool({"add", "inner/file"}), SucceedsSilently());
    ASSERT_EQ(mkfifo(inFolder("pipe").c_str(), 0600), 0);

    EXPECT_THAT(tool({"status"}), SucceedsSilently());
}

TEST_F(StatusCommand, recognisesAPipeThatIsInTheProject) {
    ASSERT_EQ(mkfifo(inFolder("pipe").c_str(), 0600), 0);
    folder_.file(u".git/config");
    ASSERT_THAT(tool({"add", "pipe", ".git/config"}), SucceedsSilently());
    EXPECT_THAT(tool({"status"}), SucceedsSilently());

    folder_.remove(u"pipe");
    folder_.remove(u".git/config");

    EXPECT_THAT(tool({"status"}), Prints("gone .git/config\ngone pipe\n"));
}

TEST_F(StatusCommand, saysInItsExitCodeWhetherAnythingDiffersIfAsked) {
    EXPECT_THAT(tool({"status", "--exit-code"}), SucceedsSilently());

    folder_.file(u"new");

    EXPECT_EQ(tool({"status"}).exitCode, 0);
    EXPECT_EQ(tool({"status", "--exit-code"}).exitCode, 3);
    EXPECT_EQ(tool({"status", "--exit-code", "--json"}).exitCode, 3);
    ASSERT_THAT(tool({"add", "new"}), SucceedsSilently());
    EXPECT_EQ(tool({"status", "--exit-code"}).exitCode, 0);
    folder_.remove(u"new");
    EXPECT_EQ(tool({"status", "--exit-code"}).exitCode, 3);
}

TEST_F(StatusCommand, writesJson) {
    folder_.file(u"docs/a");
    folder_.addFile("b\xFF");
    folder_.remove(u"src/io");

    EXPECT_THAT(tool({"status", "--json"}),
                Prints("{\"format\": \"projectctl-status\", \"version\": 1, \"new\": [\n"
                       "{\"path\": \"b\\udcff\", \"kind\": \"file\"},\n"
                       "{\"path\": \"docs\", \"kind\": \"folder\"}\n"
                       "], "
                       "\"gone\": [\n"
                       "{\"path\": \"src/io\", \"kind\": \"folder\"},\n"
                       "{\"path\": \"src/io/pump.cpp\", \"kind\": \"file\"}\n"
                       "], "
                       "\"findings\": []}\n"));
}

TEST_F(StatusCommand, continuesAfterAFolderThatCannotBeRead) {
    folder_.file(u"new");
    std::filesystem::permissions(inFolder("src"), std::filesystem::perms::none);
    dropPrivileges();

    auto const result = tool({"status"});

    std::filesystem::permissions(inFolder("src"), std::filesystem::perms::all);
    EXPECT_EQ(result.exitCode, 0);
    EXPECT_EQ(result.output, "new  new\n"); // files in the unreadable folder are not reported as gone
    EXPECT_EQ(result.errors, "projectctl: warning: the folder \"" + inFolder("src") +
                                 "\" cannot be read: Permission denied\n");
}

} // namespace
} // namespace project::test
