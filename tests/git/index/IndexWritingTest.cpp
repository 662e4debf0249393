#include <array>
#include <chrono>
#include <csignal>
#include <fstream>
#include <functional>
#include <set>
#include <thread>

#include <sys/resource.h>
#include <sys/stat.h>
#include <unistd.h>

#include "git/GitRepository.hpp"
#include "project/git/GitError.hpp"
#include "support/ChildProcess.hpp"
#include "support/GlobalLocale.hpp"
#include "support/ReplacementCount.hpp"
#include "support/Waiting.hpp"

namespace project::git {
namespace {

using std::filesystem::perms;

class IndexWriting : public GitTest {
protected:
    std::filesystem::path lockFile() const { return repository.indexFile().string() + ".lock"; }

    /// Until the index is of an earlier second than now: git compares whole seconds.
    void waitForTheNextSecond() const {
        auto const second = secondOf(repository.indexFile());
        ASSERT_TRUE(test::comesTrue([second] {
            timespec now{};
            return ::clock_gettime(CLOCK_REALTIME_COARSE, &now) == 0 && now.tv_sec > second;
        }));
    }

    static std::time_t secondOf(std::filesystem::path const& file) {
        struct stat status {};

        EXPECT_EQ(0, ::stat(file.c_str(), &status));
        return status.st_mtim.tv_sec;
    }

    void add(std::vector<std::string> const& names) { adapter.addToSourceControl(repository.paths(names)); }

    void remove(std::vector<std::string> const& names) {
        adapter.removeFromSourceControl(repository.paths(names));
    }

    /// See gitformat-index(5): "DIRC" and four bytes.
    int indexVersion() const {
        std::ifstream file(repository.indexFile(), std::ios::binary);
        std::array<char, 8> header{};
        file.read(header.data(), header.size());
        return header[7];
    }

    void expectNothingLeftBehind() const {
        for (auto const& entry : std::filesystem::directory_iterator(repository.indexFile().parent_path())) {
            auto const name = entry.path().filename().string();
            EXPECT_TRUE(!name.starts_with("index") || name == "index") << name;
        }
    }

