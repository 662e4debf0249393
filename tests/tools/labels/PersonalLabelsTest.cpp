#include <filesystem>
#include <fstream>
#include <iterator>

#include "support/GitFolder.hpp"
#include "tools/labels/LabelToolTest.hpp"

namespace project::test {
namespace {

using ::testing::AllOf;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::Not;

class PersonalLabels : public LabelToolTest {
protected:
    /// Creates a personal category with a label, and puts the label on a file.
    void createPersonal(std::string const& category, std::string const& label,
                        std::string const& file) const {
        ASSERT_EQ(tool({"category", "create", category, "--personal"}).exitCode, 0);
        ASSERT_THAT(tool({"label", "create", category, label, "--personal"}), SucceedsSilently());
        ASSERT_THAT(tool({"label", "put", category, label, file, "--personal"}), SucceedsSilently());
    }

    std::filesystem::path personalText() const {
        return folder_.onDisk() / ".projectdata" / "local" / "project.jsonl";
    }
};

TEST_F(PersonalLabels, areStoredOutsideTheTextOfTheProject) {
    auto const before = readText();
    createPersonal("Mine", "Later", "a");

    EXPECT_EQ(before, readText());
    EXPECT_TRUE(std::filesystem::exists(personalText()));
    EXPECT_THAT(tool({"label", "show", "a"}), Prints("Mine: Later (personal)\n"));
}

TEST_F(PersonalLabels, areListedWithThoseOfTheProject) {
    createLabelled("Status", "Done", "a");
    createPersonal("Mine", "Later", "a");

    EXPECT_THAT(tool({"category", "list"}), Prints("Mine (personal)\nStatus\n"));
    EXPECT_THAT(tool({"category", "list", "--personal"}), Prints("Mine (personal)\n"));
    EXPECT_THAT(tool({"category", "list", "--no-personal"}), Prints("Status\n"));
    EXPECT_THAT(tool({"label", "list"}), Prints("Mine: Later (personal)\nStatus: Done\n"));
    EXPECT_THAT(tool({"label", "list", "Mine"}), Prints("Later (personal)\n"));
    EXPECT_THAT(tool({"label", "list", "--no-personal"}), Prints("Status: Done\n"));
    EXPECT_THAT(tool({"label", "show", "a", "b"}), Prints("a: Status: Done\na: Mine: Later (personal)\n"));
    EXPECT_THAT(tool({"label", "show", "a", "--personal"}), Prints("Mine: Later (personal)\n"));
    EXPECT_THAT(tool({"label", "show", "a", "--no-personal"}), Prints("Status: Done\n"));
}

TEST_F(PersonalLabels, areMarkedInJson) {
    createLabelled("Status", "Done", "a");
    createPersonal("Mine", "Later", "a");
    auto const marked = AllOf(HasSubstr("\"personal\": false"), HasSubstr("\"personal\": true"));

    EXPECT_THAT(tool({"category", "list", "--json"}).output, marked);
    EXPECT_THAT(tool({"label", "list", "--json"}).output, marked);
    EXPECT_THAT(tool({"label", "show", "a", "--json"}).output, marked);
    EXPECT_THAT(tool({"label", "show", "a", "--json", "--no-personal"}).output,
                Not(HasSubstr("\"personal\": true")));
}

TEST_F(PersonalLabels, areFoundTogetherWithThoseOfTheProject) {
    createLabelled("Status", "Done", "a");
    createPersonal("Mine", "Later", "a");
    ASSERT_THAT(tool({"label", "put", "Mine", "Later", "b", "--personal"}), SucceedsSilently());

    EXPECT_THAT(tool({"list", "--label", "Mine=Later"}), Prints("a\nb\n"));
    EXPECT_THAT(tool({"list", "--label", "Mine", "--label", "Status=Done"}), Prints("a\n"));
    EXPECT_THAT(tool({"list", "--label", "Status", "--no-label", "Mine"}), SucceedsSilently());
    EXPECT_THAT(tool({"list", "--unlabelled"}), Prints("c\n"));
    EXPECT_THAT(tool({"list", "--unlabelled", "--no-personal"}), Prints("b\nc\n"));
    EXPECT_THAT(tool({"label", "find", "Mine", "Later"}), Prints("a\nb\n"));
    EXPECT_THAT(tool({"label", "find", "Status"}), Prints("a\n"));
    EXPECT_THAT(tool({"label", "find", "Mine", "--no-personal"}), FailsWith(1, "Mine"));
}

TEST_F(PersonalLabels, areNeverConfusedWithThoseOfTheProject) {
    createLabelled("Status", "Done", "a");
    ASSERT_THAT(tool({"category", "create", "Status", "--personal"}).errors, HasSubstr("--no-personal"));
    ASSERT_THAT(tool({"label", "create", "Status", "Done", "--personal"}), SucceedsSilently());

    for (auto const& command : std::vector<std::vector<std::string>>{
             {"label", "put", "Status", "Done", "b"},
             {"label", "take", "Status", "Done", "a"},
             {"label", "find", "Status", "Done"},
             {"list", "--label", "Status=Done"},
             {"label", "list", "Status"},
             {"label", "create", "Status", "Open"},
             {"label", "delete", "Status", "Done"},
             {"category", "rename", "Status", "State"},
             {"category", "delete", "Status"},
         }) {
        EXPECT_THAT(tool(command), FailsWith(1, "--no-personal")) << command[0] << ' ' << command[1];
    }

    EXPECT_THAT(tool({"label", "put", "Status", "Done", "b", "--personal"}), SucceedsSilently());
    EXPECT_THAT(tool({"label", "put", "Status", "Done", "c", "--no-personal"}), SucceedsSilently());
    EXPECT_THAT(tool({"list", "--label", "Status=Done", "--personal"}), Prints("b\n"));
    EXPECT_THAT(tool({"list", "--label", "Status=Done", "--no-personal"}), Prints("a\nc\n"));
    EXPECT_THAT(tool({"category", "delete", "Status", "--personal"}), SucceedsSilently());
    EXPECT_THAT(tool({"list", "--label", "Status=Done"}), Prints("a\nc\n"));
}

TEST_F(PersonalLabels, areChangedOnlyOnRequest) {
    createPersonal("Mine", "Later", "a");

    EXPECT_THAT(tool({"label", "put", "Mine", "Later", "b"}), FailsWith(1, "add --personal"));
    EXPECT_THAT(tool({"category", "delete", "Mine"}), FailsWith(1, "add --personal"));
    EXPECT_THAT(tool({"label", "take", "Mine", "Later", "a", "--no-personal"}), FailsWith(1, "Mine"));
    EXPECT_THAT(tool({"label", "put", "Mine", "Later", "a", "--personal", "--no-personal"}),
                FailsWith(2, "--no-personal"));

    EXPECT_THAT(tool({"label", "find", "Mine"}), Prints("a\n"));
}

TEST_F(PersonalLabels, areRenamedAndDeleted) {
    createPersonal("Mine", "Later", "a");

    EXPECT_THAT(tool({"category", "rename", "Mine", "Own", "--personal"}), SucceedsSilently());
    EXPECT_THAT(tool({"label", "show", "a"}), Prints("Own: Later (personal)\n"));
    EXPECT_THAT(tool({"label", "take", "Own", "Later", "a", "--personal"}), SucceedsSilently());
    EXPECT_THAT(tool({"label", "show", "a"}), SucceedsSilently());
    EXPECT_THAT(tool({"label", "delete", "Own", "Later", "--personal"}), SucceedsSilently());
    EXPECT_THAT(tool({"label", "list"}), SucceedsSilently());
}

TEST_F(PersonalLabels, areMarkedInADryRun) {
    createPersonal("Mine", "Later", "a");
    auto const before = tool({"label", "show", "a", "b"}).output;
    std::string const batch =
        "label put Mine Later b --personal\nlabel create Mine Now --personal\nremove a\n";

    EXPECT_THAT(tool({"label", "put", "Mine", "Later", "b", "--personal", "--dry-run"}),
                Prints("personal put Mine=Later b\n"));
    EXPECT_THAT(tool({"batch", "--dry-run"}, batch),
                Prints("remove a\npersonal label create Mine=Now\npersonal take Mine=Later a\n"
                       "personal put Mine=Later b\n"));
    EXPECT_THAT(
        tool({"batch", "--dry-run", "--json"}, batch).output,
        HasSubstr(
            R"({"change": "put", "category": "Mine", "label": "Later", "path": "b", "personal": true})"));
    EXPECT_EQ(before, tool({"label", "show", "a", "b"}).output);
}

TEST_F(PersonalLabels, areCreatedByNoDryRun) {
    EXPECT_THAT(tool({"batch", "--dry-run"}, "category create Mine --personal\n"),
                Prints("personal category create Mine\n"));

    EXPECT_FALSE(std::filesystem::exists(personalText().parent_path()));
}

TEST_F(PersonalLabels, goWithTheFileThatIsRemovedFromTheProject) {
    createPersonal("Mine", "Later", "a");

    ASSERT_EQ(tool({"remove", "a"}).exitCode, 0);
    ASSERT_EQ(tool({"add", "a"}).exitCode, 0);

    EXPECT_THAT(tool({"label", "show", "a"}), SucceedsSilently());
}

TEST_F(PersonalLabels, arePartOfABatch) {
    createPersonal("Mine", "Later", "a");
    auto const lines = "label put Mine Later b --personal\nlabel put Mine Later unknown --personal\n";

    EXPECT_NE(tool({"batch"}, lines).exitCode, 0);
    EXPECT_THAT(tool({"label", "find", "Mine"}), Prints("a\n"));
    EXPECT_EQ(tool({"batch"}, "label put Mine Later b --personal\nadd a\n").exitCode, 0);
    EXPECT_THAT(tool({"label", "find", "Mine"}), Prints("a\nb\n"));
}

TEST_F(PersonalLabels, areNotStagedByAnyCommand) {
    GitFolder const git(folder_.onDisk());
    git.commitAll();
    createPersonal("Mine", "Later", "a");
    ASSERT_EQ(tool({"remove", "b"}).exitCode, 0);
    git.commitAll();

    EXPECT_THAT(git.run({"status", "--porcelain"}), IsEmpty());
    EXPECT_THAT(git.run({"ls-files"}), Not(HasSubstr("local")));
    EXPECT_EQ(".projectdata/local/\n",
              git.run({"ls-files", "--others", "--ignored", "--exclude-standard", "--directory"}));
}

TEST_F(PersonalLabels, ofFilesOutsideTheProjectAreHiddenUntilTheyAreTidied) {
    createPersonal("Mine", "Later", "a");
    ASSERT_THAT(tool({"label", "put", "Mine", "Later", "b", "--personal"}), SucceedsSilently());
    auto const whole = readText();
    replaceInText("\"a\"\n", "");

    EXPECT_THAT(tool({"label", "find", "Mine"}), Prints("b\n"));
    ASSERT_EQ(tool({"tidy"}).exitCode, 0);
    writeText(whole);
    EXPECT_THAT(tool({"label", "find", "Mine"}), Prints("a\nb\n"));

    replaceInText("\"a\"\n", "");
    EXPECT_THAT(tool({"tidy", "--personal"}), SucceedsSilently());
    writeText(whole);
    EXPECT_THAT(tool({"label", "find", "Mine"}), Prints("b\n"));
}

TEST_F(PersonalLabels, inADamagedTextAreReportedAndRepaired) {
    createPersonal("Mine", "Later", "a");
    std::string content;
    {
        std::ifstream file(personalText(), std::ios::binary);
        content.assign(std::istreambuf_iterator<char>(file), {});
    }
    content.insert(content.find('\n') + 1, "damaged\n");
    std::ofstream(personalText(), std::ios::binary) << content;

    auto const checked = tool({"check"});
    EXPECT_EQ(3, checked.exitCode);
    EXPECT_THAT(checked.output, AllOf(HasSubstr("the personal text"), HasSubstr("line 2")));
    EXPECT_NE(0, tool({"label", "put", "Mine", "Later", "b", "--personal"}).exitCode);
    EXPECT_THAT(tool({"category", "create", "Status"}), SucceedsSilently());

    EXPECT_THAT(tool({"check", "--repair"}).output, HasSubstr(".projectdata/local/damaged-"));
    EXPECT_THAT(tool({"label", "put", "Mine", "Later", "b", "--personal"}), SucceedsSilently());
    EXPECT_THAT(tool({"label", "find", "Mine"}), Prints("a\nb\n"));
}

TEST_F(PersonalLabels, followTheFilesThatMove) {
    createPersonal("Mine", "Later", "a");

    ASSERT_EQ(tool({"move", "a", "d"}).exitCode, 0);

    EXPECT_THAT(tool({"label", "find", "Mine"}), Prints("d\n"));
}

TEST_F(PersonalLabels, canBePutInAProjectThatIsReadOnly) {
    using std::filesystem::perms;
    createPersonal("Mine", "Later", "a");
    std::filesystem::permissions(folder_.onDisk(), perms(0755));
    std::filesystem::permissions(personalText().parent_path(), perms(0777));
    std::filesystem::permissions(personalText(), perms(0666));
    std::filesystem::permissions(text(), perms(0444));
    std::filesystem::permissions(text().parent_path(), perms(0555));
    dropPrivileges();

    EXPECT_THAT(tool({"label", "put", "Mine", "Later", "b", "--personal"}), SucceedsSilently());
    EXPECT_NE(tool({"remove", "c"}).exitCode, 0);

    EXPECT_THAT(tool({"label", "find", "Mine"}), Prints("a\nb\n"));
}

/// Another person's moves, which arrive in a merge.
class PersonalLabelsAfterMerge : public PersonalLabels {
protected:
    void SetUp() override {
        PersonalLabels::SetUp();
        std::string lines;
        for (int line = 0; line < 30; ++line) {
            lines += std::to_string(line) + '\n';
        }
        folder_.addFile("pump.c", lines);
        ASSERT_THAT(tool({"add", "pump.c"}), SucceedsSilently());
        createPersonal("Mine", "Later", "pump.c");
        git_.commitAll();
        git_.run({"switch", "-q", "-c", "hers"});
        ASSERT_THAT(tool({"move", "pump.c", "engine.c"}), SucceedsSilently());
        git_.commitAll();
        folder_.addFile("engine.c", lines + "more\n");
        ASSERT_THAT(tool({"move", "engine.c", "motor.c"}), SucceedsSilently());
        git_.commitAll();
        // On this side, the person has put the label on the file under its old name.
        git_.run({"switch", "-q", "main"});
        ASSERT_THAT(tool({"label", "take", "Mine", "Later", "pump.c", "--personal"}), ::testing::_);
        ASSERT_THAT(tool({"label", "put", "Mine", "Later", "pump.c", "--personal"}), SucceedsSilently());
        ASSERT_THAT(tool({"tidy", "--personal"}).exitCode, 0);
        git_.run({"merge", "-q", "--no-ff", "-m", "hers", "hers"});
    }

