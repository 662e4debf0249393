#include "project/session/Transaction.hpp"

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <string>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "project/git/GitError.hpp"
#include "project/session.hpp"
#include "project/stores/StoreError.hpp"
#include "support/EventLog.hpp"
#include "support/GitFolder.hpp"
#include "support/TemporaryFolder.hpp"

namespace project::session {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

/// A project in a git repository, whose files are committed.
class TransactionOfASession : public ::testing::TestWithParam<SourceControl> {
protected:
    void SetUp() override {
        project_.getFileManager().add({tracked_});
        session_.stage();
        git_.commitAll();
        folder_.file(u"new.cpp");
    }

    management::FileManager& files() { return project_.getFileManager(); }

    bool isInProject(Path const& file) { return files().isFileInProject(file); }

    /// The differences between the last commit and the index.
    std::string staged() const { return git_.run({"diff", "--cached", "--name-status"}); }

    std::string text() const {
        std::ifstream file(folder_.onDisk() / ".projectdata" / "project.jsonl", std::ios::binary);
        return {std::istreambuf_iterator<char>(file), {}};
    }

    /// The first word of each line: the event without its arguments.
    static std::vector<std::u16string> namesOf(std::vector<std::u16string> lines) {
        for (auto& line : lines) {
            line.erase(std::min(line.find(u' '), line.size()));
        }
        return lines;
    }

    /// The differences of files other than the text.
    std::string stagedFiles() const {
        auto result = staged();
        if (auto const found = result.find("M\t.projectdata/project.jsonl\n"); found != std::string::npos) {
            result.erase(found, std::string("M\t.projectdata/project.jsonl\n").size());
        }
        return result;
    }

