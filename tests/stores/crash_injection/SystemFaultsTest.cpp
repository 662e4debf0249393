#include <algorithm>
#include <array>
#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <iostream>
#include <set>
#include <system_error>

#include <fcntl.h>

#include "SystemCalls.hpp"
#include "SystemDeeds.hpp"
#include "support/NightlyScale.hpp"

using testing::Contains;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;
using testing::StartsWith;

namespace project::test {

namespace {

/// What a call can fail with.
constexpr std::array faults{ENOSPC, EDQUOT, EACCES, EIO, EROFS, ENOMEM};

/// The calls that a signal can interrupt.
bool isInterruptible(SystemCall const& call) {
    constexpr std::array<std::string_view, 8> calls{"open",  "openat", "close", "fdatasync",
                                                    "fsync", "write",  "pread", "flock"};
    return std::find(calls.begin(), calls.end(), call.name) != calls.end();
}

bool saysUnknown(std::string const& problem) {
    return problem.find("nobody can tell") != std::string::npos ||
           problem.find("could not be put back") != std::string::npos;
}

class SystemFaults : public testing::Test {
protected:
    /// In memory where there is such a folder: nothing is synced here, and disks are slow at making folders.
    static void SetUpTestSuite() {
        if (std::filesystem::is_directory("/dev/shm")) {
            ::setenv("TMPDIR", "/dev/shm", 0);
        }
    }

    /// Lets the call after so many others fail. @return false when the deed makes fewer.
    /// @param system what the system does otherwise.
    bool failAt(SystemDeed const& deed, std::size_t callsBefore, int error, bool isForGood,
                SystemCalls::Answer const& system = nullptr);

    /// Lets a deed meet a system of a certain kind. @return what the error said, or nothing.
    static std::optional<StoreError> perform(SystemDeed const& deed, RealProject& project,
                                             SystemCalls::Answer const& answer);
    static void checkAfterwards(SystemDeed const& deed, RealProject& project,
                                std::optional<StoreError> const& error);
    static void checkNextWriter(SystemDeed const& deed, RealProject const& project, Content const& found);

