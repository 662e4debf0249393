#include <algorithm>
#include <iterator>
#include <memory>

#include "tools/ToolTest.hpp"

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

TEST_F(AddCommand, takesPathsRelativeToTheCurrentFolder) {
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

TEST_F(AddCommand, refusesPathsOutsideTheProject) {
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

TEST_F(AddCommand, addsTheTargetOfALinkThatASlashFollows) {
    folder_.folder(u"real");
    folder_.addLink("link", "real");

    EXPECT_THAT(tool({"add", "link/"}), SucceedsSilently());

    EXPECT_THAT(list(), ElementsAre("real"));
}

TEST_F(AddCommand, addsAnExplicitPathThatIsNotARegularFile) {
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

TEST_F(AddCommand, requiresAPath) {
    EXPECT_THAT(tool({"add"}), FailsWith(2, "PATH"));
}

TEST_F(AddCommand, reportsTheNumberOnATerminal) {
    folder_.file(u"a");
    folder_.file(u"b");
    settings_.onTerminal = true;

    EXPECT_EQ(tool({"add", "a", "b"}).output, "2 added to the project\r\n");
}

/// A project with labels on the file "src/io/pump.cpp", on both folders above it, and on the file "readme".
class AddToLabelled : public AddCommand {
protected:
    void SetUp() override {
        AddCommand::SetUp();
        folder_.file(u"readme");
        folder_.file(u"src/io/pump.cpp");
        ASSERT_THAT(tool({"add", "readme", "src/io/pump.cpp"}), SucceedsSilently());
        ASSERT_THAT(tool({"category", "create", "Status"}), SucceedsSilently());
        ASSERT_THAT(tool({"label", "create", "Status", "Open"}), SucceedsSilently());
        ASSERT_THAT(tool({"label", "put", "Status", "Open", "readme", "src", "src/io", "src/io/pump.cpp"}),
                    SucceedsSilently());
    }

    std::vector<std::string> labelled() const { return linesOf(tool({"label", "find", "Status"}).output); }

    /// The UUID of a label.
    std::string uuidOf(std::string const& name) const {
        auto const labels = tool({"label", "list", "--json"}).output;
        auto const end = labels.find("\", \"name\": \"" + name + "\"}, \"readOnly\"");
        EXPECT_NE(end, std::string::npos) << labels;
        constexpr std::size_t length = 36;
        return labels.substr(end - length, length);
    }

    std::vector<std::string> const all_{"readme", "src", "src/io", "src/io/pump.cpp"};
};

TEST_F(AddToLabelled, skipsPathsThatAreInTheProject) {
    auto const before = readText();

    EXPECT_THAT(tool({"add", "src/io/pump.cpp", "src", "readme"}), SucceedsSilently());

    EXPECT_EQ(readText(), before);
    EXPECT_EQ(labelled(), all_);
}

TEST_F(AddToLabelled, skipsThemBesideNewPaths) {
    folder_.file(u"new");

    EXPECT_THAT(tool({"add", "src/io/pump.cpp", "new"}), SucceedsSilently());

    EXPECT_EQ(labelled(), all_);
    EXPECT_THAT(list(), ElementsAre("new", "readme", "src", "src/io", "src/io/pump.cpp"));
}

TEST_F(AddToLabelled, reportsOnATerminalHowManyItSkipped) {
    folder_.file(u"new");
    settings_.onTerminal = true;

    EXPECT_EQ(tool({"add", "readme", "new", "src"}).output, "1 added to the project, 2 already in it\r\n");
}

TEST_F(AddToLabelled, keepsTheLabelsOfTheFoldersAboveANewPath) {
    folder_.file(u"src/io/new");

    EXPECT_THAT(tool({"add", "src/io/new"}), SucceedsSilently());

    EXPECT_EQ(labelled(), all_);
    EXPECT_THAT(list(), ElementsAre("readme", "src", "src/io", "src/io/new", "src/io/pump.cpp"));
}

TEST_F(AddToLabelled, keepsEverythingElseOfTheText) {
    ASSERT_THAT(tool({"label", "create", "Status", "Late"}), SucceedsSilently());
    ASSERT_THAT(tool({"label", "create", "Status", "Early"}), SucceedsSilently());
    ASSERT_THAT(tool({"category", "create", "Owner"}), SucceedsSilently());
    ASSERT_THAT(tool({"label", "create", "Owner", "Ada"}), SucceedsSilently());
    ASSERT_THAT(tool({"label", "put", "Owner", "Ada", "src"}), SucceedsSilently());
    ASSERT_THAT(tool({"label", "put", "Status", "Late", "src"}), SucceedsSilently());
    ASSERT_THAT(tool({"label", "put", "Status", "Early", "src"}), SucceedsSilently());
    insertLineBefore("{\"file\":\"readme\"",
                     R"({"at":["Files","Notes","File","src"],"keys":{"Note":"new"}})");
    insertLineBefore("{\"file\":\"readme\"", R"({"at":["Files","Root","File","src","LabelData","Data"],)"
                                             R"("children":[{"type":"Record","keys":{"UUID":")" +
                                                 uuidOf("Late") + R"(","Value":"since May"}}]})");
    ASSERT_THAT(tool({"tidy"}), SucceedsSilently());
    ASSERT_THAT(tool({"label", "show", "src"}),
                Prints("Status: Open\nStatus: Late = since May\nStatus: Early\nOwner: Ada\n"));
    auto before = linesOf(readText());
    folder_.file(u"src/io/new");

    EXPECT_THAT(tool({"add", "src/io/new"}), SucceedsSilently());

    before.insert(std::next(std::ranges::find(before, "\"src/io/\"")), "\"src/io/new\"");
    EXPECT_EQ(linesOf(readText()), before);
}

