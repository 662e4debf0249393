#include "tools/ToolTest.hpp"

namespace project::test {
namespace {

using ::testing::AllOf;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::Not;

/// A project whose text is damaged, or cannot be read or written.
class BadStore : public ToolTest {
protected:
    void SetUp() override {
        initProject();
        folder_.file(u"a");
        folder_.file(u"b");
        folder_.file(u"c");
        ASSERT_THAT(tool({"add", "a", "b"}), SucceedsSilently());
    }

    /// The committed files are still listed, and a line on standard error names the text and its line.
    void expectListedWithWarning(std::string const& line) const {
        auto const result = tool({"list"});
        EXPECT_EQ(result.exitCode, 0);
        EXPECT_EQ(result.output, "a\nb\n");
        EXPECT_THAT(linesOf(result.errors), ElementsAre(HasSubstr(text().string() + ':' + line)));
    }
};

TEST_F(BadStore, ofALaterFormatIsNotRead) {
    auto content = readText();
    writeText(content.replace(content.find("\"version\":1"), 11, "\"version\":9"));

    for (auto const* command : {"list", "status", "check", "name", "tidy"}) {
        EXPECT_THAT(tool({command}), FailsWith(1, text().string()));
    }
}

TEST_F(BadStore, withAnotherFirstLineIsNotRead) {
    writeText("hello\n");

    EXPECT_THAT(tool({"list"}), FailsWith(5, text().string()));
}

TEST_F(BadStore, withADamagedLineIsListedAndNotWritten) {
    insertLineBefore("\"b\"", "{\"file\":");

    expectListedWithWarning("3: ");
    auto const before = readText();
    EXPECT_THAT(tool({"add", "c"}), FailsWith(5, text().string() + ":3: "));
    EXPECT_EQ(readText(), before);
    EXPECT_THAT(tool({"status"}).output, HasSubstr("new  c\n"));
}

TEST_F(BadStore, withSeveralDamagedLinesHasOneLineOfWarning) {
    insertLineBefore("\"b\"", "{\"file\":");
    insertLineBefore("\"b\"", "nonsense");

    auto const result = tool({"list"});

    EXPECT_EQ(result.output, "a\nb\n");
    EXPECT_THAT(linesOf(result.errors), ElementsAre(HasSubstr(", and 1 more")));
}

TEST_F(BadStore, withConflictMarkersIsListedAndNotWritten) {
    auto content = readText();
    content.replace(content.find("\"b\"\n"), 4, "<<<<<<< ours\n\"b\"\n=======\n\"c\"\n>>>>>>> theirs\n");
    writeText(content);

    auto const listed = tool({"list"});
    EXPECT_EQ(listed.output, "a\nb\nc\n"); // the files of both sides
    EXPECT_THAT(linesOf(listed.errors), ElementsAre(HasSubstr(text().string() + ":3: ")));
    folder_.file(u"d");
    EXPECT_THAT(tool({"add", "d"}), FailsWith(6, text().string() + ":3: "));
    EXPECT_EQ(readText(), content);
}

/// A project in a folder of a repository, with a text that lists files beside that folder.
class StoreThatLeadsOutside : public BadStore {
protected:
    void SetUp() override {
        folder_.file(u"beside.txt");
        folder_.file(u"project/a");
        settings_.folder = folder_.onDisk() / "project";
        git({"init", "--quiet", ".."});
        initProject();
        ASSERT_THAT(tool({"add", "a"}), SucceedsSilently());
        auto content = readProjectText();
        content.replace(content.find("\"a\"\n"), 4,
                        "\"..\"\n\"../beside.txt\"\n"
                        "{\"at\":[\"Files\",\"Root\",\"File\",\"../beside.txt\"]}\n\"a\"\n");
        std::ofstream(projectText(), std::ios::binary) << content;
        git({"add", "--all", ".."});
        git({"-c", "user.name=n", "-c", "user.email=e", "commit", "--quiet", "--message=all"});
    }

    std::filesystem::path projectText() const { return settings_.folder / ".projectdata/project.jsonl"; }

    std::string readProjectText() const {
        std::ifstream file(projectText(), std::ios::binary);
        return {std::istreambuf_iterator<char>(file), {}};
    }

