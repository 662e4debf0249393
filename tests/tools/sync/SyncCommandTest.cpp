#include <csignal>

#include <unistd.h>

#include "support/GitFolder.hpp"
#include "tools/ToolTest.hpp"
#include "tools/merge/MergingProject.hpp"

namespace project::test {
namespace {

using ::testing::AnyOf;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::Not;

using Lines = std::vector<std::string>;

/// Folders that keep themselves up to date, outside a repository.
class SyncCommand : public ToolTest {
protected:
    void SetUp() override { initProject(); }
};

TEST_F(SyncCommand, bringsAFolderUpToDate) {
    folder_.file(u"src/old.c");
    folder_.file(u"doc/a.md");
    ASSERT_THAT(tool({"add", "src/old.c"}), SucceedsSilently());
    ASSERT_THAT(tool({"sync", "--rule", "src"}), SucceedsSilently());
    folder_.remove(u"src/old.c");
    folder_.file(u"src/new.c");

    EXPECT_THAT(tool({"sync"}), SucceedsSilently());

    EXPECT_EQ(list(), (Lines{"src", "src/new.c"}));
}

TEST_F(SyncCommand, withoutARuleDoesNothing) {
    folder_.file(u"src/a.c");

    EXPECT_THAT(tool({"sync"}), SucceedsSilently());

    EXPECT_THAT(list(), IsEmpty());
}

TEST_F(SyncCommand, listsRulesAsTheyAreSet) {
    folder_.folder(u"src/it's");
    ASSERT_THAT(tool({"sync", "--rule", "src", "--include", "**/*.c", "--include", "*.h", "--exclude", "out",
                      "--no-gitignore"}),
                SucceedsSilently());
    ASSERT_THAT(tool({"sync", "--rule", "src/it's"}), SucceedsSilently());
    ASSERT_THAT(tool({"sync", "--rule", "."}), SucceedsSilently());

    EXPECT_THAT(tool({"sync", "--rules"}),
                Prints(".\n"
                       "src --include '**/*.c' --include '*.h' --exclude 'out' --no-gitignore\n"
                       "src/it's\n"));
    EXPECT_THAT(toolFrom("src", {"sync", "--rules"}).output, HasSubstr("\nit's\n"));
}

TEST_F(SyncCommand, removesARule) {
    folder_.folder(u"src");
    ASSERT_THAT(tool({"sync", "--rule", "src"}), SucceedsSilently());

    EXPECT_THAT(tool({"sync", "--remove-rule", "src"}), SucceedsSilently());

    EXPECT_THAT(tool({"sync", "--rules"}), SucceedsSilently());
    EXPECT_THAT(tool({"sync", "--remove-rule", "src"}), FailsWith(1, "the folder \"src\" has no rule"));
}

TEST_F(SyncCommand, refusesWrongRules) {
    EXPECT_THAT(tool({"sync", "--rule", "none"}), FailsWith(1, "cannot keep itself up to date"));
    EXPECT_THAT(tool({"sync", "--rule", ".", "--include", ""}), FailsWith(2, "must not be empty"));
    EXPECT_THAT(tool({"sync", "--include", "*.c"}), FailsWith(2, "--rule"));
    EXPECT_THAT(tool({"sync", "--rules", "--rule", "."}), FailsWith(2, "--rule"));
    EXPECT_THAT(tool({"sync", "--force", "--remove-rule", "."}), FailsWith(2, "--remove-rule"));
}

TEST_F(SyncCommand, aDryRunShowsEverythingAndChangesNothing) {
    folder_.file(u"src/old.c");
    folder_.file(u"src/same.c");
    ASSERT_EQ(tool({"batch"}, "add -r src\ncategory create Status\nlabel create Status Open\n"
                              "label put Status Open src/old.c\nentry set src/old.c --name Main\n"
                              "sync --rule src\n")
                  .exitCode,
              0);
    folder_.remove(u"src/old.c");
    folder_.file(u"src/io/new.c");
    auto const before = readText();

    auto const result = tool({"sync", "--dry-run"});

    EXPECT_EQ(result.exitCode, 0);
    EXPECT_EQ(result.output, "entry remove src/old.c\nadd src/io\nadd src/io/new.c\nremove src/old.c\n");
    EXPECT_EQ(result.errors, "projectctl: warning: \"src/old.c\" is gone from disk and loses the label "
                             "Status=Open, the entry point Main\n");
    EXPECT_EQ(readText(), before);

    auto const json = tool({"sync", "--dry-run", "--json"});

    EXPECT_EQ(json.output, "{\"format\": \"projectctl-sync\", \"version\": 1, \"applied\": false, "
                           "\"renamed\": [], \"added\": [\n"
                           "{\"path\": \"src/io/new.c\", \"kind\": \"file\"}\n"
                           "], \"removed\": [\n"
                           "{\"path\": \"src/old.c\", \"kind\": \"file\", \"labels\": [\"Status=Open\"], "
                           "\"entryPoints\": [\"Main\"]}\n"
                           "]}\n");
    EXPECT_EQ(readText(), before);
}

TEST_F(SyncCommand, listsWhatIsLost) {
    folder_.file(u"src/old.c");
    folder_.file(u"src/same.c");
    ASSERT_EQ(tool({"batch"}, "add -r src\ncategory create Status\nlabel create Status Open\n"
                              "label put Status Open src/old.c\nsync --rule src\n")
                  .exitCode,
              0);
    folder_.remove(u"src/old.c");

    EXPECT_EQ(tool({"sync"}).errors,
              "projectctl: warning: \"src/old.c\" is gone from disk and loses the label Status=Open\n");
}

TEST_F(SyncCommand, aMissingFolderNeedsForce) {
    folder_.file(u"src/a.c");
    ASSERT_EQ(tool({"batch"}, "add -r src\nsync --rule src\n").exitCode, 0);
    folder_.remove(u"src");
    auto const before = readText();

    EXPECT_THAT(tool({"sync"}), FailsWith(1, "the folder \"src\" is missing or empty"));
    EXPECT_THAT(tool({"sync"}).errors, HasSubstr("sync --force"));
    EXPECT_EQ(readText(), before);

    EXPECT_THAT(tool({"sync", "--force"}), SucceedsSilently());

    EXPECT_EQ(list(), Lines{"src"});
}

TEST_F(SyncCommand, aFolderThatCannotBeReadLosesNothing) {
    folder_.file(u"src/a.c");
    folder_.file(u"src/closed/b.c");
    ASSERT_EQ(tool({"batch"}, "add -r src\nsync --rule src\n").exitCode, 0);
    std::filesystem::permissions(inFolder("src/closed"), std::filesystem::perms::none);
    folder_.file(u"src/c.c");
    std::filesystem::permissions(inFolder(".projectdata"), std::filesystem::perms::all);
    dropPrivileges();

    auto const result = tool({"sync", "--dry-run"});

    std::filesystem::permissions(inFolder("src/closed"), std::filesystem::perms::all);
    EXPECT_THAT(result.errors,
                HasSubstr("warning: the folder \"" + inFolder("src/closed") + "\" cannot be read"));
    EXPECT_THAT(result.output, Not(HasSubstr("remove")));
}

TEST_F(SyncCommand, statusAndCheckReportWhatIsNotUpToDate) {
    folder_.file(u"src/old.c");
    folder_.file(u"src/same.c");
    ASSERT_EQ(tool({"batch"}, "add -r src\nsync --rule src --include '*.c'\n").exitCode, 0);
    EXPECT_EQ(tool({"check"}).exitCode, 0);
    folder_.file(u"outside");
    folder_.file(u"src/note.txt");
    EXPECT_EQ(tool({"check"}).exitCode, 0) << "a file that no rule covers is not a finding";
    folder_.file(u"src/new.c");
    folder_.remove(u"src/old.c");

    auto const check = tool({"check"});

    EXPECT_EQ(check.exitCode, 3);
    EXPECT_EQ(check.output,
              "the file \"src/new.c\" is new in a folder that keeps itself up to date: 'projectctl "
              "sync' adds it\n"
              "\"src/old.c\" is gone from a folder that keeps itself up to date: 'projectctl sync' "
              "removes it from the project\n");
    EXPECT_THAT(tool({"check", "--json"}).output, HasSubstr("\"code\": \"sync-new\""));
    EXPECT_THAT(tool({"status"}).output, HasSubstr("bad  the file \"src/new.c\" is new in"));
    EXPECT_THAT(tool({"status", "--json"}).output, HasSubstr("\"code\": \"sync-gone\""));

    ASSERT_THAT(tool({"sync"}), SucceedsSilently());

    EXPECT_EQ(tool({"check"}).exitCode, 0);
}

TEST_F(SyncCommand, checkReportsAMissingFolder) {
    folder_.file(u"src/a.c");
    ASSERT_EQ(tool({"batch"}, "add -r src\nsync --rule src\n").exitCode, 0);
    folder_.remove(u"src");

    EXPECT_THAT(tool({"check", "--json"}).output, HasSubstr("\"code\": \"sync-folder-missing\""));
}

TEST_F(SyncCommand, aRuleWhoseFolderWasLeftBehindIsANote) {
    folder_.file(u"src/a.c");
    ASSERT_EQ(tool({"batch"}, "add -r src\nsync --rule src\nadopt src/a.c lib/a.c\n").exitCode, 0);
    std::filesystem::rename(inFolder("src"), inFolder("lib"));

    EXPECT_THAT(tool({"status", "--json"}).output,
                HasSubstr("{\"code\": \"sync-folder-absent\", \"fault\": false, \"path\": \"src\""));
    auto const sync = tool({"sync"});
    EXPECT_EQ(sync.exitCode, 0);
    EXPECT_THAT(sync.errors, HasSubstr("warning: the folder \"src\" has a rule and does not exist"));

    ASSERT_EQ(tool({"batch"}, "sync --rule lib\nsync --remove-rule src\n").exitCode, 0);
    EXPECT_EQ(tool({"sync"}).errors, "");
}

TEST_F(SyncCommand, aRuleBelowAFolderWithoutOneIsSound) {
    folder_.file(u"src/io/a.c");
    ASSERT_EQ(tool({"batch"}, "sync --rule src/io\nsync\n").exitCode, 0);

    EXPECT_THAT(tool({"check"}), SucceedsSilently());
}

TEST_F(SyncCommand, anInterruptedRunLeavesTheOldOrTheNewState) {
    for (int number = 0; number < 300; ++number) {
        folder_.addFile("src/old" + std::to_string(number));
    }
    ASSERT_EQ(tool({"batch"}, "add -r src\nsync --rule src\n").exitCode, 0);
    auto const before = list();
    for (int number = 0; number < 300; ++number) {
        folder_.remove(u"src/old" + std::u16string(1, static_cast<char16_t>(u'0' + number % 10)));
        folder_.addFile("src/new" + std::to_string(number));
    }
    Lines after{"src"};
    for (int number = 0; number < 300; ++number) {
        after.push_back("src/new" + std::to_string(number));
    }
    for (int number = 10; number < 300; ++number) {
        after.push_back("src/old" + std::to_string(number));
    }
    std::ranges::sort(after);
    for (useconds_t wait = 0; wait < 60'000; wait += 2'000) {
        RunningProgram syncing(commandFor({"sync"}), settings_);
        usleep(wait);
        syncing.sendSignal(SIGKILL);
        syncing.finish();

        auto const listed = list();

        ASSERT_THAT(listed, AnyOf(before, after)) << "after " << wait << " microseconds";
        if (listed == after) {
            return;
        }
    }
}

/// The same in a repository.
class SyncCommandInRepository : public MergingProject {};

TEST_F(SyncCommandInRepository, ignoredFilesAreNotAddedAndTheChangeIsStaged) {
    folder_.file(u".gitignore", "*.o\n");
    folder_.file(u"src/a.c");
    folder_.file(u"src/a.o");
    ASSERT_THAT(tool({"sync", "--rule", "src"}), SucceedsSilently());

    ASSERT_THAT(tool({"sync"}), SucceedsSilently());

    EXPECT_EQ(list(), (Lines{"a", "b", "c", "src", "src/a.c"}));
    EXPECT_EQ(git_.run({"status", "--porcelain", "--untracked-files=all"}),
              "M  .projectdata/project.jsonl\nA  src/a.c\n?? .gitignore\n");
}

TEST_F(SyncCommandInRepository, aFileThatWasRemovedAndIsBackIsStagedAgain) {
    folder_.file(u"src/a.c");
    ASSERT_EQ(tool({"batch"}, "add -r src\nsync --rule src\n").exitCode, 0);
    commit("src");
    ASSERT_THAT(tool({"remove", "src/a.c"}), SucceedsSilently());

    ASSERT_THAT(tool({"sync"}), SucceedsSilently());

    EXPECT_EQ(git_.run({"status", "--porcelain"}), "");
}

TEST_F(SyncCommandInRepository, aCommitHookRefusesAFileThatIsNotListed) {
    folder_.file(u"src/a.c");
    ASSERT_EQ(tool({"batch"}, "add -r src\nsync --rule src\n").exitCode, 0);
    folder_.addFile(".git/hooks/pre-commit", "#!/bin/sh\nexec " PROJECTCTL " check\n");
    std::filesystem::permissions(inFolder(".git/hooks/pre-commit"), std::filesystem::perms::all);
    commit("src");
    folder_.file(u"src/b.c");
    folder_.file(u"elsewhere");
    git_.run({"add", "src/b.c", "elsewhere"});

    EXPECT_NE(git_.tryTo({"commit", "-q", "-m", "unlisted"}).exitCode, 0);

    ASSERT_THAT(tool({"sync"}), SucceedsSilently());
    EXPECT_EQ(git_.tryTo({"commit", "-q", "-m", "listed"}).exitCode, 0);
}

TEST_F(SyncCommandInRepository, renamedFilesKeepTheirLabels) {
    folder_.file(u"src/a.c", "the first\n");
    folder_.file(u"src/b.c", "the second\n");
    ASSERT_EQ(tool({"batch"}, "add -r src\nsync --rule src\nlabel put Status Open src/a.c\n").exitCode, 0);
    commit("src");
    std::filesystem::create_directories(inFolder("src/io"));
    std::filesystem::rename(inFolder("src/a.c"), inFolder("src/io/new.c"));
    folder_.file(u"src/c.c", "the third\n");
    folder_.remove(u"src/b.c");
    auto const before = readText();

    auto const dryRun = tool({"sync", "--dry-run", "--json"});

    EXPECT_THAT(dryRun.output,
                HasSubstr("\"renamed\": [\n{\"from\": \"src/a.c\", \"to\": \"src/io/new.c\"}\n]"));
    EXPECT_EQ(readText(), before);

    EXPECT_THAT(tool({"sync"}), SucceedsSilently());

    EXPECT_THAT(tool({"list", "--label", "Status=Open"}), Prints("src/io/new.c\n"));
    EXPECT_EQ(list(), (Lines{"a", "b", "c", "src", "src/c.c", "src/io", "src/io/new.c"}));
}

TEST_F(SyncCommandInRepository, aRuleFollowsItsFolderThatAnotherProgramRenamed) {
    folder_.file(u"src/a.c", "the first\n");
    folder_.file(u"src/io/b.c", "the second\n");
    ASSERT_EQ(
        tool({"batch"}, "add -r src\nsync --rule src --include '**/*.c'\nlabel put Status Open src/a.c\n")
            .exitCode,
        0);
    commit("src");
    std::filesystem::rename(inFolder("src"), inFolder("lib"));

    EXPECT_THAT(tool({"sync"}), SucceedsSilently());

    EXPECT_THAT(tool({"sync", "--rules"}), Prints("lib --include '**/*.c'\n"));
    EXPECT_EQ(list(), (Lines{"a", "b", "c", "lib", "lib/a.c", "lib/io", "lib/io/b.c"}));
    EXPECT_THAT(tool({"list", "--label", "Status=Open"}), Prints("lib/a.c\n"));
    EXPECT_THAT(tool({"check"}), SucceedsSilently());
}

TEST_F(SyncCommandInRepository, rulesOfTwoPeopleMerge) {
    folder_.file(u"src/a.c");
    ASSERT_THAT(tool({"setup"}), SucceedsSilently());

    auto const merge = mergeOf({"sync", "--rule", "src", "--include", "*.c"},
                               {"sync", "--rule", "src", "--include", "*.h", "--exclude", "out"});

    EXPECT_EQ(merge.exitCode, 0) << merge.output << merge.errors;
    EXPECT_THAT(tool({"sync", "--rules"}), Prints("src --include '*.c' --include '*.h' --exclude 'out'\n"));
}

} // namespace
} // namespace project::test
