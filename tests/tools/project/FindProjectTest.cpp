#include "tools/ToolTest.hpp"

namespace project::test {
namespace {

class FindProject : public ToolTest {};

TEST_F(FindProject, findsTheNearestProjectUpwards) {
    ASSERT_THAT(tool({"init", "--name", "outer"}), SucceedsSilently());
    folder_.folder(u"inner/deep/deeper");
    ASSERT_THAT(tool({"init", "inner", "--name", "inner"}), SucceedsSilently());

    EXPECT_THAT(toolFrom("inner/deep/deeper", {"name"}), Prints("inner\n"));
    EXPECT_THAT(tool({"name"}), Prints("outer\n"));
}

TEST_F(FindProject, findsTheProjectThroughALink) {
    ASSERT_THAT(tool({"init", "--name", "mine"}), SucceedsSilently());
    folder_.folder(u"real/deep");
    folder_.file(u"real/deep/file");
    TemporaryFolder const elsewhere;
    elsewhere.addLink("link", folder_.onDisk() / "real/deep");
    settings_.folder = elsewhere.onDisk() / "link";

    EXPECT_THAT(tool({"add", "file"}), SucceedsSilently());

    EXPECT_THAT(tool({"list"}), Prints("..\n.\nfile\n"));
    EXPECT_THAT(tool({"list", "--full-name"}), Prints("real\nreal/deep\nreal/deep/file\n"));
}

TEST_F(FindProject, reportsThatThereIsNone) {
    for (auto const* command : {"list", "status", "check", "tidy", "name", "description"}) {
        EXPECT_THAT(tool({command}), FailsWith(1, "no project in \"" + folder_.onDisk().string() + '"'));
    }
}

TEST_F(FindProject, skipsAnEmptyStoreFolder) {
    ASSERT_THAT(tool({"init", "--name", "outer"}), SucceedsSilently());
    folder_.folder(u"inner/.projectdata");

    EXPECT_THAT(toolFrom("inner", {"name"}), Prints("outer\n"));
}

TEST_F(FindProject, doesNotSkipAProjectWhoseTextIsMissing) {
    ASSERT_THAT(tool({"init", "--name", "outer"}), SucceedsSilently());
    folder_.folder(u"inner/deep");
    ASSERT_THAT(tool({"init", "inner"}), SucceedsSilently());
    std::filesystem::remove(inFolder("inner/.projectdata/project.jsonl"));

    EXPECT_THAT(toolFrom("inner/deep", {"name"}), FailsWith(5, inFolder("inner/.projectdata/project.jsonl") +
                                                                   ": the project's text is missing"));
}

TEST_F(FindProject, doesNotFollowALinkInPlaceOfTheStoreFolder) {
    TemporaryFolder const elsewhere;
    settings_.folder = elsewhere.onDisk();
    ASSERT_THAT(tool({"init", "--name", "elsewhere"}), SucceedsSilently());
    settings_.folder = folder_.onDisk();
    folder_.addLink(".projectdata", elsewhere.onDisk() / ".projectdata");

    EXPECT_THAT(tool({"name"}), FailsWith(5, inFolder(".projectdata")));
}

TEST_F(FindProject, reportsAWorkingFolderThatWasDeleted) {
    folder_.folder(u"going");
    RunningProgram shell({"sh", "-c", "cd going && rmdir ../going && exec " PROJECTCTL " list"}, settings_);

    EXPECT_THAT(shell.finish(), FailsWith(1, "the working folder cannot be found"));
}

} // namespace
} // namespace project::test
