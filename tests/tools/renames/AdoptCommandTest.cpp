#include "support/GitFolder.hpp"
#include "tools/ToolTest.hpp"

namespace project::test {
namespace {

using ::testing::AllOf;
using ::testing::HasSubstr;
using ::testing::Not;

class AdoptCommand : public ToolTest {
protected:
    void SetUp() override {
        initProject();
        folder_.file(u"src/a.c", numbers(0));
        folder_.file(u"src/b.c", numbers(100));
        folder_.file(u"src/io/c.c", numbers(200));
        folder_.file(u"top", numbers(300));
        ASSERT_THAT(tool({"add", "-r", "src", "top"}), SucceedsSilently());
        ASSERT_THAT(tool({"category", "create", "Status"}), SucceedsSilently());
        ASSERT_THAT(tool({"label", "create", "Status", "Done"}), SucceedsSilently());
        ASSERT_THAT(tool({"label", "put", "Status", "Done", "src", "src/b.c", "top"}), SucceedsSilently());
    }

    static std::string numbers(int first) {
        std::string result;
        for (int number = first; number < first + 40; ++number) {
            result += std::to_string(number) + '\n';
        }
        return result;
    }

    void rename(std::string const& from, std::string const& to) const {
        std::filesystem::create_directories((folder_.onDisk() / to).parent_path());
        std::filesystem::rename(folder_.onDisk() / from, folder_.onDisk() / to);
    }

    /// The lines for renames.
    std::string renames(std::vector<std::string> options = {}) const {
        options.insert(options.begin(), {"status", "--renames"});
        std::string result;
        for (auto const& line : linesOf(tool(options).output)) {
            result += line.starts_with("ren") ? line + '\n' : std::string();
        }
        return result;
    }
};

class AdoptInRepository : public AdoptCommand {
protected:
    void SetUp() override {
        AdoptCommand::SetUp();
        ASSERT_THAT(tool({"remove", "src", "top"}), SucceedsSilently());
        git_.run({"init", "-q"});
        ASSERT_THAT(tool({"add", "-r", "src", "top"}), SucceedsSilently());
        ASSERT_THAT(tool({"label", "put", "Status", "Done", "src", "src/b.c", "top"}), SucceedsSilently());
        git_.commitAll();
    }

