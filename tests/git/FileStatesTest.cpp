#include <sys/stat.h>

#include "GitRepository.hpp"
#include "project/git/GitError.hpp"

namespace project::git {
namespace {

using std::filesystem::perms;

class FileStates : public GitTest {
protected:
    /// The adapter's answer for a name, which has to be that of `git status`, too.
    int agreedStateOf(std::string const& name) {
        auto const expected = repository.statusStates();
        EXPECT_TRUE(expected.contains(name)) << name << " is not in git's answer";
        EXPECT_EQ(stateOf(name), expected.at(name)) << name;
        return stateOf(name);
    }

    void commitFile(std::string const& name, std::string const& content = "content\n") const {
        repository.write(name, content);
        repository.commitAll();
    }
};

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

TEST_F(FileStates, aFileInAnIgnoredFolderStaysIgnoredWhateverLaterRulesSay) {
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

TEST_F(FileStates, aChangeThatWasStagedAndTakenBackOnDiskIs3) {
    commitFile("a", "1\n");
    repository.write("a", "2\n");
    repository.run({"add", "a"});
    repository.write("a", "1\n");
    EXPECT_EQ(agreedStateOf("a"), 3);
}

TEST_F(FileStates, aTrackedFileGoneFromTheDiskIs3) {
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

TEST_F(FileStates, whatGitWasToldToAssumeIsUnmodified) {
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

TEST_F(FileStates, aFolderIs1WhenAnythingBelowItIsTracked) {
    commitFile("d/e/a");
    repository.write("d/ignored");
    repository.write(".gitignore", "d\nignored\n");
    EXPECT_EQ(stateOf("d"), 1);
    EXPECT_EQ(stateOf("d/e"), 1);
    EXPECT_EQ(stateOf(""), 1);
    repository.remove("d");
    EXPECT_EQ(stateOf("d/e"), 1);
}

TEST_F(FileStates, aFolderIs2WhenItIsIgnoredAndElse0) {
    EXPECT_EQ(stateOf(""), 0);
    repository.write(".gitignore", "out/\n");
    repository.write("out/deep/a");
    repository.write("d/a");
    folder.addFolder("work/empty");
    EXPECT_EQ(stateOf("out"), 2);
    EXPECT_EQ(stateOf("out/deep"), 2);
    EXPECT_EQ(stateOf("d"), 0);
    EXPECT_EQ(stateOf("empty"), 0);
}

TEST_F(FileStates, aFolderWhoseOnlyFileHasASimilarNameBesideItIsNotTracked) {
    commitFile("da");
    commitFile("d.a");
    commitFile("d-a");
    folder.addFolder("work/d");
    EXPECT_EQ(stateOf("d"), 0);
}

TEST_F(FileStates, aFileInPlaceOfATrackedFolderIs0AndWhatWasBelowIs3) {
    commitFile("d/a");
    repository.remove("d");
    repository.write("d");
    EXPECT_EQ(agreedStateOf("d"), 0);
    EXPECT_EQ(agreedStateOf("d/a"), 3);
}

TEST_F(FileStates, aFolderInPlaceOfATrackedFileLeavesThatAt3) {
    commitFile("a");
    repository.remove("a");
    repository.write("a/b");
    EXPECT_EQ(agreedStateOf("a"), 3);
    EXPECT_EQ(agreedStateOf("a/b"), 0);
}

TEST_F(FileStates, whatIsNotThereIs9) {
    commitFile("a");
    EXPECT_EQ(stateOf("b"), 9);
    EXPECT_EQ(stateOf("c/d/e"), 9);
    EXPECT_EQ(stateOf("a/below"), 9);
    EXPECT_EQ(stateOf(std::string(300, 'x')), 9);
}

TEST_F(FileStates, whatIsNeitherFileNorLinkNorFolderIs9) {
    ASSERT_EQ(::mkfifo((repository.onDisk() / "pipe").c_str(), 0600), 0);
    EXPECT_EQ(stateOf("pipe"), 9);
}

TEST_F(FileStates, whatLiesOutsideTheWorkTreeIs8) {
    commitFile("a");
    folder.addFile(u"beside", "");
    std::vector<Path> const outside{folder.path(u"beside"),
                                    folder.path(u"work-not"),
                                    folder.path(u"work/../beside"),
                                    repository.path(".git"),
                                    repository.path(".git/index"),
                                    Path(u"/"),
                                    Path(u""),
                                    Path(u"relative"),
                                    Path(std::u16string(u"/lone") + char16_t{0xD800}),
                                    Path(std::u16string(5000, u'/') + u"x"),
                                    Path(u"/" + std::u16string(5000, u'x'))};
    auto const states = adapter.getFileStates(outside);
    for (auto const& path : outside) {
        ASSERT_TRUE(states.contains(path));
        EXPECT_EQ(states.at(path).getState(), cmlink::LocalStatus::NotInRepository);
    }
}

TEST_F(FileStates, whatLiesBeyondALinkIs8) {
    repository.write("real/a");
    repository.run({"add", "-A"});
    folder.addLink("work/link", "real");
    EXPECT_EQ(stateOf("link/a"), 8);
    EXPECT_EQ(agreedStateOf("link"), 0);
}

TEST_F(FileStates, aTrackedFileWhoseFolderBecameALinkIs3) {
    commitFile("d/a");
    std::filesystem::rename(repository.onDisk() / "d", repository.onDisk() / "moved");
    folder.addLink("work/d", "moved");
    EXPECT_EQ(agreedStateOf("d/a"), 3);
    EXPECT_EQ(agreedStateOf("d"), 0);
}

TEST_F(FileStates, whatLiesInAnotherRepositoryInsideIs8) {
    GitRepository::init(folder.addFolder("work/inner")).write("deep/a");
    EXPECT_EQ(stateOf("inner"), 0);
    EXPECT_EQ(stateOf("inner/deep/a"), 8);
    EXPECT_EQ(stateOf("inner/deep"), 8);
}

TEST_F(FileStates, aFolderWithAnythingElseCalledDotGitIsNoRepository) {
    repository.write("d/.git", "not a repository\n");
    repository.write("d/a");
    EXPECT_EQ(agreedStateOf("d/a"), 0);
}

TEST_F(FileStates, pathsMayBeWrittenInManyWays) {
    commitFile("d/a");
    std::vector<Path> const spellings{repository.root() / u"d/a/", repository.root() / u"d//a",
                                      repository.root() / u"./d/./a", repository.root() / u"x/../d/a",
                                      Path(u"//" + repository.root().native() + u"/d/a")};
    auto const states = adapter.getFileStates(spellings);
    for (auto const& path : spellings) {
        EXPECT_EQ(states.at(path).getState(), cmlink::LocalStatus::Unmodified);
    }
}

TEST_F(FileStates, aProjectThatWasOpenedByWayOfALinkFindsItsFiles) {
    commitFile("sub/a");
    folder.addLink("way", "work/sub");
    GitAdapter throughLink(folder.path(u"way"));
    auto const path = folder.path(u"way/a");
    EXPECT_EQ(throughLink.getFileStates({path}).at(path).getState(), cmlink::LocalStatus::Unmodified);
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

TEST_F(FileStates, namesThatDifferInCaseOnlyAreTwoFilesWhateverTheConfigurationSays) {
    commitFile("File");
    std::filesystem::rename(repository.onDisk() / "File", repository.onDisk() / "file");
    EXPECT_EQ(agreedStateOf("File"), 3);
    EXPECT_EQ(agreedStateOf("file"), 0);
    repository.run({"config", "core.ignoreCase", "true"});
    EXPECT_EQ(stateOf("File"), 3);
    EXPECT_EQ(stateOf("file"), 0);
}

TEST_F(FileStates, whatOthersDoToTheRepositoryIsSeen) {
    commitFile("a");
    EXPECT_EQ(agreedStateOf("a"), 1);
    repository.run({"rm", "-q", "--cached", "a"});
    EXPECT_EQ(agreedStateOf("a"), 6);
    repository.run({"commit", "-q", "-m", "removed"});
    EXPECT_EQ(agreedStateOf("a"), 0);
    repository.run({"checkout", "-q", "-f", "HEAD~1"});
    EXPECT_EQ(agreedStateOf("a"), 1);
}

TEST_F(FileStates, anEmptyListNeedsNoRepository) {
    repository.write(".git/index", "damaged");
    EXPECT_TRUE(adapter.getFileStates({}).empty());
    adapter.addToSourceControl({});
    adapter.removeFromSourceControl({});
    repository.write("a");
    EXPECT_THROW(stateOf("a"), GitError); // the damage would have shown
}

TEST_F(FileStates, aPathThatIsAskedForTwiceIsAnsweredOnce) {
    repository.write("a");
    EXPECT_EQ(adapter.getFileStates({repository.path("a"), repository.path("a")}).size(), 1u);
}

TEST_F(FileStates, anIndexOfEveryVersionIsRead) {
    for (auto const* const version : {"2", "3", "4"}) {
        commitFile("dir/file" + std::string(version));
        repository.run({"update-index", "--index-version", version});
        EXPECT_EQ(agreedStateOf("dir/file" + std::string(version)), 1);
        EXPECT_EQ(agreedStateOf("dir/file2"), 1);
    }
}

TEST_F(FileStates, anIndexWithWhatOnlySpeedsGitUpIsRead) {
    commitFile("a");
    repository.run({"update-index", "--force-untracked-cache"});
    repository.run({"status"});
    EXPECT_EQ(agreedStateOf("a"), 1);
}

TEST_F(FileStates, aDamagedIndexIsAnErrorEachTimeUntilItIsMended) {
    commitFile("a");
    EXPECT_EQ(stateOf("a"), 1);
    auto const whole = folder.onDisk() / "whole";
    std::filesystem::copy_file(repository.indexFile(), whole);
    repository.write(".git/index", "damaged");
    EXPECT_THROW(stateOf("a"), GitError);
    EXPECT_THROW(stateOf("a"), GitError);
    EXPECT_THROW(adapter.removeFromSourceControl({repository.path("a")}), GitError);
    std::filesystem::rename(whole, repository.indexFile());
    EXPECT_EQ(agreedStateOf("a"), 1);
}

TEST_F(FileStates, withoutAnIndexEverythingCommittedIsRemoved) {
    commitFile("a");
    EXPECT_EQ(stateOf("a"), 1);
    std::filesystem::remove(repository.indexFile());
    EXPECT_EQ(agreedStateOf("a"), 6);
}

TEST_F(FileStates, anIndexThatIsSplitGivesAnErrorThatTellsWhatToDo) {
    commitFile("a");
    repository.run({"update-index", "--split-index"});
    try {
        stateOf("a");
        FAIL() << "it was read";
    } catch (GitError const& error) {
        EXPECT_NE(error.getRemedy().find("--no-split-index"), std::string::npos);
    }
    repository.run({"update-index", "--no-split-index"});
    EXPECT_EQ(agreedStateOf("a"), 1);
}

} // namespace
} // namespace project::git
