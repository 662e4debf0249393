#include <atomic>
#include <csignal>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <thread>

#include <fcntl.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <unistd.h>

#include "disk/FileTransfer.hpp"
#include "project/stores/StoreError.hpp"
#include "project/stores/SystemDisk.hpp"
#include "project/stores/TextBackend.hpp"
#include "support/ChildProcess.hpp"
#include "support/TemporaryFolder.hpp"
#include "support/TextStore.hpp"

using testing::HasSubstr;
using testing::StartsWith;
using testing::UnorderedElementsAre;

namespace project::test {

namespace {

using stores::Disk;
using stores::makeSystemDisk;

/// The mode of the files that this process creates.
class Umask {
public:
    explicit Umask(mode_t mask) : before_(::umask(mask)) {}

    ~Umask() { ::umask(before_); }

    Umask(Umask const&) = delete;
    Umask& operator=(Umask const&) = delete;

private:
    mode_t before_;
};

/// Limits the size of files while the object lives.
class FileSizeLimit {
public:
    explicit FileSizeLimit(rlim_t bytes) {
        ::getrlimit(RLIMIT_FSIZE, &before_);
        rlimit const limit{bytes, before_.rlim_max};
        ::setrlimit(RLIMIT_FSIZE, &limit);
    }

    ~FileSizeLimit() { ::setrlimit(RLIMIT_FSIZE, &before_); }

    FileSizeLimit(FileSizeLimit const&) = delete;
    FileSizeLimit& operator=(FileSizeLimit const&) = delete;

private:
    rlimit before_{};
};

class SystemDisk : public testing::Test {
protected:
    /// The error of a call. A disk knows the names of files, and no lines.
    template <typename Call>
    static StoreError errorOf(Call const& call) {
        auto const error = test::errorOf(call);
        EXPECT_EQ(0U, error.line());
        return error;
    }

    std::unique_ptr<Disk> openDisk() const {
        auto disk = makeSystemDisk(root.path(), stores::TextBackend::folderName);
        disk->makeFolder();
        return disk;
    }

    std::filesystem::path at(std::string const& name) const { return root.onDisk() / ".projectdata" / name; }

    std::string content(std::string const& name) const {
        std::ifstream file(at(name), std::ios::binary);
        std::ostringstream bytes;
        bytes << file.rdbuf();
        return bytes.str();
    }

    struct stat statusOf(std::string const& name) const {
        struct stat status {};

        EXPECT_EQ(0, ::lstat(at(name).c_str(), &status));
        return status;
    }

