#include <filesystem>
#include <fstream>
#include <sstream>

#include <sys/resource.h>
#include <sys/stat.h>
#include <unistd.h>

#include "project/stores/SystemDisk.hpp"
#include "support/ChildProcess.hpp"
#include "support/TemporaryFolder.hpp"
#include "support/TextStore.hpp"

using testing::AllOf;
using testing::EndsWith;
using testing::HasSubstr;
using testing::StartsWith;

namespace project::test {

namespace {

/// The text store on the file system, and with other processes.
class TextStoreOnDisk : public testing::Test {
protected:
    std::unique_ptr<TextBackend> open(TextBackend::Options options = {}) const {
        return std::make_unique<TextBackend>(
            stores::makeSystemDisk(root.path(), stores::TextBackend::folderName), options);
    }

    static TextBackend::Options impatient() { return {.patience = std::chrono::milliseconds(50)}; }

    static TextBackend::Options appending() {
        return {.patience = std::chrono::seconds(60), .alwaysRewritten = 0, .bodyToTail = 1};
    }

    std::filesystem::path folder() const { return root.onDisk() / ".projectdata"; }

    std::filesystem::path textPath() const { return folder() / "project.jsonl"; }

    std::string text() const {
        std::ifstream file(textPath(), std::ios::binary);
        std::ostringstream bytes;
        bytes << file.rdbuf();
        return bytes.str();
    }

    void writeText(std::string const& bytes) const { std::ofstream(textPath(), std::ios::binary) << bytes; }

