#include "support/GitFolder.hpp"
#include "tools/ToolTest.hpp"

namespace project::test {
namespace {

using ::testing::AllOf;
using ::testing::HasSubstr;

/// A folder in a git repository.
class InRepository : public ToolTest {
protected:
    void SetUp() override {
        folder_.file(u"src/io/pump.cpp");
        folder_.file(u"src/main.cpp");
    }

    std::string status() const { return git_.run({"status", "--porcelain", "--untracked-files=all"}); }

    std::string staged() const { return git_.run({"show", ":.projectdata/project.jsonl"}); }

    static constexpr char const* storeAdded =
        "A  .projectdata/.gitattributes\nA  .projectdata/.gitignore\nA  .projectdata/project.jsonl\n";

    GitFolder const git_{folder_.onDisk()};
};

TEST_F(InRepository, initStagesTheProjectsFiles) {
    ASSERT_THAT(tool({"init"}), SucceedsSilently());

    EXPECT_EQ(status(), std::string(storeAdded) + "?? src/io/pump.cpp\n?? src/main.cpp\n");
    EXPECT_EQ(staged(), readText());
}

TEST_F(InRepository, addStagesTheFilesAndTheirEntries) {
    ASSERT_THAT(tool({"init"}), SucceedsSilently());
    ASSERT_THAT(tool({"add", "-r", "."}), SucceedsSilently());

    EXPECT_EQ(status(), std::string(storeAdded) + "A  src/io/pump.cpp\nA  src/main.cpp\n");
    EXPECT_EQ(staged(), readText());
}

TEST_F(InRepository, removeDeletesTheFilesFromTheIndexAndNotFromTheDisk) {
    ASSERT_THAT(tool({"init"}), SucceedsSilently());
    ASSERT_THAT(tool({"add", "-r", "."}), SucceedsSilently());
    git_.commitAll();

    ASSERT_THAT(tool({"remove", "src/io"}), SucceedsSilently());

    EXPECT_EQ(status(), "M  .projectdata/project.jsonl\nD  src/io/pump.cpp\n?? src/io/pump.cpp\n");
    EXPECT_EQ(staged(), readText());
}

TEST_F(InRepository, addStagesFilesAgainWhoseRemovalIsNotCommitted) {
    ASSERT_THAT(tool({"init"}), SucceedsSilently());
    ASSERT_THAT(tool({"add", "-r", "."}), SucceedsSilently());
    git_.commitAll();
    ASSERT_THAT(tool({"remove", "src"}), SucceedsSilently());

    ASSERT_THAT(tool({"add", "-r", "src"}), SucceedsSilently());

    EXPECT_EQ(status(), "");
}

TEST_F(InRepository, addStagesAgainAFileThatIsInTheProjectAndWasRemovedFromTheIndex) {
    ASSERT_THAT(tool({"init"}), SucceedsSilently());
    ASSERT_THAT(tool({"add", "-r", "."}), SucceedsSilently());
    git_.commitAll();
    git_.run({"rm", "--cached", "-q", "src/main.cpp"});
    ASSERT_EQ(status(), "D  src/main.cpp\n?? src/main.cpp\n");

    ASSERT_THAT(tool({"add", "src/main.cpp"}), SucceedsSilently());

    EXPECT_EQ(status(), "");
}

TEST_F(InRepository, removeNamesTrackedFilesThatWereNeverInTheProject) {
    ASSERT_THAT(tool({"init"}), SucceedsSilently());
    ASSERT_THAT(tool({"add", "src/main.cpp"}), SucceedsSilently());
    git_.commitAll();

    auto const removed = tool({"remove", "src"});

    EXPECT_EQ(removed.exitCode, 0);
    EXPECT_EQ(removed.errors, "projectctl: warning: \"src/io/pump.cpp\" is below a removed folder but not in "
                              "the project; git will no "
                              "longer track it\n");
    EXPECT_THAT(status(), HasSubstr("D  src/io/pump.cpp\n"));
}

TEST_F(InRepository, everyOtherChangeStagesTheTextAlone) {
    ASSERT_THAT(tool({"init"}), SucceedsSilently());
    ASSERT_THAT(tool({"add", "src/main.cpp"}), SucceedsSilently());
    git_.commitAll();

    for (auto const& command :
         std::vector<std::vector<std::string>>{{"name", "Engine"},
                                               {"category", "create", "Status"},
                                               {"label", "create", "Status", "Done"},
                                               {"label", "put", "Status", "Done", "src/main.cpp"},
                                               {"entry", "set", "src/main.cpp"},
                                               {"group", "create", "Nightly"},
                                               {"path", "add", "src"},
                                               {"reference", "add", "."}}) {
        ASSERT_THAT(tool(command), SucceedsSilently());
        EXPECT_EQ(status(), "M  .projectdata/project.jsonl\n") << ::testing::PrintToString(command);
        EXPECT_EQ(staged(), readText());
    }
}

TEST_F(InRepository, tidyStagesTheTidyText) {
    ASSERT_THAT(tool({"init"}), SucceedsSilently());
    ASSERT_THAT(tool({"add", "-r", "."}), SucceedsSilently());
    git_.commitAll();
    auto const tidied = readText();
    insertLineBefore("\"src/main.cpp\"", "\"zebra\"");

    ASSERT_THAT(tool({"tidy"}), SucceedsSilently());

    EXPECT_NE(readText(), tidied);
    EXPECT_EQ(staged(), readText());
}

TEST_F(InRepository, queriesStageNothing) {
    ASSERT_THAT(tool({"init"}), SucceedsSilently());
    git_.commitAll();
    insertLineBefore("{\"at\":[\"Info\"", "\"src\"");
    auto const before = status();

    for (auto const& command : std::vector<std::vector<std::string>>{
             {"list"}, {"status"}, {"check"}, {"name"}, {"label", "list"}}) {
        tool(command);
    }

    EXPECT_EQ(before, " M .projectdata/project.jsonl\n");
    EXPECT_EQ(status(), before);
}

TEST_F(InRepository, doesNotUseGitWithTheOption) {
    ASSERT_THAT(tool({"init", "--no-source-control"}), SucceedsSilently());
    ASSERT_THAT(tool({"--no-source-control", "add", "-r", "."}), SucceedsSilently());
    EXPECT_THAT(status(), ::testing::Not(HasSubstr("A ")));
    git_.commitAll();

    EXPECT_THAT(tool({"remove", "src", "--no-source-control"}), SucceedsSilently());

    EXPECT_EQ(status(), " M .projectdata/project.jsonl\n");
}

TEST_F(InRepository, changesNothingWhenTheIndexIsLocked) {
    ASSERT_THAT(tool({"init"}), SucceedsSilently());
    auto const before = readText();
    folder_.addFile(".git/index.lock");

    EXPECT_THAT(tool({"add", "src/main.cpp"}), FailsWith(4, inFolder(".git/index.lock")));

    EXPECT_EQ(readText(), before);
    std::filesystem::remove(inFolder(".git/index.lock"));
    EXPECT_THAT(tool({"add", "src/main.cpp"}), SucceedsSilently());
}

TEST_F(InRepository, doesNotStageIgnoredFiles) {
    folder_.file(u".gitignore", "*.cpp\n");
    ASSERT_THAT(tool({"init"}), SucceedsSilently());

    ASSERT_THAT(tool({"add", "src/main.cpp"}), SucceedsSilently());

    EXPECT_THAT(list(), ::testing::ElementsAre("src", "src/main.cpp"));
    EXPECT_EQ(status(), std::string(storeAdded) + "?? .gitignore\n");
}

TEST_F(InRepository, usesTheRepositoryThatTheEnvironmentNames) {
    std::filesystem::rename(inFolder(".git"), inFolder("elsewhere.git"));
    settings_.environment["GIT_DIR"] = inFolder("elsewhere.git");
    settings_.environment["GIT_WORK_TREE"] = folder_.onDisk().string();
    ASSERT_THAT(tool({"init"}), SucceedsSilently());

    EXPECT_THAT(git_.run({"--git-dir=elsewhere.git", "--work-tree=.", "status", "--porcelain", "-uno"}),
                ::testing::Eq(storeAdded));
}

TEST_F(InRepository, ignoresAUserConfigurationThatCannotBeRead) {
    auto const unreadable = folder_.addFile("home/.gitconfig");
    std::filesystem::permissions(unreadable, std::filesystem::perms::none);
    settings_.environment["HOME"] = inFolder("home");
    dropPrivileges();

    EXPECT_THAT(tool({"init"}), SucceedsSilently());

    EXPECT_TRUE(std::filesystem::exists(inFolder(".git/index")));
}

} // namespace
} // namespace project::test
