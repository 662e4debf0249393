// Renames in merges by the real git: each kind of merge, both directions, and git's settings.
#include "tools/merge/MergingProject.hpp"

namespace project::test {
namespace {

using ::testing::AllOf;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::Not;
using ::testing::UnorderedElementsAre;

/// A project with a folder of files that are long enough for git to recognise them.
class RenamesOfMerge : public MergingProject {
protected:
    void SetUp() override {
        MergingProject::SetUp();
        folder_.addFolder("src");
        for (auto const* name : {"src/main.cpp", "src/pump.cpp", "src/valve.cpp"}) {
            folder_.addFile(name, linesFor(name));
        }
        ASSERT_THAT(tool({"add", "--recursive", "src"}), SucceedsSilently());
        commit("sources");
    }

    static std::string linesFor(std::string const& name) {
        std::string result;
        for (int line = 0; line < 20; ++line) {
            result += name + ' ' + std::to_string(line) + '\n';
        }
        return result;
    }

    /// Renames files and folders for git and in the project's text, as a person does who edits it.
    void move(std::string const& from, std::string const& to) const {
        git_.run({"mv", from, to});
        auto content = readText();
        for (auto const* end : {"\"", "/"}) {
            for (auto at = content.find('"' + from + end); at != std::string::npos;
                 at = content.find('"' + from + end)) {
                content.replace(at + 1, from.size(), to);
            }
        }
        writeText(content);
        ASSERT_THAT(tool({"tidy"}), SucceedsSilently());
        git_.run({"add", "-A"});
    }

    void label(std::string const& file, std::string const& name = "Open") const {
        ASSERT_THAT(tool({"label", "put", "Status", name, file}), SucceedsSilently());
    }

    void addNew(std::string const& file) const {
        folder_.addFile(file, linesFor(file));
        ASSERT_THAT(tool({"add", file}), SucceedsSilently());
    }

    /// Has one side move the folder, and the other one label a file in it, in a branch of its own.
    void moveHereAndLabelThere(bool isMovedHere) const {
        git_.run({"switch", "-q", "-c", "other"});
        isMovedHere ? label("src/main.cpp") : move("src", "lib");
        commit("there");
        git_.run({"switch", "-q", "-f", "main"});
        isMovedHere ? move("src", "lib") : label("src/main.cpp");
        commit("here");
    }

