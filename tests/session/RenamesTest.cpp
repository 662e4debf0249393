#include <filesystem>
#include <fstream>
#include <stdexcept>
#include <string>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "project/session.hpp"
#include "support/GitFolder.hpp"
#include "support/TemporaryFolder.hpp"

namespace project::session {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using Evidence = Rename::Evidence;

/// Lines that differ from each other.
std::string lines(int first, int count) {
    std::string result;
    for (int line = first; line < first + count; ++line) {
        result += "line " + std::to_string(line) + '\n';
    }
    return result;
}

Rename file(std::u16string const& from, std::u16string const& to, Evidence evidence, int similarity) {
    return {from, to, FileKind::File, evidence, similarity};
}

/// A project outside git.
class RenamesTest : public ::testing::Test {
protected:
    void add(std::u16string const& path, std::string const& content) {
        session_.project().getFileManager().add({folder_.file(path, content)});
    }

    void rename(char const* from, char const* to) const {
        std::filesystem::create_directories((folder_.onDisk() / to).parent_path());
        std::filesystem::rename(folder_.onDisk() / from, folder_.onDisk() / to);
    }

    void append(char const* file, std::string const& text) const {
        std::ofstream(folder_.onDisk() / file, std::ios::app) << text;
    }

    test::TemporaryFolder const folder_;
    Session session_ = Session::create(folder_.root(), u"Pump", {.sourceControl = SourceControl::Off});
};

/// The same in a git repository.
class RenamesInRepository : public RenamesTest {
protected:
    RenamesInRepository() { session_ = Session::open(folder_.root()); }