    std::string git(std::vector<std::string> arguments) const {
        arguments.insert(arguments.begin(), "git");
        auto const result = runProgram(arguments, settings_);
        EXPECT_EQ(result.exitCode, 0) << result.errors;
        return result.output;
    }
};

TEST_F(StoreThatLeadsOutside, isNotFollowedOnDisk) {
    EXPECT_THAT(tool({"status"}).output, AllOf(HasSubstr("gone ../beside.txt\n"), HasSubstr("gone ..\n")));
}

TEST_F(StoreThatLeadsOutside, isReportedByCheck) {
    auto const checked = tool({"check"});

    EXPECT_EQ(checked.exitCode, 3);
    EXPECT_THAT(checked.output, AllOf(HasSubstr("no file can have the name \"..\""),
                                      HasSubstr("no file can have the name \"../beside.txt\"")));
}

TEST_F(StoreThatLeadsOutside, doesNotUnstageFilesOutside) {
    for (auto const* path : {"../beside.txt", ".."}) {
        EXPECT_THAT(tool({"remove", path}), FailsWith(1, "outside the project's folder"));
    }
    EXPECT_THAT(tool({"remove", "a"}), SucceedsSilently());

    EXPECT_THAT(git({"status", "--porcelain", ".."}), Not(HasSubstr("beside.txt")));
}

TEST_F(BadStore, withATornTailLosesNothing) {
    writeText(readText() + "\"half a ba");

    EXPECT_THAT(tool({"list"}), Prints("a\nb\n"));
    EXPECT_THAT(tool({"add", "c"}), SucceedsSilently());
    EXPECT_THAT(tool({"list"}), Prints("a\nb\nc\n"));
    EXPECT_THAT(readText(), ::testing::Not(HasSubstr("half")));
}

TEST_F(BadStore, thatIsIncompleteIsNeverReadAsAnEmptyProject) {
    auto const whole = readText();
    auto const half = whole.substr(0, whole.size() / 2);

    writeText(half);
    RunningProgram listing(commandFor({"list"}), settings_);
    ASSERT_TRUE(listing.waitUntilItSleeps()); // it waits for the rest of the text
    writeText(whole);
    EXPECT_THAT(listing.finish(), Prints("a\nb\n"));

    writeText(half);
    RunningProgram adding(commandFor({"add", "c"}), settings_);
    ASSERT_TRUE(adding.waitUntilItSleeps());
    writeText(whole);
    EXPECT_THAT(adding.finish(), SucceedsSilently());
    EXPECT_THAT(tool({"list"}), Prints("a\nb\nc\n"));
}

TEST_F(BadStore, withoutItsTextIsAnError) {
    std::filesystem::remove(text());

    EXPECT_THAT(tool({"list"}), FailsWith(5, text().string() + ": the project's text is missing"));
}

TEST_F(BadStore, inAFolderThatCannotBeWrittenIsRead) {
    std::filesystem::permissions(inFolder(".projectdata"), std::filesystem::perms(0555));
    dropPrivileges();

    EXPECT_THAT(tool({"list"}), Prints("a\nb\n"));
    EXPECT_THAT(tool({"add", "c"}), FailsWith(7, inFolder(".projectdata")));
    EXPECT_THAT(tool({"list"}), Prints("a\nb\n"));
}

TEST_F(BadStore, thatCannotBeReadIsAnError) {
    std::filesystem::permissions(inFolder(".projectdata"), std::filesystem::perms::none);
    dropPrivileges();

    EXPECT_THAT(tool({"list"}), FailsWith(7, inFolder(".projectdata")));
}

TEST_F(BadStore, isUnchangedOnAFullDisk) {
    auto const before = readText();
    settings_.fileSize = before.size(); // the text cannot grow

    EXPECT_THAT(tool({"add", "c"}), FailsWith(7, ".projectdata"));

    EXPECT_EQ(readText(), before);
    settings_.fileSize = RLIM_INFINITY;
    EXPECT_THAT(tool({"check"}), SucceedsSilently());
    EXPECT_THAT(tool({"add", "c"}), SucceedsSilently());
}

TEST_F(BadStore, losesNothingInAnAppendOnAFullDisk) {
    std::string const longName(240, 'x');
    for (int number = 0; number < 1200; ++number) {
        folder_.addFile("folder/" + longName + std::to_string(number));
    }
    ASSERT_THAT(tool({"add", "-r", "folder"}), SucceedsSilently());
    auto const before = readText();
    ASSERT_GT(before.size(), 256U * 1024); // from there on batches are appended
    settings_.fileSize = before.size() + 10;

    EXPECT_THAT(tool({"add", "c"}), FailsWith(7, ".projectdata"));

    settings_.fileSize = RLIM_INFINITY;
    EXPECT_EQ(list().size(), 1203U);
    EXPECT_THAT(tool({"add", "c"}), SucceedsSilently());
    EXPECT_EQ(list().size(), 1204U);
}

TEST_F(BadStore, thatAnotherProcessHasLockedIsWaitedFor) {
    RunningProgram holder({"flock", ".projectdata", "sh", "-c", "echo held; read line"}, [this] {
        auto settings = settings_;
        settings.inputStaysOpen = true;
        return settings;
    }());
    ASSERT_TRUE(holder.waitUntilItSleeps());
    RunningProgram adding(commandFor({"add", "c"}), settings_);
    ASSERT_TRUE(adding.waitUntilItSleeps());
    EXPECT_THAT(tool({"list"}), Prints("a\nb\n")); // a reader does not wait

    EXPECT_EQ(holder.finish("\n").output, "held\n");

    EXPECT_THAT(adding.finish(), SucceedsSilently());
    EXPECT_THAT(tool({"list"}), Prints("a\nb\nc\n"));
}

} // namespace
} // namespace project::test
