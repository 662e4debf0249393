#include <filesystem>
#include <fstream>
#include <map>
#include <string>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "project/files/FileMetadataManager.hpp"
#include "project/git/GitError.hpp"
#include "project/metadata/Messages.hpp"
#include "project/metadata/MetadataNodeSpecification.hpp"
#include "project/metadata/ProjectException.hpp"
#include "project/session.hpp"
#include "project/stores/StoreError.hpp"
#include "support/EventLog.hpp"
#include "support/GitFolder.hpp"
#include "support/GlobalLocale.hpp"
#include "support/TemporaryFolder.hpp"

namespace project::session {
namespace {

using management::CategoryDefinition;
using management::EntryPointDefinition;
using management::Label;
using management::LabelDefinition;
using ::testing::AllOf;
using ::testing::Contains;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::Not;
using Reason = MoveError::Reason;
using namespace std::string_view_literals;

/// A project in a repository, with a label to put on files.
class Moves : public ::testing::Test {
protected:
    Moves() {
        session.project().getLabelManager().createCategory(status);
        session.project().getLabelManager().createLabel(status, done.getLabelIdentifier());
    }

    std::vector<Path> add(std::vector<std::u16string> const& names) {
        std::vector<Path> files;
        for (auto const& name : names) {
            files.push_back(folder.file(name, "content of " + std::filesystem::path(name).string()));
        }
        session.project().getFileManager().add(files);
        return files;
    }

    void label(std::u16string const& name) {
        session.project().getFileManager().addLabels({folder.path(name)}, {done});
    }

    bool isLabelled(std::u16string const& name) {
        return session.project().getFileManager().getLabelIDSets(folder.path(name)).size() == 1;
    }

    std::vector<Move> move(std::vector<std::u16string> const& names, std::u16string const& to) {
        std::vector<Path> sources;
        for (auto const& name : names) {
            sources.push_back(folder.path(name));
        }
        return session.move(sources, to.empty() ? folder.root() : folder.path(to));
    }

    /// The paths of the project, relative to the root.
    std::vector<std::string> listed() {
        std::vector<std::string> result;
        for (auto const& file : session.find({})) {
            result.push_back(
                fl::filesystem::toSystem(file.path).lexically_relative(folder.onDisk()).string());
        }
        return result;
    }

    bool isOnDisk(std::string const& name) const {
        return std::filesystem::exists(std::filesystem::symlink_status(folder.onDisk() / name));
    }

    std::string contentOf(std::string const& name) const {
        std::ifstream file(folder.onDisk() / name, std::ios::binary);
        return {std::istreambuf_iterator<char>(file), {}};
    }

    std::string text() const { return contentOf(".projectdata/project.jsonl"); }

    std::string status_() const { return git.run({"status", "--porcelain", "--untracked-files=all"}); }

    /// Expects that a move is refused, and that nothing has changed.
    void expectRefused(Reason reason, std::vector<std::u16string> const& names, std::u16string const& to) {
        auto const before = text();
        auto const inGit = status_();
        try {
            move(names, to);
            ADD_FAILURE() << "the move was not refused";
        } catch (MoveError const& error) {
            EXPECT_EQ(error.reason(), reason) << error.what();
        }
        EXPECT_EQ(text(), before);
        EXPECT_EQ(status_(), inGit);
        EXPECT_FALSE(isOnDisk(".projectdata/local"));
    }