    test::TemporaryFolder folder_;
    test::GitFolder const git_{folder_.onDisk()};
    Session session_ = [this] {
        git_.run({"commit", "-q", "--allow-empty", "-m", "first"});
        return Session::create(folder_.root(), u"Engine", {.sourceControl = GetParam()});
    }();
    management::ProjectManager& project_ = session_.project();
    Path const tracked_ = folder_.file(u"src/tracked.cpp");
    Path const new_ = folder_.path(u"new.cpp"); ///< git does not know it
};

TEST_P(TransactionOfASession, commitsTheChangesAsOneWriteAndRaisesTheirEventsInOrder) {
    test::EventLog log(*session_.events());
    management::CategoryDefinition const status(u"Status", u"s");
    management::LabelDefinition const done(u"Done", u"d");
    auto const before = text();

    auto transaction = session_.transaction();
    project_.getLabelManager().createCategory(status);
    project_.getLabelManager().createLabel(status, done);
    files().add({new_});
    files().addLabels({new_}, {management::Label(status, done)});
    EXPECT_THAT(log.take(), IsEmpty());
    EXPECT_EQ(before, text());
    EXPECT_EQ("", staged());
    transaction.commit();

    EXPECT_THAT(namesOf(log.take()),
                ElementsAre(u"categoryAdded", u"labelModified", u"fileListUpdate", u"fileLabelsChanged"));
    EXPECT_EQ(1U, files().getLabels(new_).size());
    EXPECT_EQ("A\tnew.cpp\n", stagedFiles());
}

TEST_P(TransactionOfASession, leftWithoutACommitChangesNothing) {
    test::EventLog log(*session_.events());
    auto const before = text();
    {
        auto const transaction = session_.transaction();
        project_.setName(u"Pump");
        files().remove({tracked_});
        files().add({new_});
        EXPECT_EQ(u"Pump", project_.getName());
    }
    EXPECT_EQ(u"Engine", project_.getName());
    EXPECT_TRUE(isInProject(tracked_));
    EXPECT_FALSE(isInProject(new_));
    EXPECT_EQ(before, text());
    EXPECT_THAT(log.take(), IsEmpty());

    project_.setName(u"Valve"); // git does not get the files of the transaction with the next write either
    EXPECT_EQ("", stagedFiles());
}

TEST_P(TransactionOfASession, rollsBackAnOperationThatThrowsAloneAndContinues) {
    test::EventLog log(*session_.events());
    auto const other = folder_.file(u"other.cpp");
    auto transaction = session_.transaction();
    files().add({new_});
    EXPECT_ANY_THROW(files().add({other, folder_.path(u"missing.cpp")}));
    EXPECT_ANY_THROW(files().remove({tracked_, folder_.path(u"../outside")}));
    transaction.commit();

    EXPECT_TRUE(isInProject(new_));
    EXPECT_FALSE(isInProject(other));
    EXPECT_EQ("A\tnew.cpp\n", stagedFiles());
    EXPECT_EQ(1U, log.take().size());
}

TEST_P(TransactionOfASession, doesNotPassAFileToGitThatWasAddedAndRemovedAgain) {
    auto transaction = session_.transaction();
    files().add({new_});
    files().remove({new_});
    transaction.commit();
    EXPECT_EQ("", stagedFiles());
}

TEST_P(TransactionOfASession, keepsAFileInGitThatWasRemovedAndAddedAgain) {
    auto transaction = session_.transaction();
    files().remove({tracked_});
    files().add({tracked_});
    transaction.commit();
    EXPECT_TRUE(isInProject(tracked_));
    EXPECT_EQ("", stagedFiles());
}

TEST_P(TransactionOfASession, passesAFolderToGitAsItIsInTheEnd) {
    auto const other = folder_.file(u"src/other.cpp");
    files().add({other});
    session_.stage();
    git_.commitAll();

    auto transaction = session_.transaction();
    files().remove({folder_.path(u"src")});
    files().add({tracked_});
    transaction.commit();

    EXPECT_FALSE(isInProject(other));
    if (GetParam() == SourceControl::EachChange) {
        EXPECT_EQ("D\tsrc/other.cpp\n", stagedFiles());
    } else {
        EXPECT_EQ("D\tsrc/other.cpp\nD\tsrc/tracked.cpp\n", stagedFiles()); // staged again when asked
    }
}

TEST_P(TransactionOfASession, joinsTheOuterOneIfItIsNested) {
    test::EventLog log(*session_.events());
    auto outer = session_.transaction();
    {
        auto inner = session_.transaction();
        project_.setName(u"Pump");
        inner.commit();
    }
    {
        auto const inner = session_.transaction();
        project_.setName(u"Valve");
        files().add({new_});
    }
    EXPECT_EQ(u"Pump", project_.getName());
    EXPECT_THAT(log.take(), IsEmpty());
    outer.commit();
    EXPECT_EQ(u"Pump", project_.getName());
    EXPECT_THAT(log.take(), ElementsAre(u"nameChanged"));
    EXPECT_EQ("", stagedFiles());
}

TEST_P(TransactionOfASession, callsObserversWithNoLockHeldSoThatTheyCanBeginOne) {
    session_.events()->onNameChanged([this] {
        auto transaction = session_.transaction();
        project_.setDescription(u"renamed");
        transaction.commit();
    });
    auto transaction = session_.transaction();
    project_.setName(u"Pump");
    transaction.commit();
    EXPECT_EQ(u"renamed", project_.getDescription());
}

TEST_P(TransactionOfASession, isRolledBackIfGitsIndexIsLocked) {
    test::EventLog log(*session_.events());
    auto const before = text();
    auto const lock = folder_.onDisk() / ".git" / "index.lock";
    auto transaction = session_.transaction();
    project_.setName(u"Pump");
    files().add({new_});
    std::ofstream(lock).close();
    EXPECT_THROW(transaction.commit(), git::GitError);
    std::filesystem::remove(lock);

    EXPECT_EQ(u"Engine", project_.getName());
    EXPECT_EQ(before, text());
    EXPECT_THAT(log.take(), IsEmpty());
    project_.setName(u"Valve");
    EXPECT_EQ("", stagedFiles());
}

TEST_P(TransactionOfASession, cannotBeCommittedAfterItHasEndedOrBeforeANestedOne) {
    auto outer = session_.transaction();
    project_.setName(u"Pump");
    {
        auto const inner = session_.transaction();
        EXPECT_THROW(outer.commit(), std::logic_error);
    }
    auto moved = std::move(outer);
    EXPECT_THROW(outer.commit(), std::logic_error); // NOLINT(bugprone-use-after-move): that is the question
    moved.commit();
    EXPECT_THROW(moved.commit(), std::logic_error);
    EXPECT_EQ(u"Pump", project_.getName());
}

TEST_P(TransactionOfASession, ofManyOperationsIsOneAppendToTheText) {
    auto transaction = session_.transaction();
    for (char16_t name = u'a'; name <= u'z'; ++name) {
        files().add({folder_.file(std::u16string(u"many/") + name)});
    }
    transaction.commit();
    EXPECT_EQ(26U, files().getProjectFiles().size() - 3); // with src, src/tracked.cpp and many
    if (GetParam() == SourceControl::EachChange) {
        EXPECT_EQ(text(), git_.run({"show", ":.projectdata/project.jsonl"}));
    }
    auto const guard = session_.store().acquireReadLock();
    EXPECT_TRUE(isInProject(folder_.path(u"many/z")));
}

INSTANTIATE_TEST_SUITE_P(Modes, TransactionOfASession,
                         ::testing::Values(SourceControl::EachChange, SourceControl::WhenAsked),
                         [](auto const& mode) {
                             return mode.param == SourceControl::EachChange ? "EachChange" : "WhenAsked";
                         });

TEST(TransactionWithoutSourceControl, commitsAndRollsBack) {
    test::TemporaryFolder const folder;
    auto session = Session::create(folder.root(), u"Engine", {.sourceControl = SourceControl::Off});
    auto const file = folder.file(u"a");
    {
        auto const transaction = session.transaction();
        session.project().getFileManager().add({file});
    }
    EXPECT_FALSE(session.project().getFileManager().isFileInProject(file));
    auto transaction = session.transaction();
    session.project().getFileManager().add({file});
    transaction.commit();
    EXPECT_TRUE(session.project().getFileManager().isFileInProject(file));
}

} // namespace
} // namespace project::session
