#include <array>
#include <chrono>
#include <fstream>
#include <functional>
#include <thread>

#include <sys/inotify.h>
#include <sys/stat.h>
#include <unistd.h>

#include "git/GitRepository.hpp"
#include "project/git/GitError.hpp"
#include "support/ChildProcess.hpp"
#include "support/Waiting.hpp"

namespace project::git {
namespace {

using std::filesystem::perms;

/// Counts the replacements of files in a folder.
class ReplacementCount {
public:
    explicit ReplacementCount(std::filesystem::path const& folder)
        : watch_(::inotify_init1(IN_NONBLOCK | IN_CLOEXEC)) {
        if (::inotify_add_watch(watch_, folder.c_str(), IN_MOVED_TO | IN_CLOSE_WRITE) < 0) {
            throw std::runtime_error("no watch on " + folder.string());
        }
    }

    ~ReplacementCount() { ::close(watch_); }

    ReplacementCount(ReplacementCount const&) = delete;
    ReplacementCount& operator=(ReplacementCount const&) = delete;

    /// The number of times that a file of that name was moved in or written since the last call.
    int of(std::string const& name) const {
        alignas(inotify_event) std::array<char, 65536> buffer{};
        int result = 0;
        ssize_t length = 0;
        while ((length = ::read(watch_, buffer.data(), buffer.size())) > 0) {
            for (char const* at = buffer.data(); at < buffer.data() + length;) {
                auto const* const event = reinterpret_cast<inotify_event const*>(at);
                result += event->len > 0 && name == event->name ? 1 : 0;
                at += sizeof(inotify_event) + event->len;
            }
        }
        return result;
    }

private:
    int watch_;
};

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
    ReplacementCount const replaced(repository.onDisk() / ".git");
    add(names);
    EXPECT_EQ(replaced.of("index"), 1);
    remove(names);
    EXPECT_EQ(replaced.of("index"), 1);
    repository.adapterStates(adapter, names);
    remove(names);
    add({});
    EXPECT_EQ(replaced.of("index"), 0);
}

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
