#include <sys/stat.h>
#include <unistd.h>

#include "GitRepository.hpp"
#include "project/git/GitError.hpp"
#include "support/ChildProcess.hpp"

namespace project::git {
namespace {

using std::filesystem::perms;

class Staging : public GitTest {
protected:
    void add(std::vector<std::string> const& names) { adapter.addToSourceControl(repository.paths(names)); }

    void remove(std::vector<std::string> const& names) {
        adapter.removeFromSourceControl(repository.paths(names));
    }

    std::vector<std::string> tracked() const { return recordsOf(repository.run({"ls-files", "-z"})); }

    /// Runs git on a copy of the index. @return what git lists of the copy then.
    std::string indexAfterGit(std::vector<std::string> const& arguments) const {
        auto const copy = folder.onDisk() / "index-copy";
        std::filesystem::remove(copy);
        if (std::filesystem::exists(repository.indexFile())) {
            std::filesystem::copy_file(repository.indexFile(), copy);
        }
        repository.runOnIndex(copy, arguments);
        return repository.runOnIndex(copy, {"ls-files", "-z", "-s", "-t", "-v"});
    }

    void expectAddedAsGitDoes(std::vector<std::string> const& names) {
        std::vector<std::string> command{"add", "--force", "--sparse", "--"};
        for (auto const& name : names) {
            command.push_back(":(literal)" + name);
        }
        auto const expected = indexAfterGit(command);
        add(names);
        EXPECT_EQ(repository.index(), expected);
    }

    void expectRemovedAsGitDoes(std::vector<std::string> const& names) {
        std::vector<std::string> command{"rm", "-q", "-r", "--cached", "--force", "--sparse", "--"};
        for (auto const& name : names) {
            command.push_back(":(literal)" + name);
        }
        auto const expected = indexAfterGit(command);
        remove(names);
        EXPECT_EQ(repository.index(), expected);
    }

