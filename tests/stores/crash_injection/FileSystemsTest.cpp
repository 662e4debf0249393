#include <cerrno>
#include <cstdio>
#include <filesystem>
#include <set>

#include <fcntl.h>

#include "SystemFaults.hpp"
#include "project/stores/SystemDisk.hpp"
#include "support/TemporaryFolder.hpp"

using testing::HasSubstr;

namespace project::test {

namespace {

/// File systems with fewer features than others, or read-only ones.
class FileSystems : public SystemFaults {
protected:
    /// Every operation has its usual result.
    static void expectAllOperationsDone(SystemCalls::Answer const& answer) {
        for (auto const& operation : systemOperations()) {
            auto const project = projectFor(operation);
            auto const thrown = perform(operation, *project, answer);
            EXPECT_FALSE(thrown) << operation.name << ": " << thrown->what();
            checkAfterwards(operation, *project, thrown);
        }
    }

    static SystemCalls::Answer refusing(unsigned int kindOfRename, int error) {
        return [=](SystemCall const& call) {
            return call.name == "renameat2" && static_cast<unsigned int>(call.flags) == kindOfRename ? error
                                                                                                     : 0;
        };
    }
};

TEST_F(FileSystems, projectsOnReadOnlyFileSystemsOpenForReading) {
    auto const readOnly = [](SystemCall const& call) { return call.isChange() ? EROFS : 0; };
    for (auto const& operation : systemOperations()) {
        auto const project = projectFor(operation);
        std::optional<Content> read;
        {
            SystemCalls const calls(readOnly);
            read = contentOf(*project->open(operation.options));
        }
        EXPECT_EQ(operation.before, read) << operation.name;
        auto const text = project->text();

        auto const thrown = perform(operation, *project, readOnly);

        auto const names = std::set<std::string>{"check for changes", "check for changes after others",
                                                 "check", "close", "discard"};
        EXPECT_EQ(!names.contains(operation.name), thrown.has_value()) << operation.name;
        if (thrown) {
            EXPECT_EQ("The file system is read-only: mount it writable, or work on a copy.",
                      thrown->remedy());
        }
        EXPECT_EQ(text, project->text());
        checkAfterwards(operation, *project, thrown);
    }
}

TEST_F(FileSystems, everyOperationWorksWithoutExchange) {
    for (int const error : {EINVAL, ENOSYS, EOPNOTSUPP}) {
        expectAllOperationsDone(refusing(RENAME_EXCHANGE, error));
    }
}

TEST_F(FileSystems, anyOtherCallMayFailWithoutExchange) {
    for (bool const isForGood : {false, true}) {
        bool isReached = true;
        for (std::size_t call = 0; isReached && !HasFailure(); ++call) {
            isReached = failAt(rewritingOperation(), call, EIO, isForGood, refusing(RENAME_EXCHANGE, EINVAL));
        }
    }
    EXPECT_GT(hits["renameat"], 0U);
}

TEST_F(FileSystems, everyOperationWorksWithoutRenamesThatKeepExistingFiles) {
    for (int const error : {EINVAL, ENOSYS, EOPNOTSUPP}) {
        expectAllOperationsDone(refusing(RENAME_NOREPLACE, error));
    }
}

TEST_F(FileSystems, aTakenNameIsNotOverwrittenWithoutRenamesThatKeepExistingFiles) {
    TemporaryFolder const folder;
    auto const disk = stores::makeSystemDisk(folder.root(), u".projectdata");
    disk->makeFolder();
    for (auto const* const name : {"taken", "new"}) {
        disk->create(name, name, std::nullopt);
        disk->sync();
    }
    SystemCalls const calls(refusing(RENAME_NOREPLACE, EINVAL));

    EXPECT_FALSE(disk->renameToFree("new", "taken"));
    EXPECT_EQ(disk->read("taken", 0)->bytes, "taken");
    EXPECT_TRUE(disk->renameToFree("new", "free"));
    EXPECT_EQ(disk->read("free", 0)->bytes, "new");
}

TEST_F(FileSystems, everyOperationWorksWithPlainRenamesOnly) {
    expectAllOperationsDone([](SystemCall const& call) { return call.name == "renameat2" ? ENOSYS : 0; });
}

TEST_F(FileSystems, everyOperationWorksWithoutTimesModesAndOwners) {
    expectAllOperationsDone([](SystemCall const& call) {
        return call.name == "futimens" || call.name == "fchmod" || call.name == "fchown" ? EPERM : 0;
    });
}

TEST_F(FileSystems, aRefusedNameIsAnErrorThatNamesItAndNothingIsLost) {
    for (int const error : {ENAMETOOLONG, EINVAL, EILSEQ}) {
        for (auto const& operation : {rewritingOperation(), creatingOperation()}) {
            auto const project = projectFor(operation);

            auto const thrown = perform(operation, *project, [&](SystemCall const& call) {
                return call.name == "openat" && (call.flags & O_CREAT) != 0 ? error : 0;
            });

            ASSERT_TRUE(thrown) << operation.name;
            EXPECT_THAT(thrown->file(), HasSubstr("/.projectdata/project.jsonl."));
            EXPECT_THAT(thrown->remedy(), HasSubstr("on another file system"));
            checkAfterwards(operation, *project, thrown);
        }
    }
}

TEST_F(FileSystems, aRefusedFolderIsAnErrorThatNamesItAndNothingIsLeft) {
    auto const operation = creatingOperation();
    auto const project = projectFor(operation);

    auto const thrown = perform(operation, *project,
                                [](SystemCall const& call) { return call.name == "mkdirat" ? EILSEQ : 0; });

    ASSERT_TRUE(thrown);
    EXPECT_EQ((project->root.onDisk() / ".projectdata").string(), thrown->file());
    EXPECT_TRUE(std::filesystem::is_empty(project->root.onDisk()));
    checkAfterwards(operation, *project, thrown);
}

/// Git can create names that differ from the store's only in case.
TEST_F(FileSystems, namesThatDifferInCaseBelongToOthersOnCaseSensitiveFileSystems) {
    auto const operation = creatingOperation();
    auto const project = projectFor(operation);
    project->root.addFile(".ProjectData/project.jsonl", textOf(addFiles({u"theirs"})));
    project->root.addFile(".projectdata/PROJECT.JSONL", textOf(addFiles({u"theirs"})));

    auto const thrown = perform(operation, *project, nullptr);

    EXPECT_FALSE(thrown);
    EXPECT_EQ(operation.after, contentOf(*project->open(operation.options)));
    EXPECT_TRUE(std::filesystem::exists(project->root.onDisk() / ".ProjectData/project.jsonl"));
    EXPECT_TRUE(std::filesystem::exists(project->root.onDisk() / ".projectdata/PROJECT.JSONL"));
}

} // namespace

} // namespace project::test