    GitFolder const git_{folder_.onDisk()};
};

TEST_F(AdoptInRepository, findsRenamesThatAreNotStagedAndAdoptsThem) {
    rename("src/a.c", "lib/x.c");

    EXPECT_EQ(renames(), "ren  src/a.c -> lib/x.c\n");
    ASSERT_THAT(tool({"adopt"}), SucceedsSilently());

    EXPECT_THAT(tool({"list"}), Prints("lib\nlib/x.c\nsrc\nsrc/b.c\nsrc/io\nsrc/io/c.c\ntop\n"));
    EXPECT_EQ(git_.run({"status", "--porcelain"}), "M  .projectdata/project.jsonl\nR  src/a.c -> lib/x.c\n");
    EXPECT_EQ(renames(), "");
}

TEST_F(AdoptInRepository, findsRenamesThatAreStagedOrCommittedWithChanges) {
    git_.run({"mv", "src", "lib"});
    folder_.file(u"lib/b.c", numbers(100) + "more\n");
    EXPECT_EQ(renames(), "ren  src -> lib\nren  src/a.c -> lib/a.c\nren  src/b.c -> lib/b.c (96 %)\n"
                         "ren  src/io -> lib/io\nren  src/io/c.c -> lib/io/c.c\n");
    git_.commitAll();
    git_.run({"mv", "lib/a.c", "lib/z.c"});
    git_.commitAll();

    EXPECT_EQ(renames(), "ren  src/a.c -> lib/z.c\nren  src/b.c -> lib/b.c (96 %)\n"
                         "ren  src/io -> lib/io\nren  src/io/c.c -> lib/io/c.c\n");
    ASSERT_THAT(tool({"adopt"}), SucceedsSilently());

    EXPECT_THAT(tool({"label", "find", "Status"}), Prints("lib/b.c\nsrc\ntop\n"));
}

TEST_F(AdoptInRepository, findsARenameThatWasCommittedBeforeTheTextWasWrittenAgain) {
    git_.run({"mv", "top", "bottom"});
    git_.commitAll();
    ASSERT_THAT(tool({"description", "changed since"}), SucceedsSilently());
    git_.commitAll();

    EXPECT_EQ(renames(), "ren  top -> bottom\n");
}

TEST_F(AdoptInRepository, findsTheRenameOfAFileThatWasNeverCommitted) {
    folder_.file(u"new", numbers(500));
    ASSERT_THAT(tool({"add", "new"}), SucceedsSilently());
    rename("new", "newer");

    EXPECT_EQ(renames(), "ren  new -> newer\n");
}

TEST_F(AdoptInRepository, pairsBySimilarityFromTheGivenPercentage) {
    folder_.remove(u"top");
    folder_.file(u"bottom", numbers(300).substr(0, 120) + numbers(900).substr(0, 40));

    EXPECT_EQ(renames(), "ren  top -> bottom (75 %)\n");
    EXPECT_EQ(renames({"--similarity", "90"}), "");
    EXPECT_EQ(renames({"--similarity", "75"}), "ren  top -> bottom (75 %)\n");
    EXPECT_THAT(tool({"status", "--renames", "--similarity", "101"}), FailsWith(2, "from 1 to 100 percent"));
}

TEST_F(AdoptInRepository, listsAmbiguousFilesAndAdoptsTheOthers) {
    rename("top", "one");
    std::filesystem::copy(inFolder("one"), inFolder("two"));
    rename("src/a.c", "a.c");

    EXPECT_EQ(renames(), "ren  src/a.c -> a.c\nren? top -> one, two (ambiguous)\n");
    auto const adopted = tool({"adopt"});

    EXPECT_EQ(adopted.exitCode, 0);
    EXPECT_THAT(adopted.errors, HasSubstr("1 group of files is ambiguous and was left out"));
    EXPECT_THAT(tool({"list"}), Prints("a.c\nsrc\nsrc/b.c\nsrc/io\nsrc/io/c.c\ntop\n"));
    ASSERT_THAT(tool({"adopt", "top", "two"}), SucceedsSilently());
    EXPECT_THAT(tool({"label", "find", "Status"}), Prints("src\nsrc/b.c\ntwo\n"));
}

TEST_F(AdoptInRepository, listsSimilarFilesOfWhichEachMayBeTheOne) {
    folder_.remove(u"top");
    folder_.file(u"one", numbers(300) + "first\n");
    folder_.file(u"two", numbers(300) + "secnd\n");

    EXPECT_EQ(renames(), "ren? top -> one, two (ambiguous)\n");
}

TEST_F(AdoptInRepository, leavesOutFilesThatGitIgnores) {
    folder_.file(u".gitignore", "*.o\n");
    rename("top", "top.o");

    EXPECT_EQ(renames(), "");
}

TEST_F(AdoptInRepository, leavesGitsIndexAndObjectsAlone) {
    rename("src", "lib");
    auto const before = git_.run({"ls-files", "-s"});
    auto const objects = git_.run({"count-objects"});

    EXPECT_NE(renames(), "");

    EXPECT_EQ(git_.run({"ls-files", "-s"}), before);
    EXPECT_EQ(git_.run({"count-objects"}), objects);
}

TEST_F(AdoptInRepository, ofTheReversePairsRestoresTheText) {
    auto const before = readText();
    rename("src", "lib");
    rename("top", "lib/new/top");
    ASSERT_THAT(tool({"adopt"}), SucceedsSilently());
    EXPECT_THAT(tool({"label", "find", "Status"}), Prints("lib\nlib/b.c\nlib/new/top\n"));

    ASSERT_THAT(tool({"adopt", "lib/new/top", "top", "lib", "src"}), SucceedsSilently());

    EXPECT_EQ(readText(), before);
}

TEST_F(AdoptInRepository, worksInAFolderOfTheRepository) {
    TemporaryFolder const outer;
    GitFolder const git(outer.onDisk());
    std::filesystem::copy(folder_.onDisk(), outer.onDisk() / "project",
                          std::filesystem::copy_options::recursive);
    std::filesystem::remove_all(outer.onDisk() / "project" / ".git");
    git.commitAll();
    std::filesystem::rename(outer.onDisk() / "project" / "src", outer.onDisk() / "project" / "lib");
    std::ofstream(outer.onDisk() / "project" / "lib" / "a.c", std::ios::app) << "more\n";
    settings_.folder = outer.onDisk() / "project";

    EXPECT_THAT(renames(), AllOf(HasSubstr("ren  src -> lib\n"), HasSubstr("ren  src/a.c -> lib/a.c (9")));
}

TEST_F(AdoptCommand, guessesByTheNameOutsideARepository) {
    rename("src/a.c", "lib/a.c");
    rename("src/b.c", "lib/renamed.c");
    folder_.file(u"lib/c.c");
    folder_.file(u"lib/new/c.c");
    folder_.remove(u"src/io/c.c");

    EXPECT_EQ(renames(), "ren? src/a.c -> lib/a.c (a guess, by its name)\n"
                         "ren? src/io/c.c -> lib/c.c, lib/new/c.c (ambiguous)\n");
    auto const before = readText();
    EXPECT_THAT(tool({"adopt"}).errors, AllOf(HasSubstr("1 rename is a guess"), HasSubstr("ambiguous")));
    EXPECT_EQ(readText(), before);
    EXPECT_EQ(tool({"adopt", "--guesses"}).exitCode, 0);

    EXPECT_THAT(tool({"list"}).output, AllOf(HasSubstr("lib/a.c\n"), Not(HasSubstr("src/a.c\n"))));
}

TEST_F(AdoptCommand, showsItsChangesWithDryRun) {
    rename("top", "bottom");
    auto const before = readText();

    EXPECT_THAT(tool({"adopt", "--dry-run", "top", "bottom"}),
                Prints("add bottom\nput Status=Done bottom\nremove top\n"));

    EXPECT_EQ(readText(), before);
}

TEST_F(AdoptCommand, adoptsGivenPairsInOneStep) {
    ASSERT_THAT(tool({"adopt", "src/a.c", "src/b.c", "src/b.c", "src/a.c"}), SucceedsSilently());

    EXPECT_THAT(tool({"label", "find", "Status"}), Prints("src\nsrc/a.c\ntop\n"));
    auto const before = readText();
    EXPECT_THAT(tool({"adopt", "top", "x", "src/a.c", "src/b.c"}), FailsWith(1, "is in the project already"));
    EXPECT_THAT(tool({"adopt", "top"}), FailsWith(2, "\"top\" has no new path"));
    EXPECT_THAT(tool({"adopt", "nothing", "x"}), FailsWith(1, "is not in the project"));
    EXPECT_EQ(readText(), before);
}

TEST_F(AdoptCommand, showsRenamesInJson) {
    rename("top", "new/top");

    EXPECT_THAT(tool({"status", "--renames", "--json"}).output,
                AllOf(HasSubstr("{\"format\": \"projectctl-status-renames\", \"version\": 1"),
                      HasSubstr("{\"from\": \"top\", \"to\": \"new/top\", \"kind\": \"file\", "
                                "\"evidence\": \"name\", \"similarity\": 0}")));
}

} // namespace
} // namespace project::test