    test::GitFolder const git_{folder_.onDisk()};
};

TEST_F(RenamesInRepository, findsAFileThatWasRenamedAndEdited) {
    add(u"src/pump.c", lines(0, 100));
    git_.commitAll();
    rename("src/pump.c", "lib/motor.c");
    append("lib/motor.c", lines(1000, 10));

    auto const found = session_.findRenames();

    auto const size = lines(0, 100).size();
    auto const similarity = static_cast<int>(size * 100 / (size + lines(1000, 10).size()));
    EXPECT_THAT(found.pairs,
                ElementsAre(file(u"src/pump.c", u"lib/motor.c", Evidence::Similarity, similarity)));
    EXPECT_THAT(session_.findRenames({.similarity = similarity + 1}).pairs, IsEmpty());
    EXPECT_THAT(session_.findRenames({.similarity = 100}).pairs, IsEmpty());
}

TEST_F(RenamesInRepository, findsARenameThatWasCommittedAndOneAfterIt) {
    add(u"a", lines(0, 50));
    add(u"b", lines(100, 50));
    git_.commitAll();
    git_.run({"mv", "a", "c"});
    git_.commitAll();
    append("c", "more\n");
    git_.commitAll();
    rename("b", "d");

    auto const found = session_.findRenames();

    ASSERT_EQ(found.pairs.size(), 2U);
    EXPECT_EQ(found.pairs[0].to, u"c");
    EXPECT_EQ(found.pairs[0].evidence, Evidence::Similarity);
    EXPECT_EQ(found.pairs[1], file(u"b", u"d", Evidence::Content, 100));
}

TEST_F(RenamesInRepository, findsARenameOfAMergedBranch) {
    add(u"a", lines(0, 50));
    git_.commitAll();
    git_.run({"checkout", "-q", "-b", "other"});
    git_.run({"mv", "a", "b"});
    git_.commitAll();
    git_.run({"checkout", "-q", "-"});
    folder_.file(u"elsewhere", "other\n");
    git_.commitAll();
    git_.run({"merge", "-q", "--no-edit", "other"});

    EXPECT_THAT(session_.findRenames().pairs, ElementsAre(file(u"a", u"b", Evidence::Content, 100)));
}

/// The text was written after the rename, so that the commit that wrote it does not contain the old file.
TEST_F(RenamesInRepository, findsTheContentThatACommitDeletedBeforeTheTextWasWritten) {
    add(u"a", lines(0, 50));
    git_.commitAll();
    git_.run({"mv", "a", "b"});
    git_.commitAll();
    add(u"other", "other\n");
    git_.commitAll();

    EXPECT_THAT(session_.findRenames().pairs, ElementsAre(file(u"a", u"b", Evidence::Content, 100)));
}

TEST_F(RenamesInRepository, similarFilesOfWhichEachMayBeTheOneAreAmbiguous) {
    add(u"a", lines(0, 50));
    git_.commitAll();
    folder_.remove(u"a");
    folder_.file(u"b", lines(0, 50) + "first\n");
    folder_.file(u"c", lines(0, 50) + "other\n");

    auto const found = session_.findRenames();

    EXPECT_THAT(found.pairs, IsEmpty());
    EXPECT_EQ(found.ambiguous, (std::vector<AmbiguousRename>{{{u"a"}, {u"b", u"c"}}}));
}

TEST_F(RenamesInRepository, leavesOutWhatASparseCheckoutLeftOut) {
    add(u"out/a", lines(0, 50));
    add(u"in/b", lines(100, 50));
    git_.commitAll();
    git_.run({"sparse-checkout", "set", "--no-cone", "/*", "!/out/"});
    folder_.file(u"in/copy", lines(0, 50));

    EXPECT_TRUE(session_.findRenames().isEmpty());
}

TEST_F(RenamesInRepository, namesDecideIfGitIsNotToBeUsed) {
    add(u"a/x", lines(0, 50));
    add(u"a/y", lines(100, 50));
    git_.commitAll();
    rename("a/x", "b/x");
    rename("a/y", "b/z");

    EXPECT_THAT(session_.findRenames({.usesGit = false}).pairs,
                ElementsAre(file(u"a/x", u"b/x", Evidence::Name, 0)));
}

TEST_F(RenamesInRepository, syncFollowsAFileThatWasRenamedAndEdited) {
    add(u"src/a", lines(0, 100));
    add(u"src/b", lines(1000, 100));
    session_.setSyncRule({folder_.path(u"src")});
    git_.commitAll();
    rename("src/a", "src/new");
    append("src/new", lines(500, 10));
    folder_.remove(u"src/b");
    folder_.file(u"src/unlike", lines(1000, 30));

    auto const plan = session_.sync();

    EXPECT_EQ(plan.renamed, (std::vector<Move>{{folder_.path(u"src/a"), folder_.path(u"src/new")}}));
    ASSERT_EQ(plan.added.size(), 1U);
    EXPECT_EQ(plan.added.front().path, folder_.path(u"src/unlike"));
}

TEST_F(RenamesTest, refuseASimilarityThatIsNotAPercentage) {
    for (int const similarity : {-1, 0, 101}) {
        EXPECT_THROW(session_.findRenames({.similarity = similarity}), std::invalid_argument) << similarity;
        EXPECT_THROW(session_.sync({.similarity = similarity}), std::invalid_argument) << similarity;
    }
    for (int const similarity : {1, 100}) {
        EXPECT_TRUE(session_.findRenames({.similarity = similarity}).isEmpty()) << similarity;
    }
}

TEST_F(RenamesInRepository, syncFollowsFromTheSimilarityOfItsOptions) {
    add(u"src/a", lines(0, 100));
    session_.setSyncRule({folder_.path(u"src")});
    git_.commitAll();
    rename("src/a", "src/new");
    append("src/new", lines(500, 10));

    EXPECT_THAT(session_.sync({.similarity = 99}).renamed, IsEmpty());
}

TEST_F(RenamesTest, aFolderOfGuessesIsAGuessAndSyncDoesNotFollowIt) {
    add(u"a/x", "1\n");
    session_.setSyncRule({folder_.root()});
    rename("a/x", "b/x");
    folder_.remove(u"a");

    EXPECT_THAT(session_.findRenames().pairs,
                ElementsAre(Rename{u"a", u"b", FileKind::Folder, Evidence::Name, 0},
                            file(u"a/x", u"b/x", Evidence::Name, 0)));
    EXPECT_THAT(session_.sync({.removesMissingFolders = true}).renamed, IsEmpty());
}

TEST_F(RenamesTest, outsideARepositoryNamesAreAGuess) {
    add(u"a/x", "1\n");
    add(u"a/y", "2\n");
    rename("a/x", "b/x");
    rename("a/y", "b/z");

    auto const found = session_.findRenames();

    EXPECT_THAT(found.pairs, ElementsAre(file(u"a/x", u"b/x", Evidence::Name, 0)));
}

} // namespace
} // namespace project::session
