#include <memory>

#include "ToolTest.hpp"

namespace project::test {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

class AddCommand : public ToolTest {
protected:
    void SetUp() override { initProject(); }
};

TEST_F(AddCommand, addsAFileWithTheFoldersAboveIt) {
    folder_.file(u"src/io/pump.cpp");

    EXPECT_THAT(tool({"add", "src/io/pump.cpp"}), SucceedsSilently());

    EXPECT_THAT(list(), ElementsAre("src", "src/io", "src/io/pump.cpp"));
}

TEST_F(AddCommand, addsAFolderWithoutItsContents) {
    folder_.file(u"src/pump.cpp");

    EXPECT_THAT(tool({"add", "src"}), SucceedsSilently());

    EXPECT_THAT(list(), ElementsAre("src"));
}

TEST_F(AddCommand, takesPathsRelativeToWhereItIsCalled) {
    folder_.file(u"src/io/pump.cpp");
    folder_.file(u"readme");

    EXPECT_THAT(toolFrom("src/io", {"add", "pump.cpp", "../../readme"}), SucceedsSilently());

    EXPECT_THAT(list(), ElementsAre("readme", "src", "src/io", "src/io/pump.cpp"));
}

TEST_F(AddCommand, takesAbsolutePaths) {
    folder_.file(u"readme");

    EXPECT_THAT(tool({"add", inFolder("readme")}), SucceedsSilently());

    EXPECT_THAT(list(), ElementsAre("readme"));
}

TEST_F(AddCommand, addsNothingWhenOnePathIsBad) {
    folder_.file(u"good");

    EXPECT_THAT(tool({"add", "good", "missing"}), FailsWith(1, '"' + inFolder("missing") + '"'));

    EXPECT_THAT(list(), IsEmpty());
}

TEST_F(AddCommand, refusesWhatLiesOutsideTheProject) {
    EXPECT_THAT(tool({"add", "/etc/passwd"}), FailsWith(1, "outside the project's root folder"));
}

TEST_F(AddCommand, refusesTheStoresOwnFiles) {
    EXPECT_THAT(tool({"add", ".projectdata/project.jsonl"}), FailsWith(1, "store"));
}

TEST_F(AddCommand, addsASymbolicLinkAsItself) {
    folder_.file(u"real/file");
    folder_.addLink("link", "real/file");
    folder_.addLink("broken", "nowhere");

    EXPECT_THAT(tool({"add", "link", "broken"}), SucceedsSilently());

    EXPECT_THAT(list(), ElementsAre("broken", "link"));
}

TEST_F(AddCommand, resolvesLinksInTheFolderPart) {
    folder_.file(u"real/file");
    folder_.addLink("link", "real");

    EXPECT_THAT(tool({"add", "link/file"}), SucceedsSilently());

    EXPECT_THAT(list(), ElementsAre("real", "real/file"));
}

TEST_F(AddCommand, takesALinkWithASlashBehindItForItsTarget) {
    folder_.folder(u"real");
    folder_.addLink("link", "real");

    EXPECT_THAT(tool({"add", "link/"}), SucceedsSilently());

    EXPECT_THAT(list(), ElementsAre("real"));
}

TEST_F(AddCommand, addsWhatItIsToldEvenIfItIsNoRegularFile) {
    ASSERT_EQ(mkfifo(inFolder("pipe").c_str(), 0600), 0);

    EXPECT_THAT(tool({"add", "pipe"}), SucceedsSilently());

    EXPECT_THAT(list(), ElementsAre("pipe"));
}

TEST_F(AddCommand, readsPathsWithZeroBytesFromStandardInput) {
    folder_.addFile("a\nb");
    folder_.addFile("c");

    EXPECT_THAT(tool({"add", "-0"}, withZeros({"a\nb", "c"})), SucceedsSilently());

    EXPECT_THAT(tool({"list", "-0"}), Prints(withZeros({"a\nb", "c"})));
}

TEST_F(AddCommand, readsLinesFromStandardInput) {
    folder_.file(u"a");
    folder_.file(u"b");
    folder_.file(u"c");

    EXPECT_THAT(tool({"add", "c", "-"}, "a\nb\n"), SucceedsSilently());

    EXPECT_THAT(list(), ElementsAre("a", "b", "c"));
}

TEST_F(AddCommand, takesManyPathsFromStandardInput) {
    std::string names;
    for (int number = 0; number < 500; ++number) {
        auto const name = "folder/file" + std::to_string(number);
        folder_.addFile(name);
        names += name + '\0';
    }

    EXPECT_THAT(tool({"add", "--null"}, names), SucceedsSilently());

    EXPECT_EQ(list().size(), 501U);
}

TEST_F(AddCommand, worksInManyProcessesAtOnce) {
    std::vector<std::unique_ptr<RunningProgram>> running;
    for (auto const* name : {"a", "b", "c", "d", "e", "f"}) {
        folder_.addFile(name);
        running.push_back(std::make_unique<RunningProgram>(commandFor({"add", name}), settings_));
    }

    for (auto const& adding : running) {
        EXPECT_THAT(adding->finish(), SucceedsSilently());
    }

    EXPECT_THAT(list(), ElementsAre("a", "b", "c", "d", "e", "f"));
}

TEST_F(AddCommand, refusesAnEmptyPath) {
    EXPECT_THAT(tool({"add", ""}), FailsWith(1, "an empty path"));
}

TEST_F(AddCommand, needsAPath) {
    EXPECT_THAT(tool({"add"}), FailsWith(2, "PATH"));
}

TEST_F(AddCommand, tellsOfTheWorkOnATerminal) {
    folder_.file(u"a");
    folder_.file(u"b");
    settings_.onTerminal = true;

    EXPECT_EQ(tool({"add", "a", "b"}).output, "2 added to the project\r\n");
}

} // namespace
} // namespace project::test