    TemporaryFolder root;
};

TEST_F(TextStoreOnDisk, aProjectIsWrittenAndReadAgain) {
    auto const files = commit(*open(), addFiles(manyFiles(100)));

    EXPECT_EQ(3U, files.added.size());
    EXPECT_EQ(root.path(u".projectdata/project.jsonl"), files.added.back());
    EXPECT_EQ(contentAfter({addFiles(manyFiles(100))}), contentOf(*open()));
    EXPECT_EQ(textOf(addFiles(manyFiles(100))), text());
}

TEST_F(TextStoreOnDisk, aBodyBeyondTheLimitIsAppendedToAndTidiedOnClosing) {
    auto const many = manyFiles(20'000, u"a folder with a long name");
    commit(*open(), addFiles(many));
    auto const body = text().size();
    {
        auto const backend = open();
        commit(*backend, addFiles({u"b"}));
        commit(*backend, addFiles({u"c"}));
        EXPECT_THAT(text().substr(body), AllOf(StartsWith("\"b\"\n{\"batch\""), HasSubstr("\n\"c\"\n")));
        EXPECT_EQ(contentAfter({addFiles(many), addFiles({u"b", u"c"})}), contentOf(*open()));
    }
    EXPECT_EQ(std::string::npos, text().find("batch"));
    EXPECT_EQ(contentAfter({addFiles(many), addFiles({u"b", u"c"})}), contentOf(*open()));
}

TEST_F(TextStoreOnDisk, aChangeByAnotherProgramOfTheSameLengthRightAfterOurBatchIsNoticed) {
    commit(*open(), addFiles({u"a"}));
    auto const backend = open();
    for (int round = 0; round < 25; ++round) {
        commit(*backend, {set(fileAddress(u"b")), set(fileAddress(u"c"))});
        auto changed = text();
        changed.replace(changed.find("\"c\""), 3, "\"d\"");
        writeText(changed);

        ASSERT_EQ(contentAfter({addFiles({u"a", u"b", u"d"})}), contentOf(*backend)) << round;
        commit(*backend, {remove(fileAddress(u"b")), remove(fileAddress(u"d"))});
    }
}

TEST_F(TextStoreOnDisk, processesThatWriteAtTheSameTimeLoseNothing) {
    constexpr int batches = 40;
    commit(*open(), addFiles(manyFiles(50)));
    auto const writer = [this](std::u16string const& name) {
        return [this, name](ChildProcess::Parent const& parent) {
            auto const backend = open(appending());
            parent.await();
            for (auto const& path : manyFiles(batches, name)) {
                commit(*backend, addFiles({path}));
            }
        };
    };
    ChildProcess first(writer(u"first"));
    ChildProcess second(writer(u"second"));
    first.goOn();
    second.goOn();
    auto const reader = open(appending());
    for (int round = 0; round < 50; ++round) {
        auto const seen = contentOf(*reader); // throws if it ever sees less than a whole text
        EXPECT_GE(seen.size(), 50U);
    }

    EXPECT_TRUE(first.join());
    EXPECT_TRUE(second.join());

    auto const all = contentAfter({addFiles(manyFiles(50)), addFiles(manyFiles(batches, u"first")),
                                   addFiles(manyFiles(batches, u"second"))});
    EXPECT_EQ(all, contentOf(*open()));
    EXPECT_EQ(all, contentOf(*reader));
}

TEST_F(TextStoreOnDisk, processesThatCreateTheStoreAtTheSameTimeLoseNoCommittedBatch) {
    for (int round = 0; round < 20; ++round) {
        auto const writer = [this](std::u16string const& name) {
            return [this, name](ChildProcess::Parent const& parent) {
                auto const backend = open();
                parent.await();
                try {
                    commit(*backend, addFiles({name}));
                    parent.say("kept");
                } catch (StoreError const&) {
                    parent.say("refused");
                }
            };
        };
        ChildProcess first(writer(u"first"));
        ChildProcess second(writer(u"second"));
        first.goOn();
        second.goOn();
        std::vector<std::u16string> kept;
        if (first.hear() == "kept") {
            kept.push_back(u"first");
        }
        if (second.hear() == "kept") {
            kept.push_back(u"second");
        }

        EXPECT_FALSE(kept.empty());
        EXPECT_EQ(contentAfter({addFiles(kept)}), contentOf(*open()));
        root.remove(u".projectdata");
    }
}

TEST_F(TextStoreOnDisk, aWriterThatWaitsTooLongNamesTheHolder) {
    commit(*open(), addFiles({u"a"}));
    ChildProcess child([this](ChildProcess::Parent const& parent) {
        auto const backend = open();
        Entered const entered(*backend, Access::Write);
        parent.say("locked");
        parent.await();
    });
    ASSERT_EQ("locked", child.hear());
    auto const backend = open(impatient());

    auto const error = errorOf([&] { commit(*backend, addFiles({u"b"})); });

    EXPECT_EQ(folder().string(), error.file());
    EXPECT_EQ(StoreError::Kind::Busy, error.kind());
    EXPECT_THAT(error.problem(), StartsWith("is locked by process " + std::to_string(child.id()) + " ("));
    EXPECT_EQ(contentAfter({addFiles({u"a"})}), contentOf(*backend)) << "readers do not wait";
    child.kill();
    commit(*backend, addFiles({u"b"}));
    EXPECT_EQ(contentAfter({addFiles({u"a", u"b"})}), contentOf(*open()));
}

TEST_F(TextStoreOnDisk, aChildOfAForkCannotUseTheStoreOfItsParentAndLeavesItAlone) {
    commit(*open(), addFiles(manyFiles(50)));
    auto backend = open(appending());
    commit(*backend, addFiles({u"b"}));
    auto const tailed = text();
    ChildProcess child([&](ChildProcess::Parent const& parent) {
        parent.say(errorOf([&] { contentOf(*backend); }).remedy());
        parent.say(errorOf([&] { commit(*backend, addFiles({u"c"})); }).remedy());
        backend.reset();
        parent.say(contentOf(*open()).size() == 51 ? "its own store works" : "its own store fails");
    });

    EXPECT_EQ("Reopen the project in the child process.", child.hear());
    EXPECT_EQ("Reopen the project in the child process.", child.hear());
    EXPECT_EQ("its own store works", child.hear());
    EXPECT_TRUE(child.join());
    EXPECT_EQ(tailed, text());
}

TEST_F(TextStoreOnDisk, whenTheDiskIsFullTheErrorNamesTheFileAndNothingIsLost) {
    auto const many = manyFiles(500);
    commit(*open(), addFiles(many));
    auto const before = text();
    for (auto const& options : {TextBackend::Options(), appending()}) {
        auto const backend = open(options);
        rlimit saved{};
        ::getrlimit(RLIMIT_FSIZE, &saved);
        rlimit const limit{before.size() + 20, saved.rlim_max};
        ::setrlimit(RLIMIT_FSIZE, &limit);

        auto const error = errorOf([&] { commit(*backend, addFiles({u"a file with a longer name"})); });

        ::setrlimit(RLIMIT_FSIZE, &saved);
        EXPECT_THAT(error.file(), StartsWith(textPath().string()));
        EXPECT_EQ(StoreError::Kind::DiskFailed, error.kind());
        EXPECT_EQ(before, text().substr(0, before.size()));
        EXPECT_EQ(contentAfter({addFiles(many)}), contentOf(*backend));
        EXPECT_EQ(contentAfter({addFiles(many)}), contentOf(*open()));
        commit(*backend, {set(fileAddress(u"z"))});
        EXPECT_EQ(contentAfter({addFiles(many), addFiles({u"z"})}), contentOf(*open()));
        commit(*open(), {remove(fileAddress(u"z"))});
        EXPECT_EQ(before, text());
    }
}

TEST_F(TextStoreOnDisk, aProjectThatMayNotBeWrittenOpensForReading) {
    commit(*open(), addFiles({u"a"}));
    root.addFile(".projectdata/project.jsonl.123-0123456789abcdef.tmp");
    ::chmod(root.onDisk().c_str(), 0755);
    ::chmod(folder().c_str(), 0555);
    ::chmod(textPath().c_str(), 0444);
    auto const before = text();

    EXPECT_EQ("1", inUnprivilegedProcess([this] { return std::to_string(contentOf(*open()).size()); }));
    auto const rewritten = inUnprivilegedProcess([this] {
        commit(*open(), addFiles({u"b"}));
        return std::string("written");
    });
    auto const appended = inUnprivilegedProcess([this] {
        commit(*open(appending()), addFiles({u"b"}));
        return std::string("written");
    });

    for (auto const& answer : {rewritten, appended}) {
        EXPECT_THAT(answer,
                    AllOf(StartsWith(folder().string()), HasSubstr("Permission denied"),
                          EndsWith("Check the owner and the permissions of the file and of its folder.")));
    }
    EXPECT_EQ(before, text());
    ::chmod(folder().c_str(), 0755);
}

TEST_F(TextStoreOnDisk, aProjectThatMayNotBeReadIsAnErrorAndNotEmpty) {
    commit(*open(), addFiles({u"a"}));
    ::chmod(root.onDisk().c_str(), 0755);
    auto const read = [this] { return std::to_string(contentOf(*open()).size()); };

    ::chmod(textPath().c_str(), 0);
    EXPECT_THAT(inUnprivilegedProcess(read),
                AllOf(StartsWith(textPath().string()), HasSubstr("Permission denied")));
    ::chmod(textPath().c_str(), 0644);
    ::chmod(folder().c_str(), 0);
    EXPECT_THAT(inUnprivilegedProcess(read),
                AllOf(StartsWith(folder().string()), HasSubstr("Permission denied")));
    ::chmod(folder().c_str(), 0755);
}

TEST_F(TextStoreOnDisk, aRootWhereNoFolderMayBeCreatedIsAnErrorThatNamesTheFolder) {
    ::chmod(root.onDisk().c_str(), 0555);

    auto const answer = inUnprivilegedProcess([this] {
        commit(*open(), addFiles({u"a"}));
        return std::string("written");
    });

    ::chmod(root.onDisk().c_str(), 0755);
    EXPECT_THAT(answer, AllOf(StartsWith(folder().string()), HasSubstr("Permission denied")));
}

TEST_F(TextStoreOnDisk, nothingOutsideIsReadOrWrittenThroughALinkInAHostileClone) {
    commit(*open(), addFiles({u"a"}));
    auto const outside = root.addFile("outside.jsonl", textOf(addFiles({u"secret"})));
    auto const opened = open();
    contentOf(*opened);
    std::filesystem::remove(textPath());
    std::filesystem::create_symlink(outside, textPath());
    auto const fresh = open();

    for (auto* backend : {opened.get(), fresh.get()}) {
        EXPECT_EQ(StoreError::Kind::Damaged, errorOf([&] { contentOf(*backend); }).kind());
        EXPECT_THROW(commit(*backend, addFiles({u"b"})), StoreError);
    }
    EXPECT_TRUE(std::filesystem::is_symlink(textPath()));
}

TEST_F(TextStoreOnDisk, aPipeInThePlaceOfTheTextIsAnErrorAtOnce) {
    commit(*open(), addFiles({u"a"}));
    std::filesystem::remove(textPath());
    ASSERT_EQ(0, ::mkfifo(textPath().c_str(), 0600));

    auto const error = errorOf([&] { contentOf(*open()); });

    EXPECT_EQ(textPath().string(), error.file());
    EXPECT_EQ("is not a regular file", error.problem());
}

TEST_F(TextStoreOnDisk, aRewriteKeepsTheModeOfTheText) {
    commit(*open(), addFiles({u"a"}));
    ::chmod(textPath().c_str(), 0664);

    commit(*open(), addFiles({u"b"}));

    struct stat status {};

    ASSERT_EQ(0, ::stat(textPath().c_str(), &status));
    EXPECT_EQ(0664U, status.st_mode & 07777);
}

} // namespace

} // namespace project::test