TEST_F(AddToLabelled, addsAgainWithoutLabelsWithAnew) {
    EXPECT_THAT(tool({"add", "--anew", "readme"}), SucceedsSilently());
    EXPECT_THAT(labelled(), ElementsAre("src", "src/io", "src/io/pump.cpp"));

    EXPECT_THAT(tool({"add", "--anew", "src/io/pump.cpp"}), SucceedsSilently());
    EXPECT_THAT(labelled(), ElementsAre("src", "src/io"));
}

TEST_F(AddToLabelled, dropsTheLabelsOfAFolderThatIsAddedAnewItself) {
    EXPECT_THAT(tool({"add", "--anew", "src/io/pump.cpp", "src/io"}), SucceedsSilently());

    EXPECT_THAT(labelled(), ElementsAre("readme", "src"));
}

TEST_F(AddToLabelled, addsNothingWhenOnePathIsBad) {
    folder_.file(u"src/io/new");
    auto const before = readText();

    EXPECT_THAT(tool({"add", "readme", "src/io/new", "missing"}),
                FailsWith(1, '"' + inFolder("missing") + '"'));

    EXPECT_EQ(readText(), before);
}

TEST_F(AddToLabelled, keepsTheLabelsOfAFolderWhoseContentsAreAllInTheProject) {
    auto const before = readText();

    EXPECT_THAT(tool({"add", "-r", "src"}), SucceedsSilently());

    EXPECT_EQ(readText(), before);
}

TEST_F(AddToLabelled, keepsTheLabelsOfFoldersAboveNewContents) {
    folder_.file(u"src/new/file");

    EXPECT_THAT(tool({"add", "-r", "src"}), SucceedsSilently());

    EXPECT_EQ(labelled(), all_);
}

TEST_F(AddToLabelled, addsOnlyTheGivenFolderAnewNotItsContents) {
    EXPECT_THAT(tool({"add", "-r", "--anew", "src/io"}), SucceedsSilently());

    EXPECT_THAT(labelled(), ElementsAre("readme", "src", "src/io/pump.cpp"));
}

} // namespace
} // namespace project::test
