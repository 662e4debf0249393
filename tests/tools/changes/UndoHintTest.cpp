#include "support/GitFolder.hpp"
#include "tools/ToolTest.hpp"

namespace project::test {
namespace {

using ::testing::HasSubstr;
using ::testing::Not;

/// A project in a git repository with some committed files and labels, used on a terminal.
class UndoHint : public ToolTest {
protected:
    void SetUp() override {
        ASSERT_EQ(tool({"init", "--add"}).exitCode, 0);
        for (int number = 0; number < many; ++number) {
            files_.push_back("src/file" + std::to_string(number));
            folder_.addFile(files_.back());
        }
        ASSERT_EQ(tool({"add", "-r", "src"}).exitCode, 0);
        ASSERT_EQ(tool({"category", "create", "Status"}).exitCode, 0);
        ASSERT_EQ(tool({"label", "create", "Status", "Open"}).exitCode, 0);
        ASSERT_EQ(tool(put("Open")).exitCode, 0);
        ASSERT_EQ(tool({"label", "create", "Status", "Done"}).exitCode, 0);
        git_.commitAll();
        before_ = readText();
        settings_.onTerminal = true;
    }

    std::vector<std::string> put(std::string const& label) const {
        std::vector<std::string> arguments{"label", "put", "Status", label};
        arguments.insert(arguments.end(), files_.begin(), files_.end());
        return arguments;
    }

    /// The command of the hint in an output; empty if there is no hint.
    static std::string commandIn(std::string const& output) {
        static std::string const mark = "To undo it: ";
        auto const found = output.find(mark);
        return found == std::string::npos
                   ? ""
                   : output.substr(found + mark.size(), output.find('\r', found) - found - mark.size());
    }

    /// Follows the hint from another folder, and expects the state of the last commit.
    void expectUndone(std::vector<std::string> const& arguments) const {
        auto const command = commandIn(tool(arguments).output);
        ASSERT_NE(command, "") << arguments.front();
        EXPECT_NE(readText(), before_);
        ProgramSettings elsewhere;
        auto const result = runProgram({"/bin/sh", "-c", command}, elsewhere);
        EXPECT_EQ(result.exitCode, 0) << command << ": " << result.errors;
        EXPECT_EQ(readText(), before_) << command;
        EXPECT_EQ(git_.run({"status", "--porcelain", "--untracked-files=no"}), "") << command;
    }

    void writeFile(std::string const& name, std::string const& content) const {
        std::ofstream(inFolder(name), std::ios::binary) << content;
    }

    /// A table that adds files, which have this beginning and a number.
    static std::string tableOf(std::string const& files) {
        std::string result = "path\n";
        for (int number = 0; number < many; ++number) {
            result += files + std::to_string(number) + '\n';
        }
        return result;
    }

    static constexpr int many = 12;
    GitFolder const git_{folder_.onDisk()};
    std::vector<std::string> files_;
    std::string before_;
};

TEST_F(UndoHint, restoresTheTextToTheByteAfterChangesOfLabels) {
    expectUndone(put("Done"));
    expectUndone({"label", "delete", "Status", "Open"});
    expectUndone({"category", "delete", "Status"});
}

TEST_F(UndoHint, restoresTheTextAndTheIndexAfterChangesOfTheFileList) {
    expectUndone({"remove", "src"});
    for (int number = 0; number < many; ++number) {
        folder_.addFile("more/file" + std::to_string(number));
    }
    expectUndone({"add", "-r", "more"});
    writeFile("rows.csv", tableOf("more/file"));
    expectUndone({"import", "csv", "rows.csv"});
}

TEST_F(UndoHint, isOneForAWholeBatch) {
    std::string lines;
    for (auto const& file : files_) {
        lines += "label put Status Done " + file + '\n';
    }
    writeFile("batch", lines + "remove src\n");

    expectUndone({"batch", "batch"});
}

TEST_F(UndoHint, worksForANameWithSpecialCharacters) {
    auto const other = folder_.onDisk() / "it's $HOME";
    std::filesystem::create_directories(other);
    GitFolder const git(other);
    settings_.folder = other;
    settings_.onTerminal = false;
    for (int number = 0; number < many; ++number) {
        std::ofstream(other / std::to_string(number)) << "content";
    }
    ASSERT_EQ(tool({"init"}).exitCode, 0);
    git.commitAll();
    settings_.onTerminal = true;

    auto const command = commandIn(tool({"add", "-r", "."}).output);

    EXPECT_EQ(runProgram({"/bin/sh", "-c", command}, {}).exitCode, 0) << command;
    EXPECT_EQ(git.run({"status", "--porcelain", "--untracked-files=no"}), "");
}

TEST_F(UndoHint, isNotGivenForAFewFiles) {
    EXPECT_THAT(tool({"label", "put", "Status", "Done", files_[0], files_[1]}).output,
                Not(HasSubstr("undo")));
}

TEST_F(UndoHint, isNotGivenInAPipeOrWithQuietOrWithoutSourceControl) {
    EXPECT_EQ(commandIn(tool({"remove", "src", "--dry-run"}).output), "");
    auto arguments = put("Done");
    arguments.emplace_back("--quiet");
    EXPECT_EQ(commandIn(tool(arguments).output), "");
    git_.run({"reset", "-q", "--hard"});
    arguments.back() = "--no-source-control";
    EXPECT_EQ(commandIn(tool(arguments).output), "");
    git_.run({"reset", "-q", "--hard"});
    settings_.onTerminal = false;
    EXPECT_THAT(tool(put("Done")), SucceedsSilently());
}

TEST_F(UndoHint, isNotGivenIfTheTextWasChangedBefore) {
    ASSERT_EQ(tool({"name", "Other"}).exitCode, 0);

    EXPECT_EQ(commandIn(tool(put("Done")).output), "");
}

TEST_F(UndoHint, isNotGivenIfGitDoesNotTrackTheText) {
    git_.run({"rm", "-rq", "--cached", ".projectdata"});
    git_.run({"commit", "-qm", "untracked"});

    EXPECT_EQ(commandIn(tool(put("Done")).output), "");
}

TEST_F(UndoHint, ofTheFileListIsNotGivenIfTheIndexHasOtherChanges) {
    folder_.addFile("other");
    git_.run({"add", "other"});

    EXPECT_NE(commandIn(tool(put("Done")).output), ""); // concerns the text alone
    git_.run({"restore", "--staged", "--worktree", ".projectdata/project.jsonl"});
    EXPECT_EQ(commandIn(tool({"remove", "src"}).output), "");
}

} // namespace
} // namespace project::test