    void expectLocked(std::function<void()> const& call) const {
        auto const before = repository.index();
        try {
            call();
            FAIL() << "nothing was thrown";
        } catch (GitError const& error) {
            EXPECT_EQ(error.kind(), GitError::Kind::Busy);
            EXPECT_EQ(error.file(), lockFile().string());
            EXPECT_EQ(std::string(error.what()).find(lockFile().string()), 0u);
            EXPECT_NE(error.problem().find("locked"), std::string::npos);
            EXPECT_NE(error.remedy().find("delete this file"), std::string::npos);
        }
        EXPECT_TRUE(std::filesystem::exists(lockFile())); // of another process
        EXPECT_EQ(repository.index(), before);
    }
};

TEST_F(IndexWriting, aLockedIndexIsAnErrorThatNamesTheLockFileAndTryingAgainWorks) {
    repository.write("old");
    repository.commitAll();
    repository.write("a");
    folder.addFile(u"work/.git/index.lock", "");

    expectLocked([&] { add({"a"}); });
    expectLocked([&] { remove({"old"}); });
    EXPECT_EQ(stateOf("a"), 0);
    EXPECT_EQ(stateOf("old"), 1);

    std::filesystem::remove(lockFile());
    add({"a"});
    remove({"old"});
    EXPECT_EQ(stateOf("a"), 5);
    EXPECT_EQ(stateOf("old"), 6);
    EXPECT_EQ(repository.statusStates(), (States{{"a", 5}, {"old", 6}}));
    expectNothingLeftBehind();
}

TEST_F(IndexWriting, anErrorIsInTheLanguageOfTheProcess) {
    repository.write("a");
    std::ofstream(lockFile()).close();
    test::GlobalLocale const language("de_DE");

    try {
        add({"a"});
        FAIL() << "nothing was thrown";
    } catch (GitError const& error) {
        EXPECT_EQ(error.problem(),
                  "der Index ist gesperrt: git läuft in diesem Repository oder wurde gewaltsam beendet");
        EXPECT_EQ(error.remedy(),
                  "Versuchen Sie es noch einmal, wenn git fertig ist; läuft git nicht, löschen "
                  "Sie diese Datei und versuchen Sie es noch einmal.");
        EXPECT_EQ(error.what(), lockFile().string() + ": " + error.problem() + ". " + error.remedy());
    }
}

TEST_F(IndexWriting, aLockDoesNotBlockQueries) {
    repository.write("a");
    repository.commitAll();
    folder.addFile(u"work/.git/index.lock", "");
    EXPECT_EQ(stateOf("a"), 1);
}

TEST_F(IndexWriting, aFailureLeavesTheIndexUnchangedAndUnlocked) {
    repository.write("a");
    repository.commitAll();
    repository.write("b");
    repository.write("c/.git", "not a repository\n");
    auto const before = repository.index();
    repository.write(
        ".git./x"); // a name that an index must not contain, since some systems treat it as ".git"
    EXPECT_THROW(add({"b", ".git./x"}), GitError);
    EXPECT_EQ(repository.index(), before);
    expectNothingLeftBehind();
    add({"b"});
    EXPECT_EQ(stateOf("b"), 5);
}

TEST_F(IndexWriting, oneCallIsOneWrite) {
    std::vector<std::string> names;
    for (int i = 0; i < 50; ++i) {
        names.push_back("f" + std::to_string(i));
        repository.write(names.back());
    }
    repository.run({"update-index", "--refresh"});
    test::ReplacementCount const replaced(repository.onDisk() / ".git");
    add(names);
    EXPECT_EQ(replaced.of("index"), 1);
    remove(names);
    EXPECT_EQ(replaced.of("index"), 1);
    repository.adapterStates(adapter, names);
    remove(names);
    add({});
    EXPECT_EQ(replaced.of("index"), 0);
}

TEST_F(IndexWriting, aBatchIsOneWriteAndItsStatesAreSeenBefore) {
    repository.write("old");
    repository.commitAll();
    repository.write("a");
    repository.write("b");
    test::ReplacementCount const replaced(repository.onDisk() / ".git");
    GitAdapter::Batch batch(adapter);
    add({"a"});
    remove({"old"});
    add({"b"});
    EXPECT_EQ(stateOf("a"), 5);
    EXPECT_EQ(stateOf("old"), 6);
    EXPECT_EQ(replaced.of("index"), 0);
    batch.publish();
    EXPECT_EQ(replaced.of("index"), 1);
    EXPECT_EQ(repository.statusStates(), (States{{"a", 5}, {"b", 5}, {"old", 6}}));
    expectNothingLeftBehind();
}

TEST_F(IndexWriting, aFileThatIsStagedTwiceInABatchHasItsLastContent) {
    repository.write("a", "1\n");
    GitAdapter::Batch batch(adapter);
    add({"a"});
    repository.write("a", "2\n");
    add({"a"});
    batch.publish();
    EXPECT_EQ(repository.run({"show", ":a"}), "2\n");
}

TEST_F(IndexWriting, aBatchThatIsNotPublishedChangesNothing) {
    repository.write("old");
    repository.commitAll();
    repository.write("a");
    auto const before = repository.index();
    {
        GitAdapter::Batch const batch(adapter);
        add({"a"});
        remove({"old"});
    }
    EXPECT_EQ(repository.index(), before);
    EXPECT_EQ(stateOf("a"), 0);
    EXPECT_EQ(stateOf("old"), 1);
    expectNothingLeftBehind();
    add({"a"});
    EXPECT_EQ(stateOf("a"), 5);
}

TEST_F(IndexWriting, aBatchHoldsTheLockFromItsFirstChange) {
    repository.write("a");
    repository.write("b");
    GitAdapter::Batch batch(adapter);
    EXPECT_EQ(stateOf("a"), 0);
    repository.run({"add", "b"});
    EXPECT_EQ(stateOf("b"), 5);
    add({"a"});
    EXPECT_TRUE(std::filesystem::exists(lockFile()));
    EXPECT_THROW(repository.run({"add", "b"}), std::runtime_error);
    batch.publish();
    EXPECT_EQ(stateOf("b"), 5);
    expectNothingLeftBehind();
}

TEST_F(IndexWriting, aCallOfABatchThatFailsLeavesTheOthersPrepared) {
    repository.write("a");
    repository.write("b");
    repository.write(".git./x"); // a name that an index must not contain
    GitAdapter::Batch batch(adapter);
    add({"a"});
    EXPECT_THROW(add({"b", ".git./x"}), GitError);
    batch.publish();
    EXPECT_EQ(recordsOf(repository.run({"ls-files", "-z"})), std::vector<std::string>{"a"});
}

/// Limits the size of the files that this process may write.
class FileSizeLimit {
public:
    explicit FileSizeLimit(rlim_t size) : earlierHandler_(std::signal(SIGXFSZ, SIG_IGN)) {
        ::getrlimit(RLIMIT_FSIZE, &earlier_);
        rlimit const limit{size, earlier_.rlim_max};
        ::setrlimit(RLIMIT_FSIZE, &limit);
    }

    ~FileSizeLimit() {
        ::setrlimit(RLIMIT_FSIZE, &earlier_);
        std::signal(SIGXFSZ, earlierHandler_);
    }

