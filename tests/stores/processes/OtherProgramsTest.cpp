#include <chrono>
#include <fstream>
#include <functional>
#include <sstream>
#include <thread>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include "project/stores/SystemDisk.hpp"
#include "support/GitFolder.hpp"
#include "support/RunningProgram.hpp"
#include "support/TemporaryFolder.hpp"
#include "support/TextStore.hpp"
#include "support/Waiting.hpp"

using testing::HasSubstr;
using testing::IsEmpty;
using testing::UnorderedElementsAreArray;

namespace project::test {

namespace {

using namespace std::chrono_literals;
namespace filesystem = std::filesystem;

/// An older text is not compared by content: its times show every change.
constexpr auto twoTicks = 20ms;

std::vector<Address> differing(Content const& before, Content const& after) {
    std::vector<Address> result;
    for (auto const& [address, node] : before) {
        auto const found = after.find(address);
        if (found == after.end() || found->second != node) {
            result.push_back(address);
        }
    }
    for (auto const& [address, node] : after) {
        if (!before.contains(address)) {
            result.push_back(address);
        }
    }
    return result;
}

Batch setValues(std::vector<std::u16string> const& paths, std::u16string const& value) {
    Batch batch;
    for (auto const& path : paths) {
        batch.push_back(set(fileAddress(path), makeNode(u"Info", {{u"V", value}})));
    }
    return batch;
}

/// A project on disk that other programs change while a store has it open.
class OtherPrograms : public testing::Test {
protected:
    void SetUp() override {
        commit(*open(),
               addFiles(manyFiles(1500, u"a folder with some longer name, so that the text is long")));
        commit(*open(), setValues({u"x", u"y", u"z"}, u"1"));
    }

    static TextBackend::Options rewriting() {
        return {.patience = 10s, .alwaysRewritten = 1U << 20U, .bodyToTail = 16};
    }

    static TextBackend::Options appending() {
        return {.patience = 10s, .alwaysRewritten = 0, .bodyToTail = 1};
    }

    std::unique_ptr<TextBackend> open(TextBackend::Options options = rewriting()) const {
        return openIn(root.path(u"work"), options);
    }

    static std::unique_ptr<TextBackend> openIn(Path const& project,
                                               TextBackend::Options options = rewriting()) {
        return std::make_unique<TextBackend>(stores::makeSystemDisk(project, TextBackend::folderName),
                                             options);
    }

    /// Leaves a tail behind, like a process that is killed.
    void commitAndDie(std::vector<Batch> const& batches) const {
        auto const backend = open(appending());
        for (auto const& batch : batches) {
            commit(*backend, batch);
        }
        auto const tailed = text();
        backend->tidy();
        writeAnew(tailed);
    }

    filesystem::path textPath() const { return root.onDisk() / "work/.projectdata/project.jsonl"; }

    std::string text() const {
        std::ifstream file(textPath(), std::ios::binary);
        std::ostringstream bytes;
        bytes << file.rdbuf();
        return bytes.str();
    }

    std::string changedText(std::string const& from, std::string const& to) const {
        auto result = text();
        auto const at = result.find(from);
        EXPECT_NE(result.npos, at);
        return result.replace(at, from.size(), to);
    }

    /// Like an editor that overwrites the file.
    void writeInPlace(std::string const& bytes) const {
        std::ofstream(textPath(), std::ios::binary | std::ios::trunc) << bytes;
    }

    /// Like an editor or a tool that replaces the file.
    void writeAnew(std::string const& bytes) const {
        auto const beside = textPath().string() + "~";
        std::ofstream(beside, std::ios::binary) << bytes;
        filesystem::rename(beside, textPath());
    }

    void setTimes(timespec const& time) const {
        timespec const times[] = {time, time};
        ::utimensat(AT_FDCWD, textPath().c_str(), times, 0);
    }

    timespec timeOfText() const {
        struct stat status {};

        ::stat(textPath().c_str(), &status);
        return status.st_mtim;
    }

    void copy(char const* how, std::string const& to) const {
        ProgramSettings settings;
        settings.folder = root.onDisk();
        ASSERT_EQ(0, runProgram({"cp", how, "work", to}, settings).exitCode);
    }