    void expectLabelAtTheNewPlace() const {
        EXPECT_EQ(tool({"label", "show", "lib/main.cpp"}).output, "Status: Open\n");
        EXPECT_THAT(list(),
                    ElementsAre("a", "b", "c", "lib", "lib/main.cpp", "lib/pump.cpp", "lib/valve.cpp"));
        EXPECT_THAT(tool({"status"}), SucceedsSilently());
        EXPECT_THAT(tool({"check"}), SucceedsSilently());
    }
};

class RenamesInBothDirections : public RenamesOfMerge, public ::testing::WithParamInterface<bool> {};

TEST_P(RenamesInBothDirections, areFollowedInAMerge) {
    moveHereAndLabelThere(GetParam());

    auto const merged = git_.tryTo({"merge", "-q", "-m", "both", "other"});

    EXPECT_EQ(merged.exitCode, 0) << merged.output << merged.errors;
    expectLabelAtTheNewPlace();
}

TEST_P(RenamesInBothDirections, areFollowedInARebase) {
    moveHereAndLabelThere(GetParam());

    auto const rebased = git_.tryTo({"rebase", "-q", "other"});

    EXPECT_EQ(rebased.exitCode, 0) << rebased.output << rebased.errors;
    expectLabelAtTheNewPlace();
}

TEST_P(RenamesInBothDirections, areFollowedInACherryPick) {
    moveHereAndLabelThere(GetParam());

    auto const picked = git_.tryTo({"cherry-pick", "other"});

    EXPECT_EQ(picked.exitCode, 0) << picked.output << picked.errors;
    expectLabelAtTheNewPlace();
}

TEST_P(RenamesInBothDirections, areFollowedInARevert) {
    // The commit to revert undoes a change: reverting it makes the change again.
    moveHereAndLabelThere(GetParam());
    git_.run({"switch", "-q", "other"});
    git_.run({"revert", "--no-edit", "HEAD"});
    auto const undo = git_.run({"rev-parse", "HEAD"});
    git_.run({"switch", "-q", "main"});

    auto const reverted = git_.tryTo({"revert", "--no-edit", undo.substr(0, undo.find('\n'))});

    EXPECT_EQ(reverted.exitCode, 0) << reverted.output << reverted.errors;
    expectLabelAtTheNewPlace();
}

TEST_P(RenamesInBothDirections, areFollowedWhenAStashIsAppliedAgain) {
    GetParam() ? label("src/main.cpp") : move("src", "lib");
    git_.run({"stash", "-q"});
    GetParam() ? move("src", "lib") : label("src/main.cpp");
    commit("here");

    auto const popped = git_.tryTo({"stash", "pop", "-q"});

    EXPECT_EQ(popped.exitCode, 0) << popped.output << popped.errors;
    expectLabelAtTheNewPlace();
}

TEST_P(RenamesInBothDirections, areFollowedWhenARebaseAppliesItsAutostash) {
    git_.run({"switch", "-q", "-c", "other"});
    GetParam() ? move("src", "lib") : label("src/main.cpp");
    commit("there");
    git_.run({"switch", "-q", "main"});
    GetParam() ? label("src/main.cpp") : move("src", "lib");

    auto const rebased = git_.tryTo({"rebase", "-q", "--autostash", "other"});

    EXPECT_EQ(rebased.exitCode, 0) << rebased.output << rebased.errors;
    expectLabelAtTheNewPlace();
}

INSTANTIATE_TEST_SUITE_P(ThisSideAndTheOther, RenamesInBothDirections, ::testing::Bool());

TEST_F(RenamesOfMerge, putAFileThatTheOtherSideAddedWhereGitPutsIt) {
    git_.run({"config", "merge.directoryRenames", "true"});
    git_.run({"switch", "-q", "-c", "other"});
    addNew("src/new.cpp");
    label("src/new.cpp");
    commit("there");
    git_.run({"switch", "-q", "main"});
    move("src", "lib");
    commit("here");

    auto const merged = git_.tryTo({"merge", "-q", "-m", "both", "other"});

    EXPECT_EQ(merged.exitCode, 0) << merged.output << merged.errors;
    EXPECT_EQ(tool({"label", "show", "lib/new.cpp"}).output, "Status: Open\n");
    EXPECT_THAT(list(), ElementsAre("a", "b", "c", "lib", "lib/main.cpp", "lib/new.cpp", "lib/pump.cpp",
                                    "lib/valve.cpp"));
    EXPECT_THAT(tool({"status"}), SucceedsSilently());
}

TEST_F(RenamesOfMerge, putAFileThatAPickedCommitAddedWhereGitPutsIt) {
    git_.run({"config", "merge.directoryRenames", "true"});
    git_.run({"switch", "-q", "-c", "other"});
    addNew("src/new.cpp");
    commit("there");
    git_.run({"switch", "-q", "main"});
    move("src", "lib");
    commit("here");

    auto const picked = git_.tryTo({"cherry-pick", "other"});

    EXPECT_EQ(picked.exitCode, 0) << picked.output << picked.errors;
    EXPECT_THAT(list(), ::testing::Contains("lib/new.cpp"));
    EXPECT_THAT(tool({"status"}), SucceedsSilently());
}

TEST_F(RenamesOfMerge, nameBothPathsIfGitOnlySuggestsTheNewPlace) {
    git_.run({"switch", "-q", "-c", "other"});
    addNew("src/new.cpp");
    commit("there");
    git_.run({"switch", "-q", "main"});
    move("src", "lib");
    commit("here");

    auto const merged = git_.tryTo({"merge", "-q", "-m", "both", "other"});

    EXPECT_EQ(merged.exitCode, 1);
    EXPECT_THAT(merged.errors, AllOf(HasSubstr("projectctl: one side added \"src/new.cpp\" to a folder that"),
                                     HasSubstr("it is at \"lib/new.cpp\" now, as git suggests")));
    EXPECT_THAT(merged.output + merged.errors, HasSubstr("CONFLICT (file location)"));
    EXPECT_THAT(linesOf(git_.run({"diff", "--name-only", "--diff-filter=U"})), ElementsAre("lib/new.cpp"));
    EXPECT_THAT(list(), ::testing::Contains("lib/new.cpp"));
    EXPECT_THAT(list(), Not(::testing::Contains("src/new.cpp")));
}

TEST_F(RenamesOfMerge, leaveAFileWhereItIsIfGitRenamesNoFolders) {
    git_.run({"config", "merge.directoryRenames", "false"});
    git_.run({"switch", "-q", "-c", "other"});
    addNew("src/new.cpp");
    label("src/main.cpp");
    commit("there");
    git_.run({"switch", "-q", "main"});
    move("src", "lib");
    commit("here");

    auto const merged = git_.tryTo({"merge", "-q", "-m", "both", "other"});

    EXPECT_EQ(merged.exitCode, 0) << merged.output << merged.errors;
    EXPECT_THAT(list(), ElementsAre("a", "b", "c", "lib", "lib/main.cpp", "lib/pump.cpp", "lib/valve.cpp",
                                    "src", "src/new.cpp"));
    EXPECT_EQ(tool({"label", "show", "lib/main.cpp"}).output, "Status: Open\n");
    EXPECT_THAT(tool({"status"}), SucceedsSilently());
}

TEST_F(RenamesOfMerge, areNotFollowedIfGitIsToldNotTo) {
    git_.run({"config", "merge.renames", "false"});
    moveHereAndLabelThere(true);

    auto const merged = git_.tryTo({"merge", "-q", "-m", "both", "other"});

    EXPECT_EQ(merged.exitCode, 1);
    EXPECT_THAT(
        merged.errors,
        HasSubstr("the file \"src\" is removed by ours and changed by theirs, in the file \"src/main.cpp\""));
}

TEST_F(RenamesOfMerge, areNotFollowedIfGitLooksForNoneInDiffsAndMergesSayNothingElse) {
    git_.run({"config", "diff.renames", "false"});
    moveHereAndLabelThere(true);

    EXPECT_EQ(git_.tryTo({"merge", "-q", "-m", "both", "other"}).exitCode, 1);
    git_.run({"merge", "--abort"});

    git_.run({"config", "merge.renames", "true"});
    EXPECT_EQ(git_.tryTo({"merge", "-q", "-m", "both", "other"}).exitCode, 0);
    expectLabelAtTheNewPlace();
}

TEST_F(RenamesOfMerge, areNotFollowedIfASettingOfOneCallSaysSo) {
    moveHereAndLabelThere(true);

    EXPECT_EQ(git_.tryTo({"-c", "merge.renames=false", "merge", "-q", "-m", "both", "other"}).exitCode, 1);
    git_.run({"merge", "--abort"});

    EXPECT_EQ(git_.tryTo({"merge", "-q", "-m", "both", "other"}).exitCode, 0);
    expectLabelAtTheNewPlace();
}

TEST_F(RenamesOfMerge, areNotFollowedBeyondGitsLimit) {
    git_.run({"config", "merge.renameLimit", "1"});
    git_.run({"switch", "-q", "-c", "other"});
    label("src/main.cpp");
    commit("there");
    git_.run({"switch", "-q", "main"});
    for (auto const& [name, to] : {std::pair("src/main.cpp", "first"), std::pair("src/pump.cpp", "second"),
                                   std::pair("src/valve.cpp", "third")}) {
        folder_.addFile(name, linesFor(name) + "one more\n"); // renames of equal files have no limit
        move(name, to);
    }
    commit("here");

    EXPECT_EQ(git_.tryTo({"merge", "-q", "-m", "both", "other"}).exitCode, 1);
}

TEST_F(RenamesOfMerge, areFollowedWithoutTheHelpOfANamedPathOnly) {
    moveHereAndLabelThere(true);
    for (auto const& [name, commit] :
         {std::pair("base", "main~1"), std::pair("ours", "main"), std::pair("theirs", "other")}) {
        folder_.addFile(name, git_.run({"show", std::string(commit) + ":.projectdata/project.jsonl"}));
    }

    EXPECT_EQ(tool({"merge", "base", "ours", "theirs"}).exitCode, 1);
}

TEST_F(RenamesOfMerge, areFollowedWhenAnotherConflictIsResolved) {
    git_.run({"switch", "-q", "-c", "other"});
    label("src/main.cpp");
    ASSERT_THAT(tool({"name", "Hers"}), SucceedsSilently());
    commit("there");
    git_.run({"switch", "-q", "main"});
    move("src", "lib");
    ASSERT_THAT(tool({"name", "His"}), SucceedsSilently());
    commit("here");
    ASSERT_EQ(git_.tryTo({"merge", "-q", "-m", "both", "other"}).exitCode, 1);

    EXPECT_THAT(tool({"resolve", "--theirs"}), SucceedsSilently());

    EXPECT_EQ(tool({"name"}).output, "Hers\n");
    expectLabelAtTheNewPlace();
}

TEST_F(RenamesOfMerge, reachEntryPointsAndTheProjectPath) {
    git_.run({"switch", "-q", "-c", "other"});
    ASSERT_THAT(tool({"entry", "set", "src/main.cpp"}), SucceedsSilently());
    ASSERT_THAT(tool({"path", "add", "src"}), SucceedsSilently());
    commit("there");
    git_.run({"switch", "-q", "main"});
    move("src", "lib");
    commit("here");

    auto const merged = git_.tryTo({"merge", "-q", "-m", "both", "other"});

    EXPECT_EQ(merged.exitCode, 0) << merged.output << merged.errors;
    EXPECT_THAT(tool({"entry", "list"}).output, HasSubstr("lib/main.cpp"));
    EXPECT_EQ(tool({"path", "list"}).output, "lib\n");
    EXPECT_THAT(tool({"check"}), SucceedsSilently());
}

TEST_F(RenamesOfMerge, areFollowedInAProjectBelowTheTopOfTheRepository) {
    folder_.addFolder("below/src");
    folder_.addFile("below/src/x.cpp", linesFor("x"));
    ASSERT_THAT(tool({"init", "below"}), SucceedsSilently());
    ASSERT_THAT(toolFrom("below", {"add", "--recursive", "src"}), SucceedsSilently());
    ASSERT_THAT(toolFrom("below", {"category", "create", "Status"}), SucceedsSilently());
    ASSERT_THAT(toolFrom("below", {"label", "create", "Status", "Open"}), SucceedsSilently());
    git_.commitAll();
    git_.run({"switch", "-q", "-c", "other"});
    ASSERT_THAT(toolFrom("below", {"label", "put", "Status", "Open", "src/x.cpp"}), SucceedsSilently());
    commit("there");
    git_.run({"switch", "-q", "main"});
    git_.run({"mv", "below/src/x.cpp", "below/y.cpp"});
    ASSERT_THAT(toolFrom("below", {"remove", "src"}), SucceedsSilently());
    ASSERT_THAT(toolFrom("below", {"add", "y.cpp"}), SucceedsSilently());
    git_.commitAll();

    auto const merged = git_.tryTo({"merge", "-q", "-m", "both", "other"});

    EXPECT_EQ(merged.exitCode, 0) << merged.output << merged.errors;
    EXPECT_EQ(toolFrom("below", {"label", "show", "y.cpp"}).output, "Status: Open\n");
}

TEST_F(RenamesOfMerge, ofBothSidesToDifferentNamesKeepBothFiles) {
    git_.run({"switch", "-q", "-c", "other"});
    move("src/main.cpp", "src/first.cpp");
    label("src/first.cpp");
    commit("there");
    git_.run({"switch", "-q", "main"});
    move("src/main.cpp", "src/second.cpp");
    commit("here");

    auto const merged = git_.tryTo({"merge", "-q", "-m", "both", "other"});

    EXPECT_EQ(merged.exitCode, 1);
    EXPECT_THAT(merged.output + merged.errors, HasSubstr("CONFLICT (rename/rename)"));
    EXPECT_THAT(list(), AllOf(::testing::Contains("src/first.cpp"), ::testing::Contains("src/second.cpp")));
    EXPECT_EQ(tool({"label", "show", "src/first.cpp"}).output, "Status: Open\n");
}

TEST_F(RenamesOfMerge, areFollowedBySeveralCommitsOfARebase) {
    git_.run({"switch", "-q", "-c", "other"});
    move("src", "lib");
    commit("there");
    git_.run({"switch", "-q", "main"});
    label("src/main.cpp");
    commit("first");
    label("src/pump.cpp", "Done");
    commit("second");

    auto const rebased = git_.tryTo({"rebase", "-q", "other"});

    EXPECT_EQ(rebased.exitCode, 0) << rebased.output << rebased.errors;
    EXPECT_EQ(tool({"label", "show", "lib/pump.cpp"}).output, "Status: Done\n");
    expectLabelAtTheNewPlace();
}

} // namespace
} // namespace project::test