    std::map<std::string, std::size_t, std::less<>> hits; ///< by call
};

std::optional<StoreError> SystemFaults::perform(SystemDeed const& deed, RealProject& project,
                                                SystemCalls::Answer const& answer) {
    SystemCalls const calls(answer);
    try {
        deed.perform(project);
    } catch (StoreError const& error) {
        return error;
    }
    return std::nullopt;
}

bool SystemFaults::failAt(SystemDeed const& deed, std::size_t callsBefore, int error, bool isForGood,
                          SystemCalls::Answer const& system) {
    auto const project = projectFor(deed);
    std::size_t count = 0;
    std::string failed;
    auto const thrown = perform(deed, *project, [&](SystemCall const& call) {
        bool const isHit = count == callsBefore || (isForGood && count > callsBefore);
        ++count;
        if (isHit && failed.empty()) {
            failed = call.name;
        }
        return isHit ? error : system ? system(call) : 0;
    });
    SCOPED_TRACE(std::string(deed.name) + ": " + std::generic_category().message(error) +
                 (isForGood ? " from call " : " at call ") + std::to_string(callsBefore) + ", " + failed);
    if (thrown) {
        EXPECT_FALSE(failed.empty()) << thrown->what();
        EXPECT_THAT(thrown->getFile(), StartsWith(project->root.onDisk().string())) << thrown->what();
        EXPECT_THAT(thrown->getRemedy(), Not(IsEmpty())) << thrown->what();
    }
    checkAfterwards(deed, *project, thrown);
    if (!failed.empty()) {
        ++hits[failed];
    }
    return !failed.empty();
}

void SystemFaults::checkAfterwards(SystemDeed const& deed, RealProject& project,
                                   std::optional<StoreError> const& error) {
    SystemCalls const withoutSyncs;
    auto const found = contentOf(*project.open(deed.options));
    if (error && saysUnknown(error->getProblem())) {
        EXPECT_THAT((std::vector<Content>{deed.before, deed.after}), Contains(found));
    } else {
        EXPECT_EQ(error ? deed.before : deed.after, found) << (error ? error->what() : "no error");
    }
    if (project.backend) {
        EXPECT_EQ(found, contentOf(*project.backend));
    }
    project.backend.reset();
    checkNextWriter(deed, project, found);
}

void SystemFaults::checkNextWriter(SystemDeed const& deed, RealProject const& project, Content const& found) {
    auto const writer = project.open(deed.options);
    std::set<std::string> allowed{".gitattributes", ".gitignore", "project.jsonl"};
    for (auto const& fault : writer->check()) {
        if (fault.kind == stores::Fault::Kind::Damage) {
            EXPECT_NE(std::string::npos, project.text().find("\"a name without its end\n"));
            writer->repair();
        } else if (fault.kind == stores::Fault::Kind::Conflict) {
            writer->settle(textOf(addFiles(manyFiles(20))));
        }
    }
    auto const before = contentOf(*writer);
    commit(*writer, addFiles({u"z"}));
    auto after = before;
    after.insert(*contentAfter({addFiles({u"z"})}).begin());
    EXPECT_EQ(after, contentOf(*project.open(deed.options)));
    EXPECT_TRUE(before == found || deed.name == std::string("settle"));
    for (auto const& name : project.names()) {
        EXPECT_TRUE(allowed.contains(name) || name.starts_with("damaged-")) << name << " was left";
    }
}

TEST_F(SystemFaults, whateverCallFailsTheErrorTellsWhatToDoAndNothingIsLost) {
    bool const isLarge = numberFromEnvironment("PROJECT_TEST_CRASH_POINTS", 0) > 0;
    for (auto const& deed : systemDeeds()) {
        for (bool const isForGood : {false, true}) {
            bool isReached = true;
            for (std::size_t call = 0; isReached && !HasFailure(); ++call) {
                for (std::size_t kind = 0; kind < (isLarge ? faults.size() : 1); ++kind) {
                    isReached = failAt(deed, call, faults[(call + kind) % faults.size()], isForGood);
                }
            }
        }
    }
    for (auto const* const name : {"open", "openat", "close", "write", "pread", "fdatasync", "fsync", "fstat",
                                   "fstatat", "lstat", "futimens", "fchmod", "renameat2", "unlinkat",
                                   "mkdirat", "rmdir", "flock", "fdopendir", "readdir"}) {
        EXPECT_GT(hits[name], 0U) << name;
    }
    if (isLarge) {
        for (auto const& [name, count] : hits) {
            std::cout << name << " failed " << count << " times\n";
        }
    }
}

TEST_F(SystemFaults, aSignalAtAnyCallThatItCanInterruptChangesNothing) {
    for (auto const& deed : systemDeeds()) {
        bool isReached = true;
        for (std::size_t callsBefore = 0; isReached && !HasFailure(); ++callsBefore) {
            auto const project = projectFor(deed);
            std::size_t count = 0;
            std::string interrupted;
            auto const thrown = perform(deed, *project, [&](SystemCall const& call) {
                bool const isHit = isInterruptible(call) && count++ == callsBefore;
                interrupted = isHit ? call.name : interrupted;
                return isHit ? EINTR : 0;
            });
            isReached = !interrupted.empty();
            ASSERT_FALSE(thrown) << deed.name << ", " << interrupted << ": " << thrown->what();
            checkAfterwards(deed, *project, thrown);
        }
    }
}

TEST_F(SystemFaults, whatComesInPiecesIsPutTogether) {
    for (auto const& deed : systemDeeds()) {
        auto const project = projectFor(deed);
        {
            SystemCalls calls;
            calls.mostBytes = 7;
            deed.perform(*project);
        }
        checkAfterwards(deed, *project, std::nullopt);
    }
}

/// Lets the call of a name after so many others of that name fail.
SystemCalls::Answer failing(std::string_view name, std::size_t callsBefore) {
    return [=, left = callsBefore](SystemCall const& call) mutable {
        return call.name == name && left-- == 0 ? EIO : 0;
    };
}

/// The last look before an append is called kept.
TEST_F(SystemFaults, aFolderThatCanNotBeLookedAtIsNotTakenForOneThatWasMovedAway) {
    auto const deed = appendingDeed();
    auto const project = projectFor(deed);
    constexpr std::size_t looksBefore = 2; // when it is locked, and before the append

    auto const thrown = perform(deed, *project, failing("lstat", looksBefore));

    ASSERT_TRUE(thrown);
    EXPECT_EQ("can't be looked at: Input/output error", thrown->getProblem());
    checkAfterwards(deed, *project, thrown);
}

TEST_F(SystemFaults, aNewTextThatCanNotBeLookedAtIsNotPutInPlace) {
    auto const deed = rewritingDeed();
    auto const project = projectFor(deed);
    constexpr std::size_t looksBefore = 2; // at the folder, and at the new file's mode

    auto const thrown = perform(deed, *project, failing("fstat", looksBefore));

    ASSERT_TRUE(thrown);
    EXPECT_THAT(thrown->getFile(), HasSubstr(".tmp"));
    EXPECT_EQ("can't be looked at: Input/output error", thrown->getProblem());
    checkAfterwards(deed, *project, thrown);
}

/// File systems that can do less than others, or nothing.
class FileSystems : public SystemFaults {
protected:
    /// Every deed is done as anywhere.
    static void expectAllDeedsDone(SystemCalls::Answer const& answer) {
        for (auto const& deed : systemDeeds()) {
            auto const project = projectFor(deed);
            auto const thrown = perform(deed, *project, answer);
            EXPECT_FALSE(thrown) << deed.name << ": " << thrown->what();
            checkAfterwards(deed, *project, thrown);
        }
    }

