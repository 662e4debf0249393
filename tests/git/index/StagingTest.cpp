#include <chrono>
#include <filesystem>

#include <sys/stat.h>

#include "git/index/StagingFixture.hpp"

namespace project::git {
namespace {

using std::filesystem::perms;

class Staging : public StagingTest {};

TEST_F(Staging, newAndChangedFilesAreStagedAsGitDoes) {
    repository.write("changed", "1\n");
    repository.write("d/unchanged");
    repository.commitAll();
    repository.write("changed", "2\n");
    repository.write("d/e/new", std::string("with a \0 in it", 14));
    repository.write("empty", "");
    repository.write("runs");
    std::filesystem::permissions(repository.onDisk() / "runs", perms::owner_all);
    folder.addLink("work/link", "d");
    folder.addLink("work/broken", "nowhere");
    expectAddedAsGitDoes({"changed", "d/unchanged", "d/e/new", "empty", "runs", "link", "broken"});
    EXPECT_EQ(tracked().size(), 7u);
    repository.run({"commit", "-q", "-m", "staged"});
    EXPECT_EQ(repository.run({"status", "--porcelain"}), "");
    repository.run({"fsck", "--strict"});
}

TEST_F(Staging, ofAFolderOnlyTheGivenFilesAreStaged) {
    repository.write("d/a");
    repository.write("d/b");
    add({"d", "d/a", ""});
    EXPECT_EQ(tracked(), std::vector<std::string>{"d/a"});
}

TEST_F(Staging, aFolderAloneLeavesTheIndexUnwritten) {
    folder.addFolder("work/d");
    add({"d", "not there"});
    EXPECT_FALSE(std::filesystem::exists(repository.indexFile()));
}

TEST_F(Staging, trackedFilesBelowFoldersAreListedByTheirPaths) {
    for (auto const* name : {"d/a", "d/e/b", "d2/c", "f", "g/\xFF"}) {
        repository.write(name);
    }
    repository.commitAll();
    repository.write("d/untracked");
    repository.remove("d/e/b");
    auto const below = [this](std::vector<std::string> const& names) {
        auto const found = adapter.trackedBelow(repository.paths(names));
        return std::vector<Path>(found.begin(), found.end());
    };

    EXPECT_EQ(below({"d", "f", "nowhere"}), repository.paths({"d/a", "d/e/b"}));
    EXPECT_EQ(below({"g", "d2", "d2"}), repository.paths({"d2/c", "g/\xFF"}));
    EXPECT_EQ(adapter.trackedBelow({repository.root()}).size(), 5u);
    EXPECT_TRUE(adapter.trackedBelow({folder.root(), folder.path(u"elsewhere")}).empty());
}

TEST_F(Staging, everythingThatCannotBeStagedIsSkipped) {
    repository.write("a");
    repository.write("real/x");
    folder.addLink("work/link", "real");
    folder.addFile(u"beside", "");
    GitRepository::init(folder.addFolder("work/inner")).write("x");
    ASSERT_EQ(::mkfifo((repository.onDisk() / "pipe").c_str(), 0600), 0);
    add({"gone", "gone/deep", "../beside", "link/x", "inner", "inner/x", "pipe", ".git/config", "a"});
    EXPECT_EQ(tracked(), std::vector<std::string>{"a"});
}

TEST_F(Staging, everythingOutsideTheProjectsFolderIsNeitherStagedNorRemoved) {
    for (auto const* name : {"outside", "project/a", "project2/b"}) {
        repository.write(name);
    }
    repository.commitAll();
    repository.write("outside", "changed");
    repository.write("project/a", "changed");
    GitAdapter ofFolder(repository.path("project"));
    auto const inProject = [this](std::string const& name) {
        return repository.path("project") / Path(fl::filesystem::fromSystem(name));
    };

    ofFolder.addToSourceControl({inProject("a"), inProject("../outside"), repository.path("outside")});
    EXPECT_EQ(repository.run({"diff", "--cached", "--name-only"}), "project/a\n");
    ofFolder.removeFromSourceControl(
        {inProject("../outside"), inProject("d/../../project2"), repository.root()});

    EXPECT_EQ(tracked(), (std::vector<std::string>{"outside", "project/a", "project2/b"}));
    EXPECT_TRUE(ofFolder.trackedBelow({inProject(".."), inProject("../project2")}).empty());
}

TEST_F(Staging, anIgnoredFileThatIsGivenIsStaged) {
    repository.write(".gitignore", "*.o\n");
    repository.write("a.o");
    expectAddedAsGitDoes({"a.o"});
    EXPECT_EQ(tracked(), std::vector<std::string>{"a.o"});
}

TEST_F(Staging, namesOfAllKindsAreStagedAsGitDoes) {
    std::vector<std::string> const names{"sp ace",       "new\nline",   "\xff\xfe",   "caf\xc3\xa9",
                                         "cafe\xcc\x81", "-dash",       "*",          "\xd7\xa9",
                                         ":colon",       "back\\slash", "d\xff/\xe9", "[a]"};
    for (auto const& name : names) {
        repository.write(name);
    }
    expectAddedAsGitDoes(names);
    EXPECT_EQ(tracked().size(), names.size());
    expectRemovedAsGitDoes({"*", "[a]", "\xff\xfe", "d\xff"});
    EXPECT_EQ(tracked().size(), names.size() - 4);
}

TEST_F(Staging, aRenameInCaseOnlyMovesTheEntryInEitherOrderRegardlessOfTheConfiguration) {
    for (auto const* const ignoresCase : {"false", "true"}) {
        repository.run({"config", "core.ignoreCase", ignoresCase});
        repository.write("File");
        add({"File"});
        std::filesystem::rename(repository.onDisk() / "File", repository.onDisk() / "file");
        add({"file"});
        remove({"File"});
        EXPECT_EQ(tracked(), std::vector<std::string>{"file"});
        std::filesystem::rename(repository.onDisk() / "file", repository.onDisk() / "File");
        remove({"file"});
        add({"File"});
        EXPECT_EQ(tracked(), std::vector<std::string>{"File"});
    }
}

TEST_F(Staging, aFileInPlaceOfAFolderReplacesIt) {
    repository.write("d/a");
    repository.write("d/e/b");
    repository.write("d.c");
    repository.commitAll();
    repository.remove("d");
    repository.write("d");
    expectAddedAsGitDoes({"d"});
    EXPECT_EQ(tracked(), (std::vector<std::string>{"d", "d.c"}));
}

TEST_F(Staging, aFolderInPlaceOfAFileReplacesIt) {
    repository.write("d");
    repository.commitAll();
    repository.remove("d");
    repository.write("d/e/a");
    expectAddedAsGitDoes({"d/e/a"});
    EXPECT_EQ(tracked(), std::vector<std::string>{"d/e/a"});
}

TEST_F(Staging, aFileThatGitOnlyIntendsToAddIsStagedWithItsContent) {
    repository.write("a");
    repository.run({"add", "-N", "a"});
    expectAddedAsGitDoes({"a"});
}

TEST_F(Staging, addingResolvesAConflictAndRemovingDropsIt) {
    for (auto const* const name : {"a", "b"}) {
        repository.write(name, "1\n");
    }
    repository.commitAll();
    repository.run({"checkout", "-q", "-b", "other"});
    repository.write("a", "2\n");
    repository.write("b", "2\n");
    repository.commitAll();
    repository.run({"checkout", "-q", "main"});
    repository.write("a", "3\n");
    repository.write("b", "3\n");
    repository.commitAll();
    EXPECT_THROW(repository.run({"merge", "other"}), std::runtime_error);
    repository.write("c");
    expectAddedAsGitDoes({"c"}); // the conflicts stay
    expectAddedAsGitDoes({"a"});
    expectRemovedAsGitDoes({"b"});
}

TEST_F(Staging, filesAreRemovedFromTheIndexAndStayOnDisk) {
    repository.write("a");
    repository.write("b");
    repository.write("gone");
    repository.write("modified");
    repository.commitAll();
    repository.remove("gone");
    repository.write("modified", "other\n");
    expectRemovedAsGitDoes({"a", "gone", "modified"});
    EXPECT_EQ(tracked(), std::vector<std::string>{"b"});
    EXPECT_TRUE(std::filesystem::exists(repository.onDisk() / "a"));
    EXPECT_TRUE(std::filesystem::exists(repository.onDisk() / "modified"));
}

TEST_F(Staging, everythingBelowAFolderIsRemovedAndNothingBesideIt) {
    for (auto const* const name : {"d/a", "d/e/b", "d.x", "d-", "d0/a", "dd"}) {
        repository.write(name);
    }
    repository.commitAll();
    repository.write("d/untracked");
    repository.remove("d/e");
    expectRemovedAsGitDoes({"d"});
    EXPECT_EQ(tracked(), (std::vector<std::string>{"d-", "d.x", "d0/a", "dd"}));
    EXPECT_TRUE(std::filesystem::exists(repository.onDisk() / "d/a"));
    remove({""});
    EXPECT_TRUE(tracked().empty());
}

TEST_F(Staging, removingUntrackedFilesHasNoEffect) {
    repository.write("a");
    repository.commitAll();
    repository.write("untracked");
    auto const before = std::filesystem::last_write_time(repository.indexFile());
    remove({"untracked", "not there", "../beside", ".git"});
    EXPECT_EQ(std::filesystem::last_write_time(repository.indexFile()), before);
}

TEST_F(Staging, thousandsOfFilesAreOneCall) {
    std::vector<std::string> names;
    for (int i = 0; i < 2000; ++i) {
        names.push_back("d" + std::to_string(i % 20) + "/f" + std::to_string(i));
        repository.write(names.back(), std::to_string(i));
    }
    for (auto const& [name, state] : repository.adapterStates(adapter, names)) {
        ASSERT_EQ(state, 0) << name;
    }
    expectAddedAsGitDoes(names);
    EXPECT_EQ(repository.adapterStates(adapter, names), repository.statusStates());
    expectRemovedAsGitDoes(names);
    EXPECT_TRUE(tracked().empty());
}

TEST_F(Staging, theContentOfAStagedFileIsKnownAlsoIfOnlyGitCanConvertIt) {
    repository.write(".gitattributes", "*.lfs filter=lfs\n");
    repository.run({"config", "filter.lfs.clean", "tr a-z A-Z"});
    repository.write("a.lfs", "one\n");
    repository.write("changed.lfs", "two\n");
    auto const before = std::filesystem::file_time_type::clock::now() - std::chrono::hours(1);
    std::filesystem::last_write_time(repository.onDisk() / "a.lfs", before);
    repository.commitAll();
    repository.write("changed.lfs", "three\n");
    auto const files = repository.paths({"a.lfs", "changed.lfs"});

    auto const onDisk = adapter.contentsOnDisk(files);

    EXPECT_EQ(onDisk.size(), 1U);
    EXPECT_EQ(onDisk.at(files.front()), adapter.earlierContents(files, repository.root()).at(files.front()));
}

TEST_F(Staging, contentsAreEqualIfGitWouldStageThemAlike) {
    repository.write(".gitattributes", "*.txt text eol=crlf\n*.lfs filter=lfs\n");
    repository.write("staged", "one\n");
    repository.write("committed", "two\n");
    repository.write("lines.txt", "a\nb\n");
    repository.write("run", "one\n");
    repository.commitAll();
    repository.write("staged", "changed on disk\n");
    repository.run({"rm", "-q", "--cached", "committed"});
    repository.write("new one", "one\n");
    repository.write("new two", "two\n");
    repository.write("new.txt", "a\r\nb\r\n");
    repository.run({"config", "filter.lfs.clean", "cat"});
    repository.write("new.lfs", "one\n");
    folder.addLink("work/link", "one\n");
    auto const stored = adapter.earlierContents(
        repository.paths({"staged", "committed", "lines.txt", "new one", "nowhere", "d"}),
        repository.path("nowhere"));
    auto const onDisk = adapter.contentsOnDisk(
        repository.paths({"new one", "new two", "new.txt", "new.lfs", "link", "nowhere", "."}));

    auto const same = [&](char const* before, char const* after) {
        return stored.at(repository.path(before)) == onDisk.at(repository.path(after));
    };
    EXPECT_EQ(stored.size(), 3U);
    EXPECT_TRUE(same("staged", "new one"));
    EXPECT_TRUE(same("committed", "new two"));
    EXPECT_TRUE(same("lines.txt", "new.txt"));
    EXPECT_TRUE(same("staged", "link")) << "the target of a link is its content";
    EXPECT_FALSE(same("staged", "new two"));
    EXPECT_FALSE(onDisk.contains(repository.path("new.lfs"))) << "only git runs filters";
    EXPECT_EQ(onDisk.size(), 4U);
}

} // namespace
} // namespace project::git
