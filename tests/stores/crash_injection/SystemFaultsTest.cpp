#include <algorithm>
#include <array>
#include <cerrno>
#include <iostream>

#include <unistd.h>

#include "SystemFaults.hpp"
#include "project/stores/SystemDisk.hpp"
#include "support/NightlyScale.hpp"
#include "support/TemporaryFolder.hpp"

using testing::HasSubstr;
using testing::UnorderedElementsAre;

namespace project::test {

namespace {

/// The errors of each call.
constexpr std::array faults{ENOSPC, EDQUOT, EACCES, EIO, EROFS, ENOMEM};

/// The calls that a signal can interrupt.
bool isInterruptible(SystemCall const& call) {
    constexpr std::array<std::string_view, 8> calls{"open",  "openat", "close", "fdatasync",
                                                    "fsync", "write",  "pread", "flock"};
    return std::find(calls.begin(), calls.end(), call.name) != calls.end();
}

TEST_F(SystemFaults, anyFailedCallIsAnErrorWithARemedyAndLosesNothing) {
    bool const isLarge = numberFromEnvironment("PROJECT_TEST_CRASH_POINTS", 0) > 0;
    for (auto const& operation : systemOperations()) {
        for (bool const isForGood : {false, true}) {
            bool isReached = true;
            for (std::size_t call = 0; isReached && !HasFailure(); ++call) {
                for (std::size_t kind = 0; kind < (isLarge ? faults.size() : 1); ++kind) {
                    isReached = failAt(operation, call, faults[(call + kind) % faults.size()], isForGood);
                }
            }
        }
    }
    for (auto const* const name :
         {"open",    "openat",  "close", "write",    "pread",     "fdatasync", "fsync",
          "fstat",   "fstatat", "lstat", "futimens", "fchmod",    "renameat2", "unlinkat",
          "mkdirat", "rmdir",   "flock", "fcntl",    "fdopendir", "readdir"}) {
        EXPECT_GT(hits[name], 0U) << name;
    }
    if (::geteuid() == 0) { // only root can change a file's owner
        EXPECT_GT(hits["fchown"], 0U);
    }
    if (isLarge) {
        for (auto const& [name, count] : hits) {
            std::cout << name << " failed " << count << " times\n";
        }
    }
}

TEST_F(SystemFaults, aSignalAtAnyCallThatItCanInterruptChangesNothing) {
    for (auto const& operation : systemOperations()) {
        bool isReached = true;
        for (std::size_t callsBefore = 0; isReached && !HasFailure(); ++callsBefore) {
            auto const project = projectFor(operation);
            std::size_t count = 0;
            std::string interrupted;
            auto const thrown = perform(operation, *project, [&](SystemCall const& call) {
                bool const isHit = isInterruptible(call) && count++ == callsBefore;
                interrupted = isHit ? call.name : interrupted;
                return isHit ? EINTR : 0;
            });
            isReached = !interrupted.empty();
            ASSERT_FALSE(thrown) << operation.name << ", " << interrupted << ": " << thrown->what();
            checkAfterwards(operation, *project, thrown);
        }
    }
}

TEST_F(SystemFaults, partialReadsAndWritesAreContinued) {
    for (auto const& operation : systemOperations()) {
        auto const project = projectFor(operation);
        {
            SystemCalls calls;
            calls.mostBytes = 7;
            operation.perform(*project);
        }
        checkAfterwards(operation, *project, std::nullopt);
    }
}

/// Injects a fault into one call of a name, after a number of others of that name.
SystemCalls::Answer failing(std::string_view name, std::size_t callsBefore) {
    return [=, left = callsBefore](SystemCall const& call) mutable {
        return call.name == name && left-- == 0 ? EIO : 0;
    };
}

/// The last check before an append is committed.
TEST_F(SystemFaults, aFolderThatCannotBeExaminedIsNotTakenForAMovedOne) {
    auto const operation = appendingOperation();
    auto const project = projectFor(operation);
    constexpr std::size_t examinedBefore = 2; // when it is locked, and before the append

    auto const thrown = perform(operation, *project, failing("lstat", examinedBefore));

    ASSERT_TRUE(thrown);
    EXPECT_EQ("cannot be examined: Input/output error", thrown->problem());
    checkAfterwards(operation, *project, thrown);
}

TEST_F(SystemFaults, aNewTextThatCannotBeExaminedDoesNotReplaceTheOldOne) {
    auto const operation = rewritingOperation();
    auto const project = projectFor(operation);
    constexpr std::size_t examinedBefore = 2; // the folder, and the new file's mode

    auto const thrown = perform(operation, *project, failing("fstat", examinedBefore));

    ASSERT_TRUE(thrown);
    EXPECT_THAT(thrown->file(), HasSubstr(".tmp"));
    EXPECT_EQ("cannot be examined: Input/output error", thrown->problem());
    checkAfterwards(operation, *project, thrown);
}

TEST_F(SystemFaults, aNewTextThatCannotBeWrittenLeavesNothing) {
    auto const operation = rewritingOperation();
    auto const project = projectFor(operation);

    auto const thrown = perform(operation, *project, failing("write", 0));

    ASSERT_TRUE(thrown);
    EXPECT_THAT(project->names(), UnorderedElementsAre(".gitattributes", ".gitignore", "project.jsonl"));
}

/// Otherwise another program could change the file within the same tick, and leave it with the same time.
TEST_F(SystemFaults, noFileHasATimeOfTheCoarseClock) {
    TemporaryFolder const folder;
    auto const disk = stores::makeSystemDisk(folder.root(), u".projectdata");
    disk->makeFolder();
    SystemCalls calls;
    for (long const nanoseconds : {0, 1, 999'999'999}) {
        calls.time = timespec{.tv_sec = 1'000'000'000, .tv_nsec = nanoseconds};

        auto const written = disk->create("at" + std::to_string(nanoseconds), "", std::nullopt);

        EXPECT_TRUE(written.isStamped) << nanoseconds;
        EXPECT_NE(written.identity.modified, disk->now()) << nanoseconds;
    }
}

TEST_F(SystemFaults, theRemedyFitsTheError) {
    std::map<int, std::string> const remedies{{ENOSPC, "Make room on the disk"},
                                              {EDQUOT, "within the quota"},
                                              {EFBIG, "ulimit -f"},
                                              {EACCES, "the permissions"},
                                              {EPERM, "the permissions"},
                                              {EROFS, "read-only"},
                                              {EMFILE, "ulimit -n"},
                                              {ENFILE, "ulimit -n"},
                                              {EIO, "The disk is failing"},
                                              {ENOENT, "was moved or deleted"},
                                              {ENOTDIR, "moved or deleted"},
                                              {ESTALE, "Reopen the project"},
                                              {ENOMEM, "Free some memory"},
                                              {ENAMETOOLONG, "the name"},
                                              {EILSEQ, "the name"},
                                              {EOPNOTSUPP, "an operation that the"},
                                              {EBUSY, "Try again"}};
    for (auto const& [error, remedy] : remedies) {
        TemporaryFolder const folder;
        auto const disk = stores::makeSystemDisk(folder.root(), u".projectdata");
        SystemCalls const calls(
            [error = error](SystemCall const& call) { return call.name == "open" ? error : 0; });

        EXPECT_THAT([&] { disk->makeFolder(); },
                    testing::Throws<StoreError>(testing::Property(&StoreError::remedy, HasSubstr(remedy))));
    }
}

/// On some file systems, a full disk is reported when a file is closed.
TEST_F(SystemFaults, aFileThatCannotBeClosedAfterASyncIsNotDurable) {
    for (auto const& operation : {appendingOperation(), rewritingOperation(), creatingOperation()}) {
        auto const project = projectFor(operation);

        auto const thrown = perform(operation, *project, [wasSynced = false](SystemCall const& call) mutable {
            bool const isHit = wasSynced && call.name == "close";
            wasSynced = call.name == "fdatasync";
            return isHit ? ENOSPC : 0;
        });

        ASSERT_TRUE(thrown) << operation.name;
        EXPECT_EQ("Make room on the disk and try again.", thrown->remedy().substr(0, 36));
        checkAfterwards(operation, *project, thrown);
    }
}

} // namespace

} // namespace project::test