    static SystemCalls::Answer refusing(unsigned int kindOfRename, int error) {
        return [=](SystemCall const& call) {
            return call.name == "renameat2" && static_cast<unsigned int>(call.flags) == kindOfRename ? error
                                                                                                     : 0;
        };
    }
};

TEST_F(FileSystems, whereNothingCanBeWrittenProjectsOpenForReading) {
    auto const readOnly = [](SystemCall const& call) { return call.isChange() ? EROFS : 0; };
    for (auto const& deed : systemDeeds()) {
        auto const project = projectFor(deed);
        std::optional<Content> read;
        {
            SystemCalls const calls(readOnly);
            read = contentOf(*project->open(deed.options));
        }
        EXPECT_EQ(deed.before, read) << deed.name;
        auto const text = project->text();

        auto const thrown = perform(deed, *project, readOnly);

        auto const names = std::set<std::string>{"look", "look after others", "check", "close", "discard"};
        EXPECT_EQ(!names.contains(deed.name), thrown.has_value()) << deed.name;
        if (thrown) {
            EXPECT_EQ("The file system takes no writes: mount it writable, or work on a copy.",
                      thrown->getRemedy());
        }
        EXPECT_EQ(text, project->text());
        checkAfterwards(deed, *project, thrown);
    }
}

TEST_F(FileSystems, whereFilesCanNotBeExchangedEverythingIsDoneAllTheSame) {
    for (int const error : {EINVAL, ENOSYS, EOPNOTSUPP}) {
        expectAllDeedsDone(refusing(RENAME_EXCHANGE, error));
    }
}

TEST_F(FileSystems, whereFilesCanNotBeExchangedAnyOtherCallMayFailToo) {
    for (bool const isForGood : {false, true}) {
        bool isReached = true;
        for (std::size_t call = 0; isReached && !HasFailure(); ++call) {
            isReached = failAt(rewritingDeed(), call, EIO, isForGood, refusing(RENAME_EXCHANGE, EINVAL));
        }
    }
    EXPECT_GT(hits["renameat"], 0U);
}

TEST_F(FileSystems, whereARenameCanNotLookOutForOthersEverythingIsDoneAllTheSame) {
    for (int const error : {EINVAL, ENOSYS, EOPNOTSUPP}) {
        expectAllDeedsDone(refusing(RENAME_NOREPLACE, error));
    }
}

TEST_F(FileSystems, whereRenamesCanDoNeitherEverythingIsDoneAllTheSame) {
    expectAllDeedsDone([](SystemCall const& call) { return call.name == "renameat2" ? ENOSYS : 0; });
}

TEST_F(FileSystems, whereTimesModesAndOwnersAreNotKeptEverythingIsDoneAllTheSame) {
    expectAllDeedsDone([](SystemCall const& call) {
        return call.name == "futimens" || call.name == "fchmod" || call.name == "fchown" ? EPERM : 0;
    });
}

TEST_F(FileSystems, whereANameIsRefusedTheErrorNamesItAndNothingIsLost) {
    for (int const error : {ENAMETOOLONG, EINVAL, EILSEQ}) {
        for (auto const& deed : {rewritingDeed(), creatingDeed()}) {
            auto const project = projectFor(deed);

            auto const thrown = perform(deed, *project, [&](SystemCall const& call) {
                return call.name == "openat" && (call.flags & O_CREAT) != 0 ? error : 0;
            });

            ASSERT_TRUE(thrown) << deed.name;
            EXPECT_THAT(thrown->getFile(), HasSubstr("/.projectdata/project.jsonl."));
            EXPECT_THAT(thrown->getRemedy(), HasSubstr("on another file system"));
            checkAfterwards(deed, *project, thrown);
        }
    }
}

TEST_F(FileSystems, whereTheFolderItselfIsRefusedTheErrorNamesItAndNothingIsLeft) {
    auto const deed = creatingDeed();
    auto const project = projectFor(deed);

    auto const thrown =
        perform(deed, *project, [](SystemCall const& call) { return call.name == "mkdirat" ? EILSEQ : 0; });

    ASSERT_TRUE(thrown);
    EXPECT_EQ((project->root.onDisk() / ".projectdata").string(), thrown->getFile());
    EXPECT_TRUE(std::filesystem::is_empty(project->root.onDisk()));
    checkAfterwards(deed, *project, thrown);
}

/// Git can bring names that differ from the store's in capitals alone.
TEST_F(FileSystems, namesInOtherCapitalsAreSomebodyElsesWhereCapitalsCount) {
    auto const deed = creatingDeed();
    auto const project = projectFor(deed);
    project->root.addFile(".ProjectData/project.jsonl", textOf(addFiles({u"theirs"})));
    project->root.addFile(".projectdata/PROJECT.JSONL", textOf(addFiles({u"theirs"})));

    auto const thrown = perform(deed, *project, nullptr);

    EXPECT_FALSE(thrown);
    EXPECT_EQ(deed.after, contentOf(*project->open(deed.options)));
    EXPECT_TRUE(std::filesystem::exists(project->root.onDisk() / ".ProjectData/project.jsonl"));
    EXPECT_TRUE(std::filesystem::exists(project->root.onDisk() / ".projectdata/PROJECT.JSONL"));
}

} // namespace

} // namespace project::test