    TemporaryFolder root;
};

TEST_F(SystemDisk, theFolderIsCreatedOnceAndRemovedWhenEmpty) {
    auto const disk = makeSystemDisk(root.path(), stores::TextBackend::folderName);
    EXPECT_FALSE(disk->openFolder());

    EXPECT_TRUE(disk->makeFolder());
    EXPECT_FALSE(disk->makeFolder());
    disk->create("a", "", std::nullopt);
    disk->removeFolder();
    EXPECT_TRUE(std::filesystem::exists(at("a")));
    ASSERT_TRUE(disk->openFolder());
    disk->remove("a");
    disk->removeFolder();

    EXPECT_FALSE(std::filesystem::exists(at("")));
    EXPECT_FALSE(disk->isFolderInPlace());
}

TEST_F(SystemDisk, aMissingRootIsAnErrorThatNamesIt) {
    auto const disk = makeSystemDisk(root.path(u"missing"), stores::TextBackend::folderName);

    auto const error = errorOf([&] { disk->openFolder(); });

    EXPECT_EQ((root.onDisk() / "missing").string(), error.file());
    EXPECT_THAT(error.remedy(), HasSubstr("moved or deleted"));
}

TEST_F(SystemDisk, contentIsReadBackFromAnyOffset) {
    auto const disk = openDisk();
    auto const made = disk->create("a", "hello", std::nullopt);
    disk->sync();

    auto const appended = disk->append("a", made.identity, " world");
    disk->sync();

    ASSERT_TRUE(appended);
    EXPECT_EQ("hello world", disk->read("a", 0)->bytes);
    EXPECT_EQ("world", disk->read("a", 6)->bytes);
    EXPECT_EQ("", disk->read("a", 100)->bytes);
    EXPECT_EQ(appended->identity, disk->read("a", 0)->identity);
    EXPECT_EQ(appended->identity, disk->identify("a"));
    EXPECT_EQ(appended->identity, disk->identifyByPath("a"));
    EXPECT_FALSE(disk->read("b", 0));
    EXPECT_FALSE(disk->identify("b"));
    EXPECT_FALSE(disk->identifyByPath("b"));
}

TEST_F(SystemDisk, longContentIsReadBackCompletely) {
    auto const disk = openDisk();
    std::string const bytes(10'000'000, 'x');

    disk->create("a", bytes, std::nullopt);

    EXPECT_EQ(bytes, disk->read("a", 0)->bytes);
}

TEST_F(SystemDisk, nothingIsAppendedToAFileInAnotherState) {
    auto const disk = openDisk();
    auto const made = disk->create("a", "hello", std::nullopt);
    std::ofstream(at("a"), std::ios::app) << "!";

    EXPECT_FALSE(disk->append("a", made.identity, " world"));
    EXPECT_FALSE(disk->append("b", made.identity, " world"));

    EXPECT_EQ("hello!", content("a"));
}

TEST_F(SystemDisk, aTakenNameIsNotOverwritten) {
    auto const disk = openDisk();
    disk->create("a", "first", std::nullopt);
    disk->create("b", "second", std::nullopt);

    EXPECT_THROW(disk->create("a", "third", std::nullopt), StoreError);
    EXPECT_FALSE(disk->renameToFree("b", "a"));

    EXPECT_EQ("first", content("a"));
    EXPECT_EQ("second", content("b"));
    EXPECT_TRUE(disk->renameToFree("b", "c"));
    EXPECT_EQ("second", content("c"));
}

TEST_F(SystemDisk, filesAreExchangedAndReplaced) {
    auto const disk = openDisk();
    disk->create("a", "first", std::nullopt);
    disk->create("b", "second", std::nullopt);

    ASSERT_TRUE(disk->exchange("a", "b"));
    EXPECT_EQ("second", content("a"));
    EXPECT_EQ("first", content("b"));
    EXPECT_THROW(disk->exchange("a", "missing"), StoreError);
    disk->rename("b", "a");
    EXPECT_EQ("first", content("a"));
    EXPECT_THAT(disk->list(), UnorderedElementsAre("a"));
    EXPECT_TRUE(disk->remove("a"));
    EXPECT_FALSE(disk->remove("a"));
}

TEST_F(SystemDisk, aNewFileHasTheModeThatTheUmaskGives) {
    auto const disk = openDisk();
    {
        Umask const mask(0027);
        disk->create("a", "", std::nullopt);
    }
    EXPECT_EQ(0640U, statusOf("a").st_mode & 07777);
}

TEST_F(SystemDisk, aNewTextHasModeAndOwnerOfTheOldOne) {
    auto const disk = openDisk();
    disk->create("old", "", std::nullopt);
    ASSERT_EQ(0, ::chmod(at("old").c_str(), 0604));
    bool const isRoot = ::geteuid() == 0;
    if (isRoot) {
        ASSERT_EQ(0, ::chown(at("old").c_str(), 12345, 23456));
    }

    disk->create("new", "", "old");

    EXPECT_EQ(0604U, statusOf("new").st_mode & 07777);
    EXPECT_EQ(statusOf("old").st_uid, statusOf("new").st_uid);
    EXPECT_EQ(statusOf("old").st_gid, statusOf("new").st_gid);
}

TEST_F(SystemDisk, aWriteByAnotherProgramRightAfterOursIsAlwaysDetected) {
    auto const disk = openDisk();
    auto state = disk->create("a", "0", std::nullopt);
    ASSERT_TRUE(state.isStamped);
    for (int round = 0; round < 500; ++round) {
        state = *disk->append("a", state.identity, "x");
        EXPECT_EQ(state.identity, disk->identifyByPath("a"));
        int const file = ::open(at("a").c_str(), O_WRONLY | O_CLOEXEC);
        ASSERT_EQ(1, ::pwrite(file, "y", 1, 0)); // of the same length, and mostly within the same tick
        ::close(file);

        auto const now = disk->identifyByPath("a");

        ASSERT_NE(state.identity, now) << round;
        state.identity = *now;
    }
}

TEST_F(SystemDisk, aPipeNeverBlocksIt) {
    auto const disk = openDisk();
    ASSERT_EQ(0, ::mkfifo(at("a").c_str(), 0600));

    EXPECT_FALSE(disk->identify("a")->isRegular);
    EXPECT_FALSE(disk->identifyByPath("a")->isRegular);
    for (auto const& error :
         {errorOf([&] { disk->read("a", 0); }), errorOf([&] { disk->append("a", {}, "x"); })}) {
        EXPECT_EQ(at("a").string(), error.file());
        EXPECT_EQ(StoreError::Kind::Damaged, error.kind());
    }
}

TEST_F(SystemDisk, aFolderInThePlaceOfAFileIsAnError) {
    auto const disk = openDisk();
    std::filesystem::create_directory(at("a"));

    EXPECT_FALSE(disk->identify("a")->isRegular);
    EXPECT_EQ(StoreError::Kind::Damaged, errorOf([&] { disk->read("a", 0); }).kind());
    EXPECT_THROW(disk->append("a", {}, "x"), StoreError);
}

TEST_F(SystemDisk, noLinkIsFollowedToAFile) {
    auto const disk = openDisk();
    auto const outside = root.addFile("outside", "secret");
    std::filesystem::create_symlink(outside, at("a"));

    EXPECT_FALSE(disk->identify("a")->isRegular);
    EXPECT_EQ("is a symbolic link", errorOf([&] { disk->read("a", 0); }).problem());
    EXPECT_EQ("is a symbolic link", errorOf([&] { disk->append("a", {}, "x"); }).problem());
    EXPECT_THROW(disk->create("a", "x", std::nullopt), StoreError);
}

TEST_F(SystemDisk, noLinkIsFollowedToTheFolder) {
    root.addFolder("outside");
    root.addLink(".projectdata", root.onDisk() / "outside");
    auto const disk = makeSystemDisk(root.path(), stores::TextBackend::folderName);

    auto const error = errorOf([&] { disk->openFolder(); });

    EXPECT_EQ((root.onDisk() / ".projectdata").string(), error.file());
    EXPECT_EQ(StoreError::Kind::Damaged, error.kind());
    EXPECT_EQ("is a symbolic link", error.problem());
    EXPECT_THROW(disk->makeFolder(), StoreError);
}

TEST_F(SystemDisk, aFileInThePlaceOfTheFolderIsAnError) {
    root.addFile(".projectdata");
    auto const disk = makeSystemDisk(root.path(), stores::TextBackend::folderName);

    EXPECT_EQ(StoreError::Kind::Damaged, errorOf([&] { disk->openFolder(); }).kind());
    EXPECT_FALSE(disk->identifyByPath("project.jsonl"));
}

TEST_F(SystemDisk, aFolderThatWasMovedAwayIsNoticedAndTheNewOneOpened) {
    auto const disk = openDisk();
    disk->create("a", "old", std::nullopt);
    std::filesystem::rename(at(""), root.onDisk() / "moved");
    EXPECT_FALSE(disk->isFolderInPlace());
    root.addFile(".projectdata/a", "new");
    EXPECT_FALSE(disk->isFolderInPlace());
    EXPECT_EQ("old", disk->read("a", 0)->bytes);
    EXPECT_NE(disk->identify("a"), disk->identifyByPath("a"));

    EXPECT_TRUE(disk->openFolder());

    EXPECT_TRUE(disk->isFolderInPlace());
    EXPECT_EQ("new", disk->read("a", 0)->bytes);
}

TEST_F(SystemDisk, aFileBeyondTheLimitIsAnErrorAndNotTheEndOfTheProcess) {
    auto const disk = openDisk();
    auto const made = disk->create("a", std::string(600, 'x'), std::nullopt);
    FileSizeLimit const limit(1000);

    auto const appended = errorOf([&] { disk->append("a", made.identity, std::string(600, 'y')); });
    auto const created = errorOf([&] { disk->create("b", std::string(2000, 'x'), std::nullopt); });

    for (auto const& error : {appended, created}) {
        EXPECT_EQ(StoreError::Kind::DiskFailed, error.kind());
        EXPECT_THAT(error.remedy(), HasSubstr("ulimit -f"));
    }
    EXPECT_EQ(at("a").string(), appended.file());
    EXPECT_LT(content("a").size(), 1200U);
    EXPECT_FALSE(std::filesystem::exists(at("b")));
    sigset_t pending;
    sigpending(&pending);
    EXPECT_EQ(0, sigismember(&pending, SIGXFSZ));
}

TEST_F(SystemDisk, noFileIsWrittenBeyondTheReadableLength) {
    auto const disk = openDisk();
    disk->create("a", "x", std::nullopt);
    std::filesystem::resize_file(at("a"), stores::Disk::longestFile - 1);
    auto const written = disk->append("a", *disk->identify("a"), "y");
    ASSERT_TRUE(written);
    EXPECT_EQ(stores::Disk::longestFile, written->identity.size);

    auto const error = errorOf([&] { disk->append("a", written->identity, "z"); });

    EXPECT_EQ(StoreError::Kind::Refused, error.kind());
    EXPECT_EQ(stores::Disk::longestFile, disk->identify("a")->size);
}

TEST_F(SystemDisk, aFullFileSystemIsAnErrorThatSaysWhatToDo) {
    std::filesystem::path const full = "/dev/full";
    auto const error = errorOf([&] {
        int const file = ::open(full.c_str(), O_WRONLY | O_CLOEXEC);
        struct Closing {
            int file;

            ~Closing() { ::close(file); }
        } const closing{file};
        stores::writeAll(file, "x", "project.jsonl");
    });

    EXPECT_EQ(
        "project.jsonl: cannot be written: No space left on device. Make room on the disk and try again.",
        std::string(error.what()));
}

TEST_F(SystemDisk, theLockKeepsOthersOutUntilItIsReleased) {
    auto const disk = openDisk();
    auto const other = openDisk();
    ASSERT_TRUE(disk->lock(std::chrono::milliseconds(0)));

    EXPECT_FALSE(other->lock(std::chrono::milliseconds(0)));
    auto const start = std::chrono::steady_clock::now();
    EXPECT_FALSE(other->lock(std::chrono::milliseconds(60)));
    EXPECT_GE(std::chrono::steady_clock::now() - start, std::chrono::milliseconds(60));
    EXPECT_THAT(other->lockHolder(), StartsWith("process " + std::to_string(::getpid()) + " ("));

    disk->unlock();
    EXPECT_EQ("", other->lockHolder());
    EXPECT_TRUE(other->lock(std::chrono::milliseconds(0)));
}

TEST_F(SystemDisk, theHolderOfTheLockIsNamedWithItsCommand) {
    auto const disk = openDisk();
    ChildProcess child([this](ChildProcess::Parent const& parent) {
        auto const theirs = openDisk();
        parent.say(theirs->lock(std::chrono::milliseconds(0)) ? "locked" : "not locked");
        parent.await();
    });
    ASSERT_EQ("locked", child.hear());
    std::ifstream comm("/proc/self/comm");
    std::string command;
    std::getline(comm, command);

    EXPECT_FALSE(disk->lock(std::chrono::milliseconds(5)));

    EXPECT_EQ("process " + std::to_string(child.id()) + " (" + command + ")", disk->lockHolder());
}

TEST_F(SystemDisk, theLockOfADeadProcessIsReleased) {
    auto const disk = openDisk();
    ChildProcess child([this](ChildProcess::Parent const& parent) {
        auto const theirs = openDisk();
        theirs->lock(std::chrono::milliseconds(0));
        parent.say("locked");
        parent.await();
    });
    ASSERT_EQ("locked", child.hear());
    ASSERT_FALSE(disk->lock(std::chrono::milliseconds(0)));

    child.kill();

    EXPECT_TRUE(disk->lock(std::chrono::milliseconds(1000)));
}

TEST_F(SystemDisk, theChildOfAForkHoldsNothingAndRefusesToWork) {
    auto const disk = openDisk();
    auto const made = disk->create("a", "hello", std::nullopt);
    ASSERT_TRUE(disk->lock(std::chrono::milliseconds(0)));
    ChildProcess child([&](ChildProcess::Parent const& parent) {
        std::string answers;
        auto const ask = [&](auto const& call) {
            try {
                call();
                answers += "worked;";
            } catch (StoreError const& error) {
                answers += error.kind() == StoreError::Kind::Refused ? "refused;" : error.what();
            }
        };
        ask([&] { disk->openFolder(); });
        ask([&] { disk->identifyByPath("a"); });
        ask([&] { disk->isFolderInPlace(); });
        ask([&] { disk->append("a", made.identity, "!"); });
        ask([&] { disk->sync(); });
        disk->unlock(); // must not release the parent's lock
        disk->removeFolder();
        parent.say(answers);
        parent.await();
    });
    EXPECT_EQ("refused;refused;refused;refused;refused;", child.hear());

    auto const other = openDisk();
    EXPECT_FALSE(other->lock(std::chrono::milliseconds(0)));
    disk->unlock();
    EXPECT_TRUE(other->lock(std::chrono::milliseconds(0))) << "the child is alive and must not hold it";
    EXPECT_EQ("hello", content("a"));
}

TEST_F(SystemDisk, aForkDuringManyOpensLeavesNoDescriptorInTheChild) {
    auto const disk = openDisk();
    disk->create("a", "hello", std::nullopt);
    std::atomic<bool> stop = false;
    std::thread reader([&] {
        while (!stop) {
            disk->read("a", 0);
        }
    });
    auto const countOpen = [&] {
        std::ptrdiff_t count = 0;
        for (auto const& entry : std::filesystem::directory_iterator("/proc/self/fd")) {
            std::error_code ignored;
            auto const target = std::filesystem::read_symlink(entry.path(), ignored);
            count += target.string().starts_with(root.onDisk().string()) ? 1 : 0;
        }
        return count;
    };
    for (int round = 0; round < 50; ++round) {
        ChildProcess child(
            [&](ChildProcess::Parent const& parent) { parent.say(std::to_string(countOpen())); });
        EXPECT_EQ("0", child.hear());
    }
    stop = true;
    reader.join();
}

} // namespace

} // namespace project::test