    FileSizeLimit(FileSizeLimit const&) = delete;
    FileSizeLimit& operator=(FileSizeLimit const&) = delete;

private:
    rlimit earlier_{};
    void (*earlierHandler_)(int);
};

TEST_F(IndexWriting, anIndexForWhichThereIsNoSpaceFailsBeforeTheBatchIsPublished) {
    std::vector<std::string> names;
    for (int i = 0; i < 50; ++i) {
        names.push_back("f" + std::to_string(i));
        repository.write(names.back());
    }
    GitAdapter::Batch batch(adapter);
    {
        FileSizeLimit const limit(1000); // enough for each content, but not for the index
        EXPECT_THROW(add(names), GitError);
    }
    batch.publish();
    EXPECT_EQ(repository.index(), "");
    expectNothingLeftBehind();
}

TEST_F(IndexWriting, anIndexWithAWrongChecksumIsReadAndNotWritten) {
    commitFile("a");
    repository.write("b");
    auto const before = repository.index();
    {
        std::fstream file(repository.indexFile(), std::ios::binary | std::ios::in | std::ios::out);
        file.seekp(-1, std::ios::end);
        auto const last = file.peek();
        file.seekp(-1, std::ios::end);
        file.put(static_cast<char>(last ^ 1));
    }
    EXPECT_EQ(stateOf("a"), 1);
    EXPECT_THROW(add({"b"}), GitError);
    EXPECT_THROW(remove({"a"}), GitError);
    expectNothingLeftBehind();
    EXPECT_EQ(stateOf("b"), 0);
}

TEST_F(IndexWriting, anIndexWithoutAChecksumIsWritten) { // git writes zeros with index.skipHash
    commitFile("a");
    repository.write("b");
    {
        std::fstream file(repository.indexFile(), std::ios::binary | std::ios::in | std::ios::out);
        file.seekp(-20, std::ios::end);
        file.write(std::string(20, '\0').c_str(), 20);
    }
    add({"b"});
    EXPECT_EQ(stateOf("b"), 5);
}

/// An index of one version, to which names are added and from which they are removed, some of them long and
/// with a common beginning.
class IndexVersions : public GitTest, public ::testing::WithParamInterface<char const*> {};

TEST_P(IndexVersions, areWrittenAsGitReadsThem) {
    std::vector<std::string> names{"a", "a.b", "a/b", "ab", "b/c/d", "b/c/e", "b/cd", "c", "d/f"};
    names.push_back("long/" + std::string(200, 'n') + '/' + std::string(180, 'm') + "/file");
    names.push_back("long/" + std::string(200, 'n') + '/' + std::string(180, 'm') + "/fill");
    for (auto const length : {1U, 2U, 3U, 4U, 5U, 6U, 7U, 8U, 9U}) {
        names.push_back("pad/" + std::string(length, 'x'));
    }
    std::erase(names, "a"); // there is a folder of that name
    for (auto const& name : names) {
        repository.write(name);
    }
    repository.write("hidden");
    repository.run({"add", "--intent-to-add", "hidden"}); // has extended flags
    repository.run({"update-index", "--index-version", GetParam()});
    for (std::size_t step = 1; step < 8; ++step) {
        for (std::size_t i = 0; i < names.size(); i += step) {
            adapter.addToSourceControl({repository.path(names[i])});
        }
        for (std::size_t i = 1; i < names.size(); i += step) {
            adapter.removeFromSourceControl({repository.path(names[i])});
            repository.run({"fsck", "--strict"});
        }
        std::set<std::string> expected{"hidden"};
        for (std::size_t i = 0; i < names.size(); ++i) {
            expected.insert(names[i]);
        }
        adapter.addToSourceControl(repository.paths(names));
        auto const tracked = recordsOf(repository.run({"ls-files", "-z"}));
        EXPECT_EQ(tracked, std::vector<std::string>(expected.begin(), expected.end()));
    }
    auto const before = repository.index();
    repository.run({"update-index", "--index-version", "2"}); // git reads and writes all entries
    EXPECT_EQ(repository.index(), before);
}

INSTANTIATE_TEST_SUITE_P(All, IndexVersions, ::testing::Values("2", "3", "4"),
                         [](auto const& version) { return std::string("v") + version.param; });

TEST_F(IndexWriting, aRepositoryThatCannotBeWrittenIsAClearError) {
    repository.write("a");
    repository.run({"add", "a"});
    for (auto const& entry : std::filesystem::recursive_directory_iterator(folder.onDisk())) {
        if (::geteuid() == 0) {
            ASSERT_EQ(::lchown(entry.path().c_str(), 65534, 65534), 0);
        }
    }
    ASSERT_EQ(::geteuid() == 0 ? ::chown(folder.onDisk().c_str(), 65534, 65534) : 0, 0);
    std::filesystem::permissions(repository.onDisk() / ".git", perms::owner_read | perms::owner_exec);
    auto const text = test::inUnprivilegedProcess([&] {
        EXPECT_EQ(stateOf("a"), 5);
        remove({"a"});
        return std::string("nothing was thrown");
    });
    EXPECT_NE(text.find("/.git/index.lock: the index cannot be written: Permission denied"),
              std::string::npos)
        << text;
    std::filesystem::permissions(repository.onDisk() / ".git", perms::owner_all);
}

TEST_F(IndexWriting, thePermissionsOfTheIndexStay) {
    repository.write("a");
    repository.write("b");
    repository.run({"add", "a"});
    std::filesystem::permissions(repository.indexFile(), perms{0664});
    add({"b"});
    EXPECT_EQ(std::filesystem::status(repository.indexFile()).permissions(), perms{0664});
}

TEST_F(IndexWriting, everyOtherEntryKeepsItsFlagsAndTheIndexItsVersion) {
    for (auto const* const name : {"assumed", "skipped", "plain", "d/e/plain"}) {
        repository.write(name);
    }
    repository.commitAll();
    repository.write("intended");
    repository.write("new");
    repository.run({"add", "-N", "intended"});
    repository.run({"update-index", "--assume-unchanged", "assumed"});
    repository.run({"update-index", "--skip-worktree", "skipped"});
    repository.run({"update-index", "--index-version", "4"});
    auto const before = repository.index();
    add({"new"});
    EXPECT_NE(repository.index(), before);
    EXPECT_EQ(indexVersion(), 4);
    remove({"new"});
    EXPECT_EQ(repository.index(), before);
    EXPECT_EQ(stateOf("intended"), 5);
}

TEST_F(IndexWriting, theTimesOfOtherEntriesStay) {
    repository.write("a");
    repository.commitAll();
    auto const before = repository.run({"ls-files", "--debug", "a"});
    waitForTheNextSecond();
    repository.write("b");
    add({"b"});
    EXPECT_EQ(repository.run({"ls-files", "--debug", "a"}), before);
}

TEST_F(IndexWriting, aChangeThatOnlyTheAgeOfTheIndexShowedIsStillSeen) {
    repository.write("a", "1\n");
    repository.write("b");
    repository.commitAll();
    repository.write("a", "1\n");
    repository.run({"update-index", "--refresh"}); // entry and index are of the same second
    auto const time = std::filesystem::last_write_time(repository.onDisk() / "a");
    repository.write("a", "2\n");
    std::filesystem::last_write_time(repository.onDisk() / "a", time);
    waitForTheNextSecond();
    remove({"b"});
    EXPECT_EQ(repository.statusStates().at("a"), 3);
    EXPECT_EQ(stateOf("a"), 3);
}

TEST_F(IndexWriting, aFileThatAnotherProcessStagesMeanwhileIsNotLost) {
    for (int i = 0; i < 20; ++i) {
        auto const ours = "ours" + std::to_string(i);
        auto const theirs = "theirs" + std::to_string(i);
        repository.write(ours);
        repository.write(theirs);
        stateOf(ours); // the index is in memory
        repository.run({"add", theirs});
        add({ours});
        EXPECT_EQ(stateOf(theirs), 5);
        EXPECT_EQ(repository.statusStates().at(theirs), 5);
    }
}

TEST_F(IndexWriting, twoProcessesThatStageAtTheSameTimeLoseNothing) {
    constexpr int count = 30;
    auto const stageAll = [&](std::string const& prefix) {
        GitAdapter own(repository.root());
        for (int i = 0; i < count;) {
            auto const path = repository.path(prefix + std::to_string(i));
            try {
                own.addToSourceControl({path});
                ++i;
            } catch (GitError const& error) {
                if (error.problem().find("locked") == std::string::npos) {
                    throw;
                }
            }
        }
    };
    for (int i = 0; i < count; ++i) {
        repository.write("a" + std::to_string(i));
        repository.write("b" + std::to_string(i));
    }
    test::ChildProcess child([&](test::ChildProcess::Parent const& /*parent*/) { stageAll("b"); });
    stageAll("a");
    EXPECT_TRUE(child.join());
    EXPECT_EQ(recordsOf(repository.run({"ls-files", "-z"})).size(), 2u * count);
    expectNothingLeftBehind();
}

TEST_F(IndexWriting, aLeftoverOfADeadProcessIsReplaced) {
    folder.addFile(u"work/.git/index.lock.new", "half an index");
    repository.write("a");
    add({"a"});
    EXPECT_EQ(stateOf("a"), 5);
    expectNothingLeftBehind();
}

} // namespace
} // namespace project::git