    GitFolder const git_{folder_.onDisk()};
};

TEST_F(PersonalLabelsAfterMerge, areOfferedAndFollowWhenTheMoveIsAdopted) {
    EXPECT_THAT(tool({"label", "show", "motor.c"}), SucceedsSilently()) << "the label is hidden";

    EXPECT_THAT(tool({"status", "--renames"}).output,
                HasSubstr("ren  pump.c -> motor.c (personal labels)\n"));
    EXPECT_THAT(tool({"status", "--renames", "--json"}).output,
                HasSubstr("\"from\": \"pump.c\", \"to\": \"motor.c\", \"kind\": \"file\", \"evidence\": "
                          "\"similarity\""));
    EXPECT_THAT(tool({"adopt"}), SucceedsSilently());

    EXPECT_THAT(tool({"label", "show", "motor.c"}), Prints("Mine: Later (personal)\n"));
    EXPECT_EQ(git_.run({"status", "--porcelain"}), "") << "the project has not changed";
    EXPECT_THAT(tool({"status", "--renames"}).output, Not(HasSubstr("ren ")));
}

TEST_F(PersonalLabelsAfterMerge, stayHiddenWhereTheFileHasPersonalLabels) {
    ASSERT_THAT(tool({"label", "put", "Mine", "Later", "motor.c", "--personal"}), SucceedsSilently());

    EXPECT_THAT(tool({"status", "--renames"}).output, Not(HasSubstr("ren ")));
    EXPECT_THAT(tool({"adopt", "pump.c", "motor.c"}), FailsWith(1, "cannot follow to \"motor.c\""));

    EXPECT_THAT(tool({"tidy", "--personal"}).exitCode, 0);
}

TEST_F(PersonalLabelsAfterMerge, followAGivenPair) {
    EXPECT_THAT(tool({"adopt", "pump.c", "a"}), SucceedsSilently());

    EXPECT_THAT(tool({"label", "show", "a"}), Prints("Mine: Later (personal)\n"));
}

} // namespace
} // namespace project::test