    GitError errorOfAdding(std::vector<std::string> const& names) {
        try {
            add(names);
        } catch (GitError const& error) {
            return error;
        }
        throw std::runtime_error("nothing was thrown");
    }
};

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

TEST_F(Staging, aLargeFileIsStagedAsGitDoes) {
    repository.write("large", std::string((std::size_t{64} << 20) + 7, 'x'));
    expectAddedAsGitDoes({"large"});
}

TEST_F(Staging, ofAFolderNothingIsStagedButWhatIsNamed) {
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

TEST_F(Staging, whatCannotBeStagedIsPassedOver) {
    repository.write("a");
    repository.write("real/x");
    folder.addLink("work/link", "real");
    folder.addFile(u"beside", "");
    GitRepository::init(folder.addFolder("work/inner")).write("x");
    ASSERT_EQ(::mkfifo((repository.onDisk() / "pipe").c_str(), 0600), 0);
    add({"gone", "gone/deep", "../beside", "link/x", "inner", "inner/x", "pipe", ".git/config", "a"});
    EXPECT_EQ(tracked(), std::vector<std::string>{"a"});
}

TEST_F(Staging, anIgnoredFileThatIsNamedIsStaged) {
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

TEST_F(Staging, aRenameInCaseOnlyMovesTheEntryInEitherOrderWhateverTheConfigurationSays) {
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

TEST_F(Staging, aConflictIsResolvedByAddingAndGoneByRemoving) {
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

TEST_F(Staging, withoutExecutableBitsTheRecordedModeStays) {
    repository.write("runs");
    repository.write("plain");
    std::filesystem::permissions(repository.onDisk() / "runs", perms::owner_all);
    repository.commitAll();
    repository.run({"config", "core.fileMode", "false"});
    repository.write("runs", "other\n");
    std::filesystem::permissions(repository.onDisk() / "runs", perms::owner_read | perms::owner_write);
    std::filesystem::permissions(repository.onDisk() / "plain", perms::owner_all);
    repository.write("new");
    std::filesystem::permissions(repository.onDisk() / "new", perms::owner_all);
    expectAddedAsGitDoes({"runs", "plain", "new"});
}

TEST_F(Staging, withoutLinksAFileInPlaceOfALinkStaysOne) {
    folder.addLink("work/link", "target");
    repository.commitAll();
    repository.run({"config", "core.symlinks", "false"});
    repository.remove("link");
    repository.write("link", "other");
    EXPECT_EQ(stateOf("link"), 3);
    expectAddedAsGitDoes({"link"});
}

TEST_F(Staging, contentIsConvertedAsItsAttributesSay) {
    repository.write(".gitattributes", "*.txt text\n*.crlf text eol=crlf\n*.id ident\n*.bin binary\n"
                                       "*.utf8 working-tree-encoding=utf-8\n*.none filter=unknown\n");
    for (auto const* const name : {"a.txt", "a.crlf", "a.bin", "a.none", "a.utf8", "d/a.txt"}) {
        repository.write(name, "1\r\n2\r\n");
    }
    repository.write("a.id", "$Id: old $\n");
    expectAddedAsGitDoes({"a.txt", "a.crlf", "a.bin", "a.none", "a.utf8", "d/a.txt", "a.id"});
}

TEST_F(Staging, contentIsConvertedAsTheConfigurationSays) {
    for (auto const* const setting : {"true", "input", "false"}) {
        repository.write("old", "1\r\n2\r\n");
        repository.run({"config", "core.autocrlf", "false"});
        repository.run({"add", "old"});
        repository.run({"config", "core.autocrlf", setting});
        repository.write(setting, "1\r\n2\r\n");
        repository.write("old", "1\r\n3\r\n");
        expectAddedAsGitDoes({setting, "old"});
    }
}

TEST_F(Staging, aFileOfAFilterDriverIsRefusedBeforeAnythingIsStaged) {
    repository.run({"config", "filter.upper.clean", "tr a-z A-Z"});
    repository.run({"config", "filter.server.process", "serve"});
    repository.run({"config", "filter.must.required", "true"});
    repository.write(".gitattributes", "*.up filter=upper\n*.srv filter=server\n*.must filter=must\n"
                                       "*.wide working-tree-encoding=UTF-16\n");
    repository.write("a");
    for (auto const* const name : {"d/x.up", "d/x.srv", "d/x.must", "d/x.wide"}) {
        repository.write(name);
        auto const error = errorOfAdding({"a", name});
        EXPECT_EQ(error.getFile(), (repository.onDisk() / name).string());
        EXPECT_NE(error.getRemedy().find("git add"), std::string::npos);
    }
    EXPECT_NE(errorOfAdding({"d/x.up"}).getProblem().find("\"upper\""), std::string::npos);
    EXPECT_NE(errorOfAdding({"d/x.wide"}).getProblem().find("\"UTF-16\""), std::string::npos);
    EXPECT_FALSE(std::filesystem::exists(repository.indexFile()));
    EXPECT_EQ(repository.run({"count-objects"}).substr(0, 2), "0 ");
    add({"a"});
    EXPECT_EQ(tracked(), std::vector<std::string>{"a"});
}

TEST_F(Staging, aFileWhoseAttributesLibGit2DoesNotUnderstandIsRefused) {
    repository.write(".gitattributes", "\"a b\" text\n");
    repository.write("a b", "1\r\n");
    EXPECT_NE(errorOfAdding({"a b"}).getRemedy().find("git add"), std::string::npos);
}

TEST_F(Staging, theAttributesOfAFileThatIsStagedComeFromTheIndexWhereTheDiskHasNone) {
    repository.run({"config", "filter.upper.clean", "tr a-z A-Z"});
    repository.write(".gitattributes", "*.up filter=upper\n");
    repository.run({"add", "-A"});
    repository.remove(".gitattributes");
    repository.write("a.up");
    EXPECT_NE(errorOfAdding({"a.up"}).getProblem().find("\"upper\""), std::string::npos);
}

TEST_F(Staging, aLinkHasNoFilterDriver) {
    repository.run({"config", "filter.upper.clean", "tr a-z A-Z"});
    repository.write(".gitattributes", "*.up filter=upper\n");
    folder.addLink("work/link.up", "target");
    expectAddedAsGitDoes({"link.up"});
}

TEST_F(Staging, aFileThatCannotBeReadIsAnErrorAndNothingIsStaged) {
    repository.write("a");
    repository.write("secret");
    std::filesystem::permissions(repository.onDisk() / "secret", perms::none);
    auto const everywhere = std::filesystem::recursive_directory_iterator(folder.onDisk());
    for (auto const& entry : everywhere) {
        if (::geteuid() == 0) {
            ASSERT_EQ(::lchown(entry.path().c_str(), 65534, 65534), 0);
        }
    }
    ASSERT_EQ(::geteuid() == 0 ? ::chown(folder.onDisk().c_str(), 65534, 65534) : 0, 0);
    auto const text = test::inUnprivilegedProcess([&] {
        add({"a", "secret"});
        return std::string("nothing was thrown");
    });
    EXPECT_EQ(text,
              (repository.onDisk() / "secret").string() +
                  ": the file can't be read: Permission denied. Look at its permissions, and try again.");
    EXPECT_FALSE(std::filesystem::exists(repository.onDisk() / ".git/index"));
    EXPECT_FALSE(std::filesystem::exists(repository.onDisk() / ".git/index.lock"));
}

TEST_F(Staging, filesAreTakenOutOfTheIndexAndStayOnDisk) {
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

TEST_F(Staging, allBelowAFolderIsTakenOutAndNothingBesideIt) {
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

TEST_F(Staging, removingWhatIsNotTrackedDoesNothing) {
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

} // namespace
} // namespace project::git
