#include <map>

#include "tools/merge/MergingProject.hpp"

namespace project::test {
namespace {

using ::testing::AllOf;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::Not;
using ::testing::StartsWith;

constexpr char const* driverKey = "merge.project-definition.driver";
constexpr char const* missingNote =
    "note git merges the project's text line by line: 'projectctl setup' configures the merge driver\n";

class SetupCommand : public MergingProject {};

TEST_F(SetupCommand, isPartOfInit) {
    EXPECT_THAT(git_.run({"config", driverKey}), StartsWith("p='" PROJECTCTL "'; "));
}

TEST_F(SetupCommand, isReportedAsMissingInAFreshClone) {
    git_.run({"config", "--remove-section", "merge.project-definition"});

    EXPECT_THAT(tool({"status"}), Prints(missingNote));
    EXPECT_THAT(tool({"check"}),
                Prints("note: git merges the project's text line by line: 'projectctl setup' "
                       "configures the merge driver\n"));
    EXPECT_THAT(tool({"status", "--no-source-control"}), SucceedsSilently());
    EXPECT_THAT(tool({"check", "--no-source-control"}), SucceedsSilently());
    ASSERT_THAT(tool({"setup"}), SucceedsSilently());
    EXPECT_THAT(tool({"status"}), SucceedsSilently());
    EXPECT_THAT(tool({"check"}), SucceedsSilently());
    EXPECT_THAT(git_.run({"config", driverKey}), StartsWith("p='" PROJECTCTL "'; "));
}

TEST_F(SetupCommand, isLeftOutByInitWithoutSourceControl) {
    folder_.addFolder("other");
    git_.run({"config", "--remove-section", "merge.project-definition"});

    ASSERT_THAT(tool({"init", "other", "--no-source-control"}), SucceedsSilently());

    EXPECT_NE(git_.tryTo({"config", driverKey}).exitCode, 0);
}

TEST_F(SetupCommand, replacesAnotherCommandWhichIsReported) {
    for (auto const* command : {"projectctl merge %O %A %B %P", "p=", "p='/nowhere/projectctl'; true"}) {
        git_.run({"config", "--add", driverKey, command});

        EXPECT_THAT(tool({"status"}),
                    Prints("note git merges the project's text with another command than the one "
                           "that 'projectctl setup' configures\n"))
            << command;
    }

    ASSERT_THAT(tool({"setup"}), SucceedsSilently());

    EXPECT_THAT(linesOf(git_.run({"config", "--get-all", driverKey})),
                ElementsAre(StartsWith("p='" PROJECTCTL "'; ")));
    EXPECT_THAT(tool({"status"}), SucceedsSilently());
}

TEST_F(SetupCommand, reportsACommandThatQuotesTheProgramInAnotherWay) {
    std::string const start = "p=";
    auto const ours = git_.run({"config", driverKey});
    auto const end = ours.substr(start.size() + std::string("'" PROJECTCTL "'").size());
    for (auto const* program : {"", "x", "/bin/true", "'/bin/true", "'/bin/'true'", "'%b'"}) {
        git_.run({"config", driverKey, start + program + end.substr(0, end.find('\n'))});

        EXPECT_THAT(tool({"status"}).output,
                    StartsWith("note git merges the project's text with another command"))
            << program;
    }
    git_.run({"config", driverKey, ours.substr(0, ours.find('\n'))});
    EXPECT_THAT(tool({"status"}), SucceedsSilently());
}

TEST_F(SetupCommand, isNotReplacedByInitWhenAnotherCommandIsConfigured) {
    folder_.addFolder("other");
    git_.run({"config", driverKey, "true"});

    ASSERT_THAT(tool({"init", "other"}), SucceedsSilently());

    EXPECT_EQ(git_.run({"config", driverKey}), "true\n");
}

TEST_F(SetupCommand, isReportedWhenGitsAttributesNameAnotherDriver) {
    folder_.addFile(".git/info/attributes", "*.jsonl merge=union\n");

    EXPECT_THAT(tool({"status"}).output,
                HasSubstr("note git merges the project's text line by line: the attribute "
                          "'merge' of .projectdata/project.jsonl is not"));
}

TEST_F(SetupCommand, failsWhereGitsConfigurationIsLocked) {
    folder_.addFile(".git/config.lock");

    EXPECT_THAT(tool({"setup"}), FailsWith(1, "git cannot be set up: error: could not lock config file"));
}

TEST_F(SetupCommand, reportsOnATerminal) {
    settings_.onTerminal = true;

    EXPECT_EQ(tool({"setup"}).output, "git now merges the project's text with this tool.\r\n");
}

class SetupOutsideAnyRepository : public ToolTest {};

TEST_F(SetupOutsideAnyRepository, isAnError) {
    initProject();

    EXPECT_THAT(tool({"setup"}), FailsWith(1, "is not in a git repository"));
    EXPECT_THAT(tool({"status"}), SucceedsSilently());
}

TEST_F(SetupOutsideAnyRepository, isNotReportedWhereGitIsNotInstalled) {
    initProject();
    GitFolder const repository(folder_.onDisk());
    settings_.environment["PATH"] = "/nowhere";

    EXPECT_THAT(tool({"status"}), SucceedsSilently());
    EXPECT_THAT(tool({"setup"}), FailsWith(1, "is not in a git repository"));
}

/// The driver calls a copy of the program, in a folder whose name is hard to quote for a shell and for git's
/// configuration.
class MovedProgram : public MergingProject {
protected:
    void SetUp() override {
        program_ = programs_.onDisk() / "it's 100% \"odd\" $HOME; # %P \\n" / "projectctl";
        std::filesystem::create_directories(program_.parent_path());
        std::filesystem::copy_file(PROJECTCTL, program_);
        MergingProject::SetUp();
        ASSERT_EQ(runProgram({program_.string(), "setup"}, settings_).exitCode, 0);
        ASSERT_THAT(tool({"status"}), SucceedsSilently());
    }

