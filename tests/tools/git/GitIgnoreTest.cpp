#include "git/GitIgnore.hpp"

#include "tools/ToolTest.hpp"

namespace project::test {
namespace {

using ::testing::ElementsAre;

/// A project in the root of a git repository.
class GitIgnore : public ToolTest {
protected:
    GitIgnore() {
        settings_.environment["GIT_CONFIG_GLOBAL"] = "/dev/null";
        settings_.environment["GIT_CONFIG_NOSYSTEM"] = "1";
    }

    void SetUp() override {
        initProject();
        git({"init", "--quiet"});
    }

    void git(std::vector<std::string> arguments) const {
        arguments.insert(arguments.begin(), "git");
        auto const result = runProgram(arguments, settings_);
        ASSERT_EQ(result.exitCode, 0) << result.errors;
    }
};

TEST_F(GitIgnore, leavesOutIgnoredFiles) {
    folder_.file(u".gitignore", "*.o\n/build/\n");
    folder_.file(u"src/main.cpp");
    folder_.file(u"src/main.o");
    folder_.file(u"build/deep/main.cpp");
    folder_.file(u"src/build/kept.cpp");

    EXPECT_THAT(tool({"add", "--recursive", "--gitignore", "."}), SucceedsSilently());

    EXPECT_THAT(list(), ElementsAre(".gitignore", "src", "src/build", "src/build/kept.cpp", "src/main.cpp"));
}

TEST_F(GitIgnore, keepsTrackedFilesThatMatchAPattern) {
    folder_.file(u".gitignore", "*.o\nbuild\n");
    folder_.file(u"tracked.o");
    folder_.file(u"build/tracked");
    folder_.file(u"build/other");
    folder_.file(u"other.o");
    git({"add", "--force", "tracked.o", "build/tracked"});

    EXPECT_THAT(tool({"add", "-r", "--gitignore", "."}), SucceedsSilently());

    EXPECT_THAT(list(), ElementsAre(".gitignore", "build", "build/tracked", "tracked.o"));
}

TEST_F(GitIgnore, addsAnIgnoredFileThatIsNamed) {
    folder_.file(u".gitignore", "*.o\n");
    folder_.file(u"main.o");

    EXPECT_THAT(tool({"add", "-r", "--gitignore", "main.o"}), SucceedsSilently());

    EXPECT_THAT(list(), ElementsAre("main.o"));
}

TEST_F(GitIgnore, worksForAProjectDeepInARepository) {
    folder_.file(u".gitignore", "*.o\n");
    folder_.file(u"project/main.cpp");
    folder_.file(u"project/main.o");
    folder_.file(u"project/tracked.o");
    git({"add", "--force", "project/tracked.o"});
    ASSERT_THAT(toolFrom("project", {"init"}), SucceedsSilently());

    EXPECT_THAT(toolFrom("project", {"add", "-r", "--gitignore", "."}), SucceedsSilently());

    EXPECT_THAT(toolFrom("project", {"list"}), Prints("main.cpp\ntracked.o\n"));
}

TEST_F(GitIgnore, passesUnusualNamesToGitUnchanged) {
    folder_.addFile(".gitignore", "*.o\n");
    for (auto const* name :
         {"a\nb", ":(top)c", "d\xFF", "!e", "*.o.kept", "space at end ", "f\nb.o", ":!g.o", "h\xFF.o"}) {
        folder_.addFile(name);
    }

    EXPECT_THAT(tool({"add", "-r", "--gitignore", "."}), SucceedsSilently());

    EXPECT_THAT(tool({"list", "-0"}), Prints(withZeros({"!e", "*.o.kept", ".gitignore", ":(top)c", "a\nb",
                                                        "d\xFF", "space at end "})));
}

TEST_F(GitIgnore, keepsRepositoriesInsideTheRepository) {
    folder_.file(u".gitignore", "*.o\n");
    folder_.file(u"inner/main.cpp");
    folder_.file(u"inner/main.o");
    git({"init", "--quiet", "inner"});

    EXPECT_THAT(tool({"add", "-r", "--gitignore", "."}), SucceedsSilently());

    EXPECT_THAT(list(), ElementsAre(".gitignore", "inner", "inner/main.cpp"));
}

TEST_F(GitIgnore, acceptsAnUnreadableFolderThatGitIgnores) {
    folder_.file(u".gitignore", "/closed/\n");
    folder_.file(u"closed/file");
    std::filesystem::permissions(inFolder("closed"), std::filesystem::perms::none);
    dropPrivileges();

    EXPECT_THAT(tool({"add", "-r", "--gitignore", "--no-source-control", "."}), SucceedsSilently());

    std::filesystem::permissions(inFolder("closed"), std::filesystem::perms::all);
    EXPECT_THAT(list(), ElementsAre(".gitignore"));
}

TEST_F(GitIgnore, leavesIgnoredFilesOutOfTheStatus) {
    folder_.file(u".gitignore", "*.o\n");
    folder_.file(u"a.cpp");
    folder_.file(u"a.o");
    folder_.file(u"b.cpp");

    EXPECT_THAT(tool({"status", "--gitignore", "--no-source-control"}),
                Prints("new  .gitignore\nnew  a.cpp\nnew  b.cpp\n"));
}

TEST_F(GitIgnore, isRefusedWithoutRecursive) {
    EXPECT_THAT(tool({"add", "--gitignore", "."}), FailsWith(2, "--gitignore requires --recursive"));
}

TEST_F(GitIgnore, reportsThatThereIsNoRepository) {
    folder_.file(u"file");
    folder_.remove(u".git");
    settings_.environment["GIT_CEILING_DIRECTORIES"] = folder_.onDisk().parent_path();

    EXPECT_THAT(tool({"add", "-r", "--gitignore", "."}),
                FailsWith(1, "git cannot list ignored files: fatal: not a git repository"));

    EXPECT_THAT(list(), ElementsAre());
}

TEST_F(GitIgnore, reportsThatGitIsNotInstalled) {
    folder_.file(u"file");
    settings_.environment["PATH"] = "/nonexistent";

    EXPECT_THAT(tool({"add", "-r", "--gitignore", "."}), FailsWith(1, "git, which is not installed"));
}

TEST_F(GitIgnore, reportsThatGitCannotBeStarted) {
    folder_.file(u"file");
    folder_.file(u"bin/git");
    settings_.environment["PATH"] = inFolder("bin");

    EXPECT_THAT(tool({"add", "-r", "--gitignore", "."}),
                FailsWith(1, "git cannot list ignored files: \"git\" cannot be started: Permission denied"));
}

TEST_F(GitIgnore, reportsAGitThatFailsWithoutAMessage) {
    folder_.file(u"file");
    folder_.file(u"bin/git", "#!/bin/sh\nkill -9 $$\n");
    std::filesystem::permissions(inFolder("bin/git"), std::filesystem::perms::owner_all);
    settings_.environment["PATH"] = inFolder("bin");

    EXPECT_THAT(tool({"add", "-r", "--gitignore", "."}),
                FailsWith(1, "git cannot list ignored files: unknown error"));
}

TEST_F(GitIgnore, acceptsAHundredThousandPathsAtOnce) {
    folder_.file(u".gitignore", "*.o\n");
    std::vector<fl::filesystem::Path> paths; // they need not exist for git
    for (int number = 0; number < 100'000; ++number) {
        auto const name = "folder/file" + std::to_string(number) + (number % 2 == 0 ? ".o" : ".c");
        paths.push_back(folder_.root() / fl::filesystem::fromSystem(name));
    }

    auto const kept = projectctl::withoutIgnoredByGit(folder_.root(), paths);

    ASSERT_EQ(kept.size(), 50'000U);
    EXPECT_EQ(kept.front(), paths[1]);
    EXPECT_EQ(kept.back(), paths.back());
}

} // namespace
} // namespace project::test