    test::TemporaryFolder folder;
    test::GitFolder const git{folder.onDisk()};
    Session session = Session::create(folder.root(), u"Engine");
    CategoryDefinition const status{u"Status"};
    Label const done{status, LabelDefinition(u"Done")};
};

TEST_F(Moves, aFileKeepsItsLabelsAndItsHistoryInGit) {
    add({u"src/main.cpp"});
    label(u"src/main.cpp");
    git.commitAll();

    EXPECT_THAT(move({u"src/main.cpp"}, u"src/start.cpp"),
                ElementsAre(Move{folder.path(u"src/main.cpp"), folder.path(u"src/start.cpp")}));

    EXPECT_THAT(listed(), ElementsAre("src", "src/start.cpp"));
    EXPECT_TRUE(isLabelled(u"src/start.cpp"));
    EXPECT_FALSE(isOnDisk("src/main.cpp"));
    EXPECT_EQ(contentOf("src/start.cpp"), "content of src/main.cpp");
    EXPECT_EQ(status_(), "M  .projectdata/project.jsonl\nR  src/main.cpp -> src/start.cpp\n");
    EXPECT_FALSE(isOnDisk(".projectdata/local"));
}

TEST_F(Moves, aFolderMovesWithEverythingBelowItAlsoWithFilesOutsideTheProject) {
    add({u"src/a.c", u"src/io/b.c"});
    label(u"src");
    label(u"src/io/b.c");
    folder.file(u"src/io/untracked.o");
    git.run({"commit", "-q", "-a", "-m", "first"});

    move({u"src"}, u"lib");

    EXPECT_THAT(listed(), ElementsAre("lib", "lib/a.c", "lib/io", "lib/io/b.c"));
    EXPECT_TRUE(isLabelled(u"lib"));
    EXPECT_TRUE(isLabelled(u"lib/io/b.c"));
    EXPECT_TRUE(isOnDisk("lib/io/untracked.o"));
    EXPECT_FALSE(isOnDisk("src"));
    EXPECT_EQ(status_(), "M  .projectdata/project.jsonl\nR  src/a.c -> lib/a.c\n"
                         "R  src/io/b.c -> lib/io/b.c\n?? lib/io/untracked.o\n");
    auto const found = session.find({.kind = FileKind::Folder});
    EXPECT_EQ(found.size(), 2U) << "folders stay folders";
}

TEST_F(Moves, severalFilesMoveIntoAFolderThatIsAddedToTheProject) {
    add({u"a", u"b"});
    folder.folder(u"docs/new");

    move({u"a", u"b", u"a"}, u"docs/new");

    EXPECT_THAT(listed(), ElementsAre("docs", "docs/new", "docs/new/a", "docs/new/b"));
    auto const folders = session.find({.kind = FileKind::Folder});
    EXPECT_EQ(folders.size(), 2U);
}

TEST_F(Moves, theCaseOfANameCanChange) {
    add({u"a.txt"});
    label(u"a.txt");

    move({u"a.txt"}, u"A.txt");

    EXPECT_THAT(listed(), ElementsAre("A.txt"));
    EXPECT_TRUE(isLabelled(u"A.txt"));
    EXPECT_TRUE(isOnDisk("A.txt"));
    EXPECT_FALSE(isOnDisk("a.txt"));
}

TEST_F(Moves, stagedContentStaysStagedAndAChangeThatIsNotStagedStaysOne) {
    add({u"a", u"b"});
    git.commitAll();
    folder.file(u"a", "staged\n");
    git.run({"add", "a"});
    folder.file(u"a", "dirty\n");
    folder.file(u"b", "dirty\n");
    folder.folder(u"d");

    move({u"a", u"b"}, u"d");

    EXPECT_EQ(git.run({"show", ":d/a"}), "staged\n");
    EXPECT_EQ(git.run({"show", ":d/b"}), "content of b");
    EXPECT_EQ(contentOf("d/a"), "dirty\n");
    EXPECT_EQ(git.run({"diff", "--name-only"}), "d/a\nd/b\n");
    EXPECT_EQ(git.run({"ls-files"}), ".projectdata/.gitattributes\n.projectdata/.gitignore\n"
                                     ".projectdata/project.jsonl\nd/a\nd/b\n");
}

TEST_F(Moves, aFileThatGitDoesNotTrackStaysUntracked) {
    add({u"a"});
    git.run({"rm", "-q", "--cached", "a"});

    move({u"a"}, u"b");

    EXPECT_THAT(git.run({"ls-files"}), Not(HasSubstr("b\n")));
    EXPECT_THAT(listed(), ElementsAre("b"));
}

TEST_F(Moves, gitSeesTheSameIndexAsAfterItsOwnMove) {
    add({u"src/a", u"src/b", u"src/deep/c", u"top"});
    git.commitAll();
    git.run({"update-index", "--assume-unchanged", "src/b"});
    folder.file(u"src/new", "not committed");
    git.run({"add", "-N", "src/new"});
    std::filesystem::copy(folder.onDisk(), folder.onDisk().string() + "-git",
                          std::filesystem::copy_options::recursive);
    test::GitFolder const other(folder.onDisk().string() + "-git");
    other.run({"mv", "src", "lib"});
    auto const expected = other.run({"ls-files", "-s", "-v", "lib", "top"});
    std::filesystem::remove_all(folder.onDisk().string() + "-git");

    move({u"src"}, u"lib");

    EXPECT_EQ(git.run({"ls-files", "-s", "-v", "lib", "top"}), expected);
    EXPECT_EQ(git.run({"diff", "--name-only", "--diff-filter=A"}), "lib/new\n") << "still only intended";
}

TEST_F(Moves, dataInOtherScopesFollows) {
    add({u"src/a"});
    auto const scope = session.project().getFileManager().getFileMetadataManagerFor(u"Build");
    auto node = std::make_shared<metadata::MetadataNodeSpecification>(u"Info");
    node->put(u"Flags", u"-O2");
    scope->setFileNodes({{folder.path(u"src/a"), node}});

    move({u"src"}, u"lib");

    EXPECT_EQ(scope->getFileNode(folder.path(u"lib/a"))->get(u"Flags"), u"-O2");
    EXPECT_FALSE(scope->hasFileNode(folder.path(u"src/a")));
}

TEST_F(Moves, entryPointsTheProjectPathAndReferencesFollow) {
    add({u"src/main.cpp"});
    folder.folder(u"src/include");
    folder.folder(u"src/pump");
    EntryPointDefinition entry(folder.path(u"src/main.cpp"));
    session.project().getEntryPointManager().setEntryPoint(entry);
    auto const relative = [this](std::u16string const& path) {
        return management::relativeFolderReference(folder.path(path), folder.root());
    };
    auto& path = session.project().getProjectPathManager().getFolderReferenceManager();
    path.addReferences({relative(u"src/include")});
    auto& references = session.project().getProjectReferenceManager().getFolderReferenceManager();
    references.addReferences({relative(u"src/pump")});

    move({u"src"}, u"lib");

    auto const entries = session.project().getEntryPointManager().getEntryPoints();
    ASSERT_EQ(entries.size(), 1U);
    EXPECT_EQ(entries.front()->getFile(), folder.path(u"lib/main.cpp"));
    EXPECT_THAT(text(),
                AllOf(HasSubstr("\"lib/include\""), HasSubstr("\"lib/pump\""), Not(HasSubstr("src"))));
}

/// The stored paths of a project's references, and then those of its project path.
std::vector<std::u16string> storedReferencesOf(Path const& root) {
    auto session = Session::open(root, {SourceControl::Off});
    std::vector<std::u16string> result;
    for (auto const& reference :
         session.project().getProjectReferenceManager().getFolderReferenceManager().getReferences()) {
        result.push_back(reference.getStoredPath());
    }
    for (auto const& reference :
         session.project().getProjectPathManager().getFolderReferenceManager().getReferences()) {
        result.push_back(reference.getStoredPath());
    }
    return result;
}

void addReference(Path const& root, Path const& target) {
    auto session = Session::open(root, {SourceControl::Off});
    session.project().getProjectReferenceManager().getFolderReferenceManager().addReferences(
        {management::relativeFolderReference(target, root)});
}

TEST_F(Moves, theReferencesOfAProjectInAMovedFolderFollow) {
    add({u"libs/pump/main.c"});
    folder.folder(u"deep");
    folder.folder(u"tools");
    auto const pump = folder.path(u"libs/pump");
    Session::create(pump, u"Pump", {SourceControl::Off});
    Session::create(folder.path(u"tools"), u"Tools", {SourceControl::Off});
    addReference(pump, folder.path(u"tools"));
    ASSERT_THAT(storedReferencesOf(pump), ElementsAre(u"../../tools"));
    {
        auto const transaction = session.transaction();
        move({u"libs/pump"}, u"deep/pump2");
        move({u"deep"}, u"d");
        EXPECT_THAT(storedReferencesOf(folder.path(u"d/pump2")), ElementsAre(u"../../tools"));
        move({u"d/pump2"}, u"pump");
        EXPECT_THAT(storedReferencesOf(folder.path(u"pump")), ElementsAre(u"../tools"));
    }

    EXPECT_THAT(storedReferencesOf(pump), ElementsAre(u"../../tools"));
}

TEST_F(Moves, aReferenceToTheProjectAroundItFollowsAlsoWhereItWouldLeadToAnotherFolder) {
    add({u"libs/pump/main.c", u"deep/libs/x"});
    auto const pump = folder.path(u"libs/pump");
    Session::create(pump, u"Pump", {SourceControl::Off});
    addReference(pump, folder.root());
    ASSERT_THAT(storedReferencesOf(pump), ElementsAre(u"../.."));

    move({u"libs/pump"}, u"deep/libs/pump");

    EXPECT_THAT(storedReferencesOf(folder.path(u"deep/libs/pump")), ElementsAre(u"../../.."));
}

TEST_F(Moves, theReferencesOfReferencedProjectsToAMovedFolderFollow) {
    add({u"libs/pump/main.c"});
    test::TemporaryFolder const elsewhere;
    Session::create(elsewhere.root(), u"Elsewhere", {SourceControl::Off});
    Session::create(folder.path(u"libs/pump"), u"Pump", {SourceControl::Off});
    addReference(elsewhere.root(), folder.path(u"libs/pump"));
    addReference(folder.root(), elsewhere.root());

    move({u"libs/pump"}, u"pump");

    EXPECT_THAT(
        storedReferencesOf(elsewhere.root()),
        ElementsAre(
            management::relativeFolderReference(folder.path(u"pump"), elsewhere.root()).getStoredPath()));
    auto const now = storedReferencesOf(elsewhere.root());
    move({u"pump"}, u"libs/pump");
    EXPECT_NE(storedReferencesOf(elsewhere.root()), now);
}

TEST_F(Moves, observersGetTheEventsOfTheChangesAfterTheyAreCommitted) {
    add({u"src/a", u"src/b"});
    label(u"src/a");
    EntryPointDefinition entry(folder.path(u"src/a"));
    session.project().getEntryPointManager().setEntryPoint(entry);
    test::EventLog log(*session.events());

    move({u"src"}, u"lib");

    auto const at = [this](std::u16string const& name) { return folder.path(name).native(); };
    EXPECT_THAT(log.take(),
                ElementsAre(u"fileListUpdate " + at(u"lib") + u" " + at(u"lib/a") + u" " + at(u"lib/b") +
                                u" " + at(u"src") + u" " + at(u"src/a") + u" " + at(u"src/b"),
                            u"fileLabelsChanged " + at(u"lib/a"), u"entryPointsChanged"));
}

TEST_F(Moves, ontoItselfDoesNothing) {
    add({u"src/a"});
    git.commitAll();
    auto const before = text();
    test::EventLog log(*session.events());

    EXPECT_THAT(move({u"src/a"}, u"src/a"), IsEmpty());
    EXPECT_THAT(move({u"src/a"}, u"src"), IsEmpty());
    EXPECT_THAT(move({u"src"}, u"src"), IsEmpty());

    EXPECT_EQ(text(), before);
    EXPECT_EQ(status_(), "");
    EXPECT_THAT(log.take(), IsEmpty());
}

TEST_F(Moves, areRefusedWithTheReason) {
    add({u"src/a", u"b", u"c/a"});
    folder.file(u"there");
    folder.folder(u"full/b");
    std::filesystem::create_directory_symlink(folder.onDisk() / "src", folder.onDisk() / "link");
    add({u"gone"});
    folder.remove(u"gone");
    git.commitAll();

    expectRefused(Reason::Exists, {u"b"}, u"there");
    expectRefused(Reason::Exists, {u"b"}, u"full");
    expectRefused(Reason::IsInProject, {u"b"}, u"gone");
    expectRefused(Reason::IsMissing, {u"gone"}, u"back");
    expectRefused(Reason::LeavesProject, {u"b"}, u"../outside");
    expectRefused(Reason::EntersStore, {u"b"}, u".projectdata/b");
    expectRefused(Reason::EntersItself, {u"src"}, u"src/deeper");
    expectRefused(Reason::HasNoFolder, {u"b"}, u"nowhere/b");
    expectRefused(Reason::HasNoFolder, {u"b", u"src"}, u"nowhere");
    expectRefused(Reason::HasNoFolder, {u"b"}, u"nowhere/");
    expectRefused(Reason::IsBeyondLink, {u"b"}, u"link/b");
    expectRefused(Reason::IsNested, {u"src", u"src/a"}, u"full");
    expectRefused(Reason::IsInProject, {u"src/a", u"c/a"}, u"full");
    expectRefused(Reason::IsRoot, {u""}, u"full");
    EXPECT_THROW(move({u"there"}, u"elsewhere"),
                 exception::Raised<ZEPHRA::project::management::FileNotInProject>);
}

TEST_F(Moves, aHardLinkWithANameInAnotherCaseIsSomethingThatExists) {
    add({u"a.txt"});
    std::filesystem::create_hard_link(folder.onDisk() / "a.txt", folder.onDisk() / "A.txt");

    expectRefused(Reason::Exists, {u"a.txt"}, u"A.txt");
}

TEST_F(Moves, areUndoneWithTheTransactionThatContainsThem) {
    add({u"a", u"src/b"});
    git.commitAll();
    auto const before = text();
    {
        auto const transaction = session.transaction();
        move({u"a"}, u"c");
        move({u"src"}, u"lib");
        move({u"lib/b"}, u"a");
        EXPECT_TRUE(isOnDisk("c"));
        EXPECT_EQ(contentOf("a"), "content of src/b");
    }

    EXPECT_EQ(contentOf("a"), "content of a");
    EXPECT_EQ(contentOf("src/b"), "content of src/b");
    EXPECT_EQ(text(), before);
    EXPECT_EQ(status_(), "");
    EXPECT_FALSE(isOnDisk(".projectdata/local"));
}

TEST_F(Moves, inATransactionFollowEachOther) {
    add({u"a", u"b"});
    label(u"a");
    git.commitAll();
    auto transaction = session.transaction();
    move({u"a"}, u"c");
    move({u"b"}, u"a");
    {
        auto const nested = session.transaction();
        move({u"c"}, u"d");
    }
    auto const added = folder.file(u"new");
    session.project().getFileManager().add({added});
    move({u"new"}, u"newer");
    transaction.commit();

    EXPECT_THAT(listed(), ElementsAre("a", "c", "newer"));
    EXPECT_TRUE(isLabelled(u"c"));
    EXPECT_EQ(contentOf("c"), "content of a");
    EXPECT_EQ(git.run({"show", ":c"}), "content of a");
    EXPECT_EQ(git.run({"show", ":a"}), "content of b");
    EXPECT_EQ(git.run({"show", ":newer"}), "content");
    EXPECT_EQ(git.run({"diff", "--name-only"}), "");
}

TEST_F(Moves, aMoveThatGitRefusesIsUndone) {
    add({u"a"});
    git.commitAll();
    std::ofstream(folder.onDisk() / ".git" / "index.lock").put('x');
    auto const before = text();

    EXPECT_THROW(move({u"a"}, u"b"), git::GitError);

    EXPECT_TRUE(isOnDisk("a"));
    EXPECT_FALSE(isOnDisk("b"));
    EXPECT_EQ(text(), before);
    EXPECT_FALSE(isOnDisk(".projectdata/local"));
}

TEST_F(Moves, aFileInAConflictOfGitStaysWhereItIs) {
    add({u"a"});
    git.commitAll();
    git.run({"checkout", "-q", "-b", "other"});
    folder.file(u"a", "theirs\n");
    git.commitAll();
    git.run({"checkout", "-q", "main"});
    folder.file(u"a", "ours\n");
    git.commitAll();
    EXPECT_NE(git.tryTo({"merge", "other"}).exitCode, 0);

    EXPECT_THROW(move({u"a"}, u"b"), git::GitError);

    EXPECT_THAT(status_(), HasSubstr("UU a\n"));
    EXPECT_TRUE(isOnDisk("a"));
}

TEST_F(Moves, outsideARepositoryTheFileAndTheDefinitionMove) {
    test::TemporaryFolder const plain;
    auto other = Session::create(plain.root(), u"Plain", {SourceControl::Off});
    other.project().getFileManager().add({plain.file(u"a")});

    other.move({plain.path(u"a")}, plain.path(u"b"));

    EXPECT_TRUE(other.project().getFileManager().isFileInProject(plain.path(u"b")));
    EXPECT_TRUE(std::filesystem::exists(plain.onDisk() / "b"));
    EXPECT_FALSE(std::filesystem::exists(plain.onDisk() / ".projectdata" / "local"));
}

TEST_F(Moves, aRecordThatWasCopiedWithAFolderMovesNothing) {
    add({u"a"});
    folder.file(u"evil");
    std::filesystem::create_directory(folder.onDisk() / ".projectdata" / "local");
    std::ofstream(folder.onDisk() / ".projectdata" / "local" / "moves")
        << "moves 1\000123 4 5\0state\0index\0evil\0a2\0\0end\0"sv;
    EXPECT_TRUE(session.hasUnfinishedMove());

    label(u"a");

    EXPECT_TRUE(isOnDisk("a"));
    EXPECT_FALSE(session.hasUnfinishedMove());
    EXPECT_EQ(session.takeRecoveredMoves(), std::nullopt);
}

TEST_F(Moves, anErrorIsInTheLanguageOfTheProcess) {
    add({u"gone"});
    std::filesystem::remove(folder.onDisk() / "gone");
    test::GlobalLocale const language("de_DE");
    auto const from = (folder.onDisk() / "gone").string();
    auto const to = (folder.onDisk() / "back").string();

    try {
        move({u"gone"}, u"back");
        FAIL() << "nothing was thrown";
    } catch (MoveError const& error) {
        EXPECT_EQ(error.what(), from + " -> " + to + ": die Datei ist nicht auf der Festplatte.");
    }
}

TEST_F(Moves, theErrorOfTheSessionIsInTheLanguageOfTheProcess) {
    test::GlobalLocale const language("de_DE");
    test::TemporaryFolder const empty;

    try {
        Session::open(empty.root());
        FAIL() << "nothing was thrown";
    } catch (stores::StoreError const& error) {
        EXPECT_EQ(error.problem(), "in diesem Ordner gibt es kein Projekt");
        EXPECT_EQ(error.remedy(), "Prüfen Sie den Pfad, oder legen Sie dort ein Projekt an.");
    }
}

} // namespace
} // namespace project::session
