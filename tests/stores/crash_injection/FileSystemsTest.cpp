#include <cerrno>
#include <cstdio>
#include <filesystem>
#include <set>

#include <fcntl.h>

#include "SystemFaults.hpp"

using testing::HasSubstr;

namespace project::test {

namespace {

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