    /// Puts a shell script in place of the program.
    void replaceProgram(std::string const& script) const {
        std::filesystem::remove(program_);
        std::ofstream(program_) << script;
        std::filesystem::permissions(program_, std::filesystem::perms::owner_all);
    }

    /// Two branches add neighbouring files, which git cannot merge line by line.
    ProgramResult mergeNeighbours() const {
        folder_.file(u"d");
        folder_.file(u"e");
        return mergeOf({"add", "d"}, {"add", "e"});
    }

    /// Two branches change distant lines of the text.
    ProgramResult mergeDistantLines() const { return mergeOf({"name", "Pump"}, {"remove", "a"}); }

    /// The text contains markers and the changes of both sides.
    void expectBothSidesBetweenMarkers() const {
        EXPECT_THAT(readText(), AllOf(HasSubstr("<<<<<<< ours\n"), HasSubstr("\"d\""), HasSubstr("\"e\""),
                                      HasSubstr(">>>>>>> theirs\n")));
        EXPECT_THAT(linesOf(tool({"list"}).output), ElementsAre("a", "b", "c", "d", "e"));
        EXPECT_THAT(tool({"add", "a"}), FailsWith(6, "project.jsonl")); // the store recognises the markers
    }

    /// `git add` of the text as the merge left it loses nothing.
    void expectThatStagingLosesNothing() const {
        auto const merged = readText();
        git_.run({"add", ".projectdata/project.jsonl"});
        EXPECT_EQ(git_.run({"show", ":.projectdata/project.jsonl"}), merged);
    }

    /// The exit code of the configured command on three files with these texts.
    int driverOn(std::string const& base, std::string const& ours, std::string const& theirs) const {
        folder_.addFile("base", base);
        folder_.addFile("ours", ours);
        folder_.addFile("theirs", theirs);
        std::map<char, std::string> const placeholders{
            {'%', "%"}, {'O', "base"}, {'A', "ours"}, {'B', "theirs"}, {'P', "'the text'"}};
        std::string command;
        auto const configured = git_.run({"config", driverKey});
        for (std::size_t at = 0; at < configured.size(); ++at) {
            command +=
                configured[at] == '%' ? placeholders.at(configured[++at]) : std::string(1, configured[at]);
        }
        return runProgram({"sh", "-c", command}, settings_).exitCode;
    }