    /// Another program makes a change, and the store reports exactly the addresses that differ.
    void expectReportedByAddress(TextBackend& store, std::function<void()> const& change) const {
        auto const before = contentOf(store);
        change();
        Entered const entered(store);
        auto const after = loadAll(store);

        EXPECT_NE(before, after);
        EXPECT_FALSE(entered.changes().everything);
        EXPECT_THAT(addressesOf(entered.changes().differences),
                    UnorderedElementsAreArray(differing(before, after)));
        EXPECT_EQ(contentOf(*open()), after);
    }

    TemporaryFolder root;
    filesystem::path const work = root.addFolder("work");
};

/// The same under git, with a branch "other".
class GitAsOtherProgram : public OtherPrograms {
protected:
    void SetUp() override {
        OtherPrograms::SetUp();
        git.commitAll();
        git.run({"switch", "-q", "-c", "other"});
        commit(*open(), setValues({u"y", u"b/new", u"b/newer"}, u"2"));
        commit(*open(), {remove(fileAddress(u"z"))});
        git.commitAll();
        git.run({"switch", "-q", "main"});
    }

    GitFolder git{work};
};

TEST_F(GitAsOtherProgram, aCheckoutIsReportedByAddress) {
    auto const store = open();
    expectReportedByAddress(*store, [this] { git.run({"checkout", "-q", "other"}); });
    expectReportedByAddress(*store, [this] { git.run({"switch", "-q", "main"}); });
    commitAndDie({setValues({u"x"}, u"3"), setValues({u"c"}, u"3")});
    git.commitAll();
    ASSERT_THAT(text(), HasSubstr("batch"));
    expectReportedByAddress(*store, [this] { git.run({"checkout", "-q", "other"}); });
    expectReportedByAddress(*store, [this] { git.run({"checkout", "-q", "main"}); });
}

TEST_F(GitAsOtherProgram, aMergeIsReportedByAddress) {
    auto const store = open();
    expectReportedByAddress(*store, [this] {
        commit(*open(), setValues({u"a/new"}, u"3"));
        git.commitAll();
        git.run({"merge", "-q", "-m", "merged", "other"});
    });
    auto const now = contentOf(*store);
    EXPECT_TRUE(now.contains(fileAddress(u"a/new")));
    EXPECT_TRUE(now.contains(fileAddress(u"b/new")));
    EXPECT_FALSE(now.contains(fileAddress(u"z")));
    expectReportedByAddress(*store, [this] { git.run({"reset", "-q", "--hard", "HEAD~1"}); });
}

TEST_F(GitAsOtherProgram, aMergeWithConflictsIsReportedByAddress) {
    auto const store = open();
    commit(*store, setValues({u"y"}, u"3"));
    git.commitAll();
    expectReportedByAddress(*store, [this] { EXPECT_NE(git.tryTo({"merge", "-q", "other"}).exitCode, 0); });
    ASSERT_THAT(text(), HasSubstr("<<<<<<<"));
    expectReportedByAddress(*store, [this] { git.run({"merge", "--abort"}); });
}

TEST_F(GitAsOtherProgram, stashingAndUnstashingAreReportedByAddress) {
    auto const store = open();
    commit(*store, setValues({u"x", u"new"}, u"3"));
    expectReportedByAddress(*store, [this] { git.run({"stash", "-q"}); });
    expectReportedByAddress(*store, [this] { git.run({"stash", "pop", "-q"}); });
    EXPECT_TRUE(contentOf(*store).contains(fileAddress(u"new")));
}

TEST_F(OtherPrograms, aTextThatGitDeletesIsAnErrorAndNotAnEmptyProject) {
    GitFolder const git(work);
    auto const store = open({.patience = 100ms, .alwaysRewritten = 1U << 20U, .bodyToTail = 16});
    auto const before = contentOf(*store);
    auto const saved = text();

    git.run({"clean", "-xdfq"});

    ASSERT_FALSE(filesystem::exists(textPath()));
    for (auto const& failing :
         {errorOf([&] { contentOf(*store); }), errorOf([&] { commit(*store, addFiles({u"new"})); })}) {
        EXPECT_EQ(textPath().string(), failing.file());
        EXPECT_EQ(StoreError::Kind::Damaged, failing.kind());
    }
    EXPECT_FALSE(filesystem::exists(textPath()));
    root.addFile("work/.projectdata/project.jsonl", saved);
    Entered const entered(*store);
    EXPECT_FALSE(entered.changes().everything);
    EXPECT_THAT(entered.changes().differences, IsEmpty());
    EXPECT_EQ(before, loadAll(*store));
}

TEST_F(OtherPrograms, anEditorThatWritesInPlaceIsReportedByAddress) {
    auto const store = open();
    expectReportedByAddress(*store, [this] { writeInPlace(changedText(R"("V":"1")", R"("V":"2")")); });
    expectReportedByAddress(*store,
                            [this] { writeInPlace(changedText(R"("V":"1")", R"("V":"a longer one")")); });
}

TEST_F(OtherPrograms, anEditorThatReplacesTheFileIsReportedByAddress) {
    auto const store = open();
    expectReportedByAddress(*store, [this] { writeAnew(changedText(R"("V":"1")", R"("V":"2")")); });
}

TEST_F(OtherPrograms, anEditorThatWritesInPiecesIsWaitedForAndReportedByAddress) {
    auto const store = open();
    std::thread editor;
    expectReportedByAddress(*store, [&] {
        auto const bytes = changedText(R"("V":"1")", R"("V":"2")");
        std::ofstream file(textPath(), std::ios::binary | std::ios::trunc);
        file.flush();
        editor = std::thread([bytes, reader = ::gettid(), writing = std::move(file)]() mutable {
            for (std::size_t at = 0; at < bytes.size(); at += bytes.size() / 10) {
                EXPECT_TRUE(
                    comesTrue([&] { return isThreadAsleep(reader); })); // it waits for more of the text
                writing << bytes.substr(at, bytes.size() / 10) << std::flush;
            }
        });
    });
    editor.join();
}

TEST_F(OtherPrograms, aTextOfTheSameLengthAndTheSameTimesIsReportedByAddress) {
    auto const store = open();
    ASSERT_TRUE(comesTrue([this] { return isOlderThan(twoTicks, textPath().c_str()); }));
    contentOf(*store);
    auto const time = timeOfText();
    expectReportedByAddress(*store,
                            [&] { // like tools that copy folders and then set the old times
                                writeAnew(changedText(R"("V":"1")", R"("V":"2")"));
                                setTimes(time);
                            });
    expectReportedByAddress(*store, [&] {
        writeInPlace(changedText(R"("V":"1")", R"("V":"2")"));
        setTimes(time);
    });
}

TEST_F(OtherPrograms, aBackupWithOldTimesIsReportedByAddress) {
    copy("-a", "backup");
    auto const store = open();
    commit(*store, setValues({u"x", u"new"}, u"2"));
    expectReportedByAddress(*store, [this] {
        ProgramSettings settings;
        settings.folder = root.onDisk();
        runProgram({"cp", "-a", "backup/.projectdata/project.jsonl", "work/.projectdata/project.jsonl"},
                   settings);
    });
    commit(*store, setValues({u"x", u"new"}, u"3"));
    expectReportedByAddress(*store, [this] {
        filesystem::rename(work / ".projectdata", root.onDisk() / "old");
        filesystem::rename(root.onDisk() / "backup/.projectdata", work / ".projectdata");
    });
}

TEST_F(OtherPrograms, aProjectAndItsCopyAreIndependent) {
    for (auto const& options : {rewriting(), appending()}) {
        for (auto const* how : {"-a", "-al"}) { // the second one creates hard links
            copy(how, "copy");
            auto const store = open(options);
            auto const before = contentOf(*store);
            auto const other = openIn(root.path(u"copy"), options);
            EXPECT_EQ(before, contentOf(*other));

            commit(*other, setValues({u"only in the copy"}, u"1"));
            EXPECT_EQ(before, contentOf(*store)) << how;
            auto const copied = contentOf(*other);
            commit(*store, setValues({u"only here"}, u"1"));

            EXPECT_EQ(copied, contentOf(*other)) << how;
            EXPECT_TRUE(contentOf(*store).contains(fileAddress(u"only here")));
            commit(*store, {remove(fileAddress(u"only here"))});
            filesystem::remove_all(root.onDisk() / "copy");
        }
    }
}

} // namespace

} // namespace project::test
