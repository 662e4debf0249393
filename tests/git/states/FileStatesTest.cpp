#include <sys/stat.h>

#include "git/GitRepository.hpp"

namespace project::git {
namespace {

using std::filesystem::perms;

class FileStates : public GitTest {};

TEST_F(FileStates, aFileThatGitDoesNotTrackIs0) {
    repository.write("a");
    EXPECT_EQ(agreedStateOf("a"), 0);
}

TEST_F(FileStates, anUnmodifiedFileIs1) {
    commitFile("a");
    EXPECT_EQ(agreedStateOf("a"), 1);
}

TEST_F(FileStates, anIgnoredFileIs2ButATrackedOneIsNot) {
    repository.write("tracked.o");
    repository.commitAll();
    repository.write(".gitignore", "*.o\n/out/\n");
    repository.write("other.o");
    repository.write("out/x");
    EXPECT_EQ(agreedStateOf("other.o"), 2);
    EXPECT_EQ(agreedStateOf("out/x"), 2);
    EXPECT_EQ(agreedStateOf("tracked.o"), 1);
}

TEST_F(FileStates, aFileInAnIgnoredFolderStaysIgnoredRegardlessOfLaterRules) {
    repository.write(".gitignore", "out/\n!out/keep\n");
    repository.write("out/keep");
    EXPECT_EQ(agreedStateOf("out/keep"), 2);
}

TEST_F(FileStates, rulesBelowTheRepositorysOwnFolderCount) {
    repository.write("kept");
    repository.write("private");
    std::filesystem::create_directories(folder.onDisk() / "work/.git/info");
    folder.addFile(u"work/.git/info/exclude", "private\n");
    EXPECT_EQ(agreedStateOf("private"), 2);
    EXPECT_EQ(agreedStateOf("kept"), 0);
}

TEST_F(FileStates, aModifiedFileIs3StagedOrNot) {
    commitFile("a", "1\n");
    commitFile("b", "1\n");
    repository.write("a", "2\n");
    repository.write("b", "2\n");
    repository.run({"add", "b"});
    EXPECT_EQ(agreedStateOf("a"), 3);
    EXPECT_EQ(agreedStateOf("b"), 3);
}

TEST_F(FileStates, aChangeThatWasStagedAndRevertedOnDiskIs3) {
    commitFile("a", "1\n");
    repository.write("a", "2\n");
    repository.run({"add", "a"});
    repository.write("a", "1\n");
    EXPECT_EQ(agreedStateOf("a"), 3);
}

TEST_F(FileStates, aTrackedFileThatWasDeletedIs3) {
    commitFile("a");
    commitFile("d/b");
    repository.write("new");
    repository.run({"add", "new"});
    repository.remove("a");
    repository.remove("d");
    repository.remove("new");
    EXPECT_EQ(agreedStateOf("a"), 3);
    EXPECT_EQ(agreedStateOf("d/b"), 3);
    EXPECT_EQ(agreedStateOf("new"), 3);
}

TEST_F(FileStates, aChangedExecutableBitIs3) {
    commitFile("a");
    std::filesystem::permissions(repository.onDisk() / "a", perms::owner_all);
    EXPECT_EQ(agreedStateOf("a"), 3);
    repository.run({"config", "core.fileMode", "false"});
    EXPECT_EQ(agreedStateOf("a"), 1);
}

TEST_F(FileStates, aStagedExecutableBitIs3) {
    commitFile("a");
    std::filesystem::permissions(repository.onDisk() / "a", perms::owner_all);
    repository.run({"add", "a"});
    EXPECT_EQ(agreedStateOf("a"), 3);
}

TEST_F(FileStates, aSpecialFileInPlaceOfATrackedFileIs3AndInPlaceOfALink7) {
    commitFile("a");
    folder.addLink("work/link", "a");
    repository.commitAll();
    for (std::string const name : {"a", "link"}) {
        repository.remove(name);
        ASSERT_EQ(::mkfifo((repository.onDisk() / name).c_str(), 0600), 0);
    }
    EXPECT_EQ(agreedStateOf("a"), 3);
    EXPECT_EQ(agreedStateOf("link"), 7);
}

TEST_F(FileStates, aFileThatWasOnlyTouchedIsUnmodified) {
    commitFile("a");
    std::filesystem::last_write_time(repository.onDisk() / "a",
                                     std::filesystem::file_time_type::clock::now() + std::chrono::hours(1));
    EXPECT_EQ(agreedStateOf("a"), 1);
}

TEST_F(FileStates, aChangeThatKeepsTimesAndSizeAndCameRightAfterTheIndexIsSeen) {
    for (int i = 0; i < 20; ++i) {
        commitFile("a", "1\n");
        repository.write("a", "2\n");
        EXPECT_EQ(stateOf("a"), 3);
    }
}

TEST_F(FileStates, aConflictIs4) {
    commitFile("a", "1\n");
    repository.run({"checkout", "-q", "-b", "other"});
    commitFile("a", "2\n");
    repository.run({"checkout", "-q", "main"});
    commitFile("a", "3\n");
    EXPECT_THROW(repository.run({"merge", "other"}), std::runtime_error);
    EXPECT_EQ(agreedStateOf("a"), 4);
    repository.remove("a");
    EXPECT_EQ(agreedStateOf("a"), 4);
}

TEST_F(FileStates, aStagedNewFileIs5AlsoWhenChangedAgain) {
    commitFile("a");
    repository.write("b", "1\n");
    repository.write("c", "1\n");
    repository.write("d", "1\n");
    repository.run({"add", "b", "c"});
    repository.write("c", "2\n");
    repository.run({"add", "-N", "d"});
    EXPECT_EQ(agreedStateOf("b"), 5);
    EXPECT_EQ(agreedStateOf("c"), 5);
    EXPECT_EQ(agreedStateOf("d"), 5);
}

TEST_F(FileStates, everyStagedFileIs5BeforeTheFirstCommit) {
    repository.write("a");
    EXPECT_EQ(agreedStateOf("a"), 0);
    repository.run({"add", "a"});
    EXPECT_EQ(agreedStateOf("a"), 5);
}

TEST_F(FileStates, aStagedRemovalIs6WhetherOrNotTheFileIsThere) {
    commitFile("a");
    commitFile("b");
    repository.run({"rm", "-q", "--cached", "a"});
    repository.run({"rm", "-q", "b"});
    EXPECT_EQ(agreedStateOf("a"), 6);
    EXPECT_EQ(agreedStateOf("b"), 6);
}

TEST_F(FileStates, aFileThatBecameALinkOrTheOtherWayRoundIs7) {
    commitFile("a");
    commitFile("target");
    folder.addLink("work/link", "target");
    repository.commitAll();
    repository.remove("a");
    folder.addLink("work/a", "target");
    repository.remove("link");
    repository.write("link");
    EXPECT_EQ(agreedStateOf("a"), 7);
    EXPECT_EQ(agreedStateOf("link"), 7);
    repository.run({"add", "-A"});
    EXPECT_EQ(agreedStateOf("a"), 7);
    EXPECT_EQ(agreedStateOf("link"), 7);
}

TEST_F(FileStates, aLinkThatLeadsElsewhereIs3) {
    commitFile("target");
    folder.addLink("work/link", "target");
    repository.commitAll();
    EXPECT_EQ(agreedStateOf("link"), 1);
    repository.remove("link");
    folder.addLink("work/link", "nowher");
    EXPECT_EQ(agreedStateOf("link"), 3);
}

TEST_F(FileStates, aFileThatGitAssumesUnchangedOrSkipsIsUnmodified) {
    commitFile("assumed", "1\n");
    commitFile("skipped", "1\n");
    repository.run({"update-index", "--assume-unchanged", "assumed"});
    repository.run({"update-index", "--skip-worktree", "skipped"});
    repository.write("assumed", "2\n");
    repository.write("skipped", "2\n");
    EXPECT_EQ(agreedStateOf("assumed"), 1);
    EXPECT_EQ(agreedStateOf("skipped"), 1);
    repository.remove("assumed");
    repository.remove("skipped");
    EXPECT_EQ(agreedStateOf("assumed"), 1);
    EXPECT_EQ(agreedStateOf("skipped"), 1);
}

TEST_F(FileStates, lineEndsThatGitConvertsAreNoModification) {
    repository.write(".gitattributes", "*.txt text eol=crlf\n*.id ident\n");
    repository.write("a.txt", "1\r\n2\r\n");
    repository.write("b.id", "$Id$\n");
    repository.commitAll();
    repository.write("a.txt", "1\r\n2\r\n");
    EXPECT_EQ(agreedStateOf("a.txt"), 1);
    EXPECT_EQ(agreedStateOf("b.id"), 1);
    repository.write("a.txt", "1\r\n3\r\n");
    EXPECT_EQ(agreedStateOf("a.txt"), 3);
}

TEST_F(FileStates, aTouchedFileOfAFilterDriverIs3AndAnUntouchedOneUnmodified) {
    repository.run({"config", "filter.upper.clean", "tr a-z A-Z"});
    repository.write(".gitattributes", "*.up filter=upper\n");
    repository.write("a.up", "text\n");
    repository.commitAll();
    std::filesystem::last_write_time(repository.onDisk() / "a.up",
                                     std::filesystem::last_write_time(repository.onDisk() / "a.up") -
                                         std::chrono::hours(1));
    repository.run({"update-index", "--refresh"});
    EXPECT_EQ(agreedStateOf("a.up"), 1);
    std::filesystem::last_write_time(repository.onDisk() / "a.up",
                                     std::filesystem::file_time_type::clock::now());
    EXPECT_EQ(stateOf("a.up"), 3); // git would run the program to find out
}

TEST_F(FileStates, namesOfAllKindsAreFound) {
    std::vector<std::string> const names{"sp ace",
                                         "new\nline",
                                         "\xff\xfe",
                                         "caf\xc3\xa9",
                                         "cafe\xcc\x81",
                                         "-dash",
                                         "\xd7\xa9\xd7\x9d",
                                         "back\\slash",
                                         "quo\"te",
                                         ":colon",
                                         "*",
                                         "[a]",
                                         "d\xff/\xe9",
                                         "tab\t",
                                         "!bang",
                                         "#hash"};
    for (auto const& name : names) {
        repository.write(name);
        EXPECT_EQ(agreedStateOf(name), 0);
    }
    repository.commitAll();
    for (auto const& name : names) {
        EXPECT_EQ(agreedStateOf(name), 1);
        repository.write(name, "other\n");
        EXPECT_EQ(agreedStateOf(name), 3);
    }
}

TEST_F(FileStates, namesThatDifferInCaseOnlyAreTwoFilesRegardlessOfTheConfiguration) {
    commitFile("File");
    std::filesystem::rename(repository.onDisk() / "File", repository.onDisk() / "file");
    EXPECT_EQ(agreedStateOf("File"), 3);
    EXPECT_EQ(agreedStateOf("file"), 0);
    repository.run({"config", "core.ignoreCase", "true"});
    EXPECT_EQ(stateOf("File"), 3);
    EXPECT_EQ(stateOf("file"), 0);
}

TEST_F(FileStates, changesByOtherProgramsAreSeen) {
    commitFile("a");
    EXPECT_EQ(agreedStateOf("a"), 1);
    repository.run({"rm", "-q", "--cached", "a"});
    EXPECT_EQ(agreedStateOf("a"), 6);
    repository.run({"commit", "-q", "-m", "removed"});
    EXPECT_EQ(agreedStateOf("a"), 0);
    repository.run({"checkout", "-q", "-f", "HEAD~1"});
    EXPECT_EQ(agreedStateOf("a"), 1);
}

} // namespace
} // namespace project::git