    std::string const reported =
        "bad  git merges the project's text line by line: the merge driver calls a program "
        "that cannot be run; 'projectctl setup' configures it again\n";
    TemporaryFolder programs_;
    std::filesystem::path program_;
};

TEST_F(MovedProgram, isCalledByItsAbsolutePath) {
    auto const merged = mergeNeighbours();

    EXPECT_EQ(merged.exitCode, 0) << merged.output << merged.errors;
    EXPECT_THAT(list(), ElementsAre("a", "b", "c", "d", "e"));
}

TEST_F(MovedProgram, namesThePathOfTheTextInAConflict) {
    auto const merged = mergeOf({"name", "Pump"}, {"name", "Valve"});

    EXPECT_EQ(merged.exitCode, 1);
    EXPECT_THAT(merged.errors,
                StartsWith("projectctl: conflict in .projectdata/project.jsonl: the \"Name\""));
    EXPECT_THAT(merged.errors, Not(HasSubstr("line by line")));
}

TEST_F(MovedProgram, leavesMarkersAfterItWasDeleted) {
    std::filesystem::remove_all(program_.parent_path());

    auto const merged = mergeNeighbours();

    EXPECT_EQ(merged.exitCode, 1);
    EXPECT_THAT(merged.errors, AllOf(StartsWith("projectctl: the text is merged line by line, since \""),
                                     HasSubstr(program_.filename().string() + "\" did not merge it\n")));
    expectBothSidesBetweenMarkers();
    expectThatStagingLosesNothing();
}

TEST_F(MovedProgram, leavesMarkersOfTheSizeThatTheStoreRecognisesWhateverGitsConfiguration) {
    std::filesystem::remove(program_);
    folder_.addFile(".git/info/attributes", "*.jsonl conflict-marker-size=12\n");

    EXPECT_EQ(mergeNeighbours().exitCode, 1);

    expectBothSidesBetweenMarkers();
}

TEST_F(MovedProgram, leavesTheLinesThatGitCanMergeWithoutAConflict) {
    std::filesystem::remove(program_);

    auto const merged = mergeDistantLines();

    EXPECT_EQ(merged.exitCode, 0) << merged.output << merged.errors;
    EXPECT_THAT(tool({"name"}), Prints("Pump\n"));
    EXPECT_THAT(list(), ElementsAre("b", "c"));
}

TEST_F(MovedProgram, leavesMarkersWhereItCannotBeRun) {
    for (auto const* script :
         {"#!/nowhere/interpreter\n", "#!/bin/sh\nexit 127\n", "#!/bin/sh\nexit 126\n"}) {
        replaceProgram(script);
        auto const merged = mergeNeighbours();

        EXPECT_EQ(merged.exitCode, 1) << script;
        expectBothSidesBetweenMarkers();

        git_.run({"merge", "--abort"});
        git_.run({"reset", "-q", "--hard", "HEAD~"});
        git_.run({"branch", "-q", "-D", "hers"});
    }
}

TEST_F(MovedProgram, leavesMarkersAndAnErrorWhereItFails) {
    for (auto const* script : {"#!/bin/sh\necho broken >&2; exit 2\n", "#!/bin/sh\nexit 128\n",
                               "#!/bin/sh\nexit 200\n", "#!/bin/sh\nkill -SEGV $$\n"}) {
        replaceProgram(script);
        auto const merged = mergeNeighbours();

        EXPECT_NE(merged.exitCode, 0) << script;
        EXPECT_THAT(merged.errors, HasSubstr("did not merge it\n"));
        expectBothSidesBetweenMarkers();

        git_.run({"merge", "--abort"});
        git_.run({"reset", "-q", "--hard", "HEAD~"});
        git_.run({"branch", "-q", "-D", "hers"});
    }
}

TEST_F(MovedProgram, distinguishesConflictsAndFailuresByItsExitCode) {
    auto const base = readText();
    ASSERT_THAT(tool({"remove", "a"}), SucceedsSilently());
    auto const withoutFile = readText();
    ASSERT_THAT(tool({"add", "a"}), SucceedsSilently());
    ASSERT_THAT(tool({"name", "Pump"}), SucceedsSilently());
    auto const named = readText();
    ASSERT_THAT(tool({"name", "Valve"}), SucceedsSilently());
    auto const renamed = readText();
    auto later = base;
    later.replace(later.find("\"version\":1"), 11, "\"version\":9");

    EXPECT_EQ(driverOn(base, withoutFile, named), 0);
    EXPECT_EQ(driverOn(base, renamed, named), 1);
    EXPECT_EQ(driverOn(base, withoutFile, later), 255); // higher than 128: not a conflict, but a failure
    EXPECT_EQ(driverOn(base, named, "nonsense"), 255);
    std::filesystem::remove(program_);
    EXPECT_EQ(driverOn(base, withoutFile, named), 0);
    EXPECT_EQ(driverOn(base, renamed, named), 1);
    EXPECT_EQ(driverOn(base, named, std::string("\0nonsense", 9)),
              255); // git does not merge the lines of this
}

TEST_F(MovedProgram, leavesBothSidesWhereOneIsOfALaterVersion) {
    git_.run({"switch", "-q", "-c", "hers"});
    auto later = readText();
    writeText(later.replace(later.find("\"version\":1"), 11, "\"version\":9"));
    git_.run({"commit", "-q", "-a", "-m", "hers"});
    git_.run({"switch", "-q", "-f", "main"});
    ASSERT_THAT(tool({"name", "Valve"}), SucceedsSilently());
    commit("his");

    auto const merged = git_.tryTo({"merge", "-q", "-m", "both", "hers"});

    EXPECT_NE(merged.exitCode, 0);
    EXPECT_THAT(merged.errors, AllOf(HasSubstr("projectctl: theirs:1: "), HasSubstr("did not merge it\n")));
    EXPECT_THAT(readText(), AllOf(HasSubstr("\"version\":9"), HasSubstr("Valve")));
    expectThatStagingLosesNothing();
}

TEST_F(MovedProgram, isReportedAndSetupRepairsIt) {
    std::filesystem::rename(program_, program_.string() + ".moved");

    EXPECT_THAT(tool({"status"}), Prints(reported));
    EXPECT_THAT(tool({"check"}).output, HasSubstr("the merge driver calls a program that cannot be run"));
    EXPECT_NE(tool({"check"}).exitCode, 0);
    EXPECT_THAT(tool({"check", "--no-source-control"}), SucceedsSilently());

    ASSERT_THAT(tool({"setup"}), SucceedsSilently());

    EXPECT_THAT(tool({"status"}), SucceedsSilently());
    EXPECT_THAT(tool({"check"}), SucceedsSilently());
    EXPECT_EQ(mergeNeighbours().exitCode, 0);
}

TEST_F(MovedProgram, isReportedOnATerminalWithTheCommandThatRepairsIt) {
    std::filesystem::remove(program_);
    settings_.onTerminal = true;

    EXPECT_EQ(linesOf(tool({"check"}).output).back(), "'projectctl setup' configures the merge driver.\r");
}

TEST_F(MovedProgram, isReportedWhereItIsNotAnExecutableFile) {
    std::filesystem::permissions(program_, std::filesystem::perms::owner_read);
    EXPECT_THAT(tool({"status"}), Prints(reported));

    std::filesystem::remove(program_);
    std::filesystem::create_directory(program_);
    EXPECT_THAT(tool({"status"}), Prints(reported));
}

TEST_F(MovedProgram, isReplacedByInit) {
    std::filesystem::remove(program_);
    folder_.addFolder("other");

    ASSERT_THAT(tool({"init", "other"}), SucceedsSilently());

    EXPECT_THAT(tool({"status"}).output, Not(HasSubstr("bad  ")));
}

} // namespace
} // namespace project::test
