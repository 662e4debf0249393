#include <chrono>
#include <filesystem>
#include <fstream>
#include <functional>
#include <future>
#include <string>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "project/git/GitError.hpp"
#include "project/metadata/FileChangeRequestListener.hpp"
#include "project/session.hpp"
#include "project/session/ToolAccess.hpp"
#include "support/EventLog.hpp"
#include "support/GitFolder.hpp"
#include "support/ReplacementCount.hpp"
#include "support/TemporaryFolder.hpp"

namespace project::session {
namespace {

using ::testing::AllOf;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::Not;

/// A folder in a git repository with a first commit in it.
class SessionInRepository : public ::testing::Test {
protected:
    void SetUp() override { git_.run({"commit", "-q", "--allow-empty", "-m", "first"}); }

    /// The differences between the last commit, the index and the disk.
    std::string status() const { return git_.run({"status", "--porcelain", "--untracked-files=all"}); }

    std::string staged() const { return git_.run({"show", ":.projectdata/project.jsonl"}); }

    std::string onDisk() const {
        std::ifstream file(folder_.onDisk() / ".projectdata" / "project.jsonl", std::ios::binary);
        return {std::istreambuf_iterator<char>(file), {}};
    }

    static constexpr char const* storeAdded =
        "A  .projectdata/.gitattributes\nA  .projectdata/.gitignore\nA  .projectdata/project.jsonl\n";

    test::TemporaryFolder folder_;
    test::GitFolder const git_{folder_.onDisk()};
};

TEST_F(SessionInRepository, stagesTheStoresFilesOfANewProject) {
    Session::create(folder_.root(), u"Engine");

    EXPECT_EQ(status(), storeAdded);
    EXPECT_EQ(staged(), onDisk());
}

TEST_F(SessionInRepository, stagesAnAddedFileTogetherWithItsEntry) {
    auto session = Session::create(folder_.root(), u"Engine");

    session.project().getFileManager().add({folder_.file(u"src/pump.cpp")});

    EXPECT_EQ(status(), std::string(storeAdded) + "A  src/pump.cpp\n");
    EXPECT_THAT(staged(), HasSubstr("\"src/pump.cpp\"\n"));
}

TEST_F(SessionInRepository, removesARemovedFileFromTheIndexTogetherWithItsEntry) {
    auto session = Session::create(folder_.root(), u"Engine");
    session.project().getFileManager().add({folder_.file(u"src/pump.cpp")});
    git_.commitAll();

    session.project().getFileManager().remove({folder_.path(u"src")});

    EXPECT_EQ(status(), "M  .projectdata/project.jsonl\nD  src/pump.cpp\n?? src/pump.cpp\n");
    EXPECT_EQ(staged(), onDisk());
}

TEST_F(SessionInRepository, stagesAFileThatIsAddedAgainBeforeItsRemovalIsCommitted) {
    auto session = Session::create(folder_.root(), u"Engine");
    auto const file = folder_.file(u"a");
    session.project().getFileManager().add({file, folder_.file(u"b")});
    git_.commitAll();
    session.project().getFileManager().remove({file});
    ASSERT_EQ(status(), "M  .projectdata/project.jsonl\nD  a\n?? a\n");

    session.project().getFileManager().add({file});

    EXPECT_EQ(status(), "");
}

/// One change of a project, and the event that it raises.
struct Change {
    std::u16string event; ///< a line of the EventLog; empty if there is none
    std::function<void()> apply;
};

/// A project in a repository, with a change of every kind that does not stage or unstage files. Each of
/// them changes the text, if they are applied in this order.
class EveryKindOfChange : public SessionInRepository {
protected:
    void SetUp() override {
        SessionInRepository::SetUp();
        project_.getFileManager().add({file_});
        git_.commitAll();
    }

    std::vector<Change> allChanges() {
        auto changes = changesOfLabels();
        auto const add = [&changes](std::vector<Change> const& more) {
            changes.insert(changes.end(), more.begin(), more.end());
        };
        add(changesOfEntryPoints());
        add(changesOfReferences(u"pathChanged",
                                project_.getProjectPathManager().getFolderReferenceManager()));
        add(changesOfReferences(u"referencesChanged",
                                project_.getProjectReferenceManager().getFolderReferenceManager()));
        add({{u"nameChanged", [this] { project_.setName(u"Pump"); }},
             {u"", [this] { project_.setDescription(u"About it"); }},
             {u"", [this] { project_.create(u"Valve"); }}});
        return changes;
    }

    Session session_ = Session::create(folder_.root(), u"Engine");
    management::ProjectManager& project_ = session_.project();
    Path const file_ = folder_.file(u"a");

private:
    std::vector<Change> changesOfLabels() {
        management::CategoryDefinition const status(u"Status", u"s");
        management::LabelDefinition const done(u"Done", u"d");
        management::Label const label(status, done);
        auto& files = project_.getFileManager();
        auto& labels = project_.getLabelManager();
        auto const labelsChanged = u"fileLabelsChanged " + file_.native();
        return {
            {u"categoryAdded s Status", [=, &labels] { labels.createCategory(status); }},
            {u"categoryRenamed s Status", [=, &labels] { labels.renameCategory(status, u"State"); }},
            {u"labelModified s d", [=, &labels] { labels.createLabel(status, done); }},
            {labelsChanged, [=, this, &files] { files.addLabels({file_}, {label}); }},
            {labelsChanged, [=, this, &files] { files.removeLabels({file_}, {label}); }},
            {labelsChanged, [=, this, &files] { files.addLabels({file_}, {label}); }},
            {u"", [=, this, &files] { files.removeCategory({file_}, status); }},
            {u"labelModified s d", [=, &labels] { labels.deleteLabel(status, done); }},
            {u"categoryDeleted s Status", [=, &labels] { labels.deleteCategory(status); }},
        };
    }

    std::vector<Change> changesOfEntryPoints() {
        management::EntryPointGroupDefinition const group(u"Nightly", u"g");
        auto& entryPoints = project_.getEntryPointManager();
        std::u16string const event = u"entryPointsChanged";
        return {
            {event,
             [this, &entryPoints] {
                 management::EntryPointDefinition point(file_);
                 entryPoints.setEntryPoint(point);
             }},
            {event, [this, &entryPoints] { entryPoints.removeEntryPoint(file_); }},
            {event, [=, &entryPoints] { entryPoints.createEntryPointGroup(group); }},
            {event, [=, &entryPoints] { entryPoints.renameEntryPointGroup(group, u"Weekly"); }},
            {event, [=, &entryPoints] { entryPoints.deleteEntryPointGroup(group); }},
        };
    }

    std::vector<Change> changesOfReferences(std::u16string const& event,
                                            management::FolderReferenceManager& references) {
        std::vector const target{management::relativeFolderReference(folder_.root(), folder_.root())};
        return {{event, [=, &references] { references.addReferences(target); }},
                {event, [=, &references] { references.removeReferences(target); }}};
    }
};

TEST_F(EveryKindOfChange, stagesTheText) {
    auto const changes = allChanges();
    for (std::size_t index = 0; index < changes.size(); ++index) {
        auto const before = onDisk();
        changes[index].apply();
        EXPECT_NE(onDisk(), before) << index;
        EXPECT_EQ(staged(), onDisk()) << index;
    }
    EXPECT_EQ(status(), "M  .projectdata/project.jsonl\n");
}

TEST_F(EveryKindOfChange, raisesItsEvent) {
    test::EventLog log(*session_.events());
    for (auto const& change : allChanges()) {
        change.apply();
        auto const expected =
            change.event.empty() ? std::vector<std::u16string>{} : std::vector{change.event};
        EXPECT_EQ(log.take(), expected);
    }
}

TEST_F(EveryKindOfChange, isCommittedAndRaisesItsEventBeforeTheErrorIfTheTextCannotBeStaged) {
    test::EventLog log(*session_.events());
    folder_.addFile(".git/index.lock");
    auto const changes = allChanges();
    for (std::size_t index = 0; index < changes.size(); ++index) {
        auto const before = onDisk();
        EXPECT_THROW(changes[index].apply(), git::GitError) << index;
        EXPECT_NE(onDisk(), before) << index;
        auto const& event = changes[index].event;
        EXPECT_EQ(log.take(), event.empty() ? std::vector<std::u16string>{} : std::vector{event}) << index;
    }
    EXPECT_EQ(status(), " M .projectdata/project.jsonl\n");
}

TEST_F(EveryKindOfChange, stagesAndReportsNothingIfItIsRefused) {
    test::EventLog log(*session_.events());

    EXPECT_THROW(project_.getFileManager().remove({folder_.path(u"missing")}), exception::ProjectException);
    EXPECT_THROW(project_.getFileManager().add({folder_.path(u"missing")}), exception::ProjectException);

    EXPECT_THAT(log.take(), IsEmpty());
    EXPECT_EQ(status(), "");
}

TEST_F(EveryKindOfChange, reportsFilesThatAreAddedAgainEvenIfTheyCannotBeStaged) {
    project_.getFileManager().remove({file_});
    test::EventLog log(*session_.events());
    folder_.addFile(".git/index.lock");

    EXPECT_THROW(project_.getFileManager().add({file_}), git::GitError);

    EXPECT_THAT(log.take(), ElementsAre(u"fileListUpdate " + file_.native()));
    EXPECT_TRUE(project_.getFileManager().isFileInProject(file_));
}

TEST_F(EveryKindOfChange, reportsFilesThatAreRemovedEvenIfTheTextCannotBeStaged) {
    git_.run({"rm", "-q", "--cached", "a"}); // git has nothing left to remove
    test::EventLog log(*session_.events());
    folder_.addFile(".git/index.lock");

    EXPECT_THROW(project_.getFileManager().remove({file_}), git::GitError);

    EXPECT_THAT(log.take(), ElementsAre(u"fileListUpdate " + file_.native()));
    EXPECT_FALSE(project_.getFileManager().isFileInProject(file_));
}

TEST_F(SessionInRepository, throwsTheExceptionOfASlotWithTheChangeStaged) {
    auto session = Session::create(folder_.root(), u"Engine");
    session.events()->onNameChanged([] { throw std::out_of_range("a slot failed"); });

    EXPECT_THROW(session.project().setName(u"Pump"), std::out_of_range);

    EXPECT_THAT(staged(), HasSubstr("Pump"));
}

TEST_F(SessionInRepository, throwsTheErrorOfGitIfASlotThrowsAsWell) {
    auto session = Session::create(folder_.root(), u"Engine");
    session.events()->onNameChanged([] { throw std::out_of_range("a slot failed"); });
    folder_.addFile(".git/index.lock");

    EXPECT_THROW(session.project().setName(u"Pump"), git::GitError);

    EXPECT_EQ(session.project().getName(), u"Pump");
}

TEST_F(SessionInRepository, letsASlotMakeAChangeOfItsOwn) {
    auto session = Session::create(folder_.root(), u"Engine");
    test::EventLog log(*session.events());
    session.events()->onNameChanged([&] {
        session.project().getLabelManager().createCategory(management::CategoryDefinition(u"S", u"s"));
    });

    session.project().setName(u"Pump");

    EXPECT_THAT(log.take(), ElementsAre(u"nameChanged", u"categoryAdded s S"));
    EXPECT_EQ(staged(), onDisk());
}

TEST_F(SessionInRepository, callsObserversWithNoLockHeld) {
    auto session = Session::create(folder_.root(), u"Engine");
    std::future<void> other; // outlives the slot: if the lock were held, its thread would wait for it
    auto outcome = std::future_status::deferred;
    session.events()->onNameChanged([&] {
        other = std::async(std::launch::async, [&] { session.project().setDescription(u"another thread"); });
        outcome = other.wait_for(std::chrono::seconds(30));
    });

    session.project().setName(u"Pump");

    EXPECT_EQ(outcome, std::future_status::ready);
    EXPECT_EQ(session.project().getDescription(), u"another thread");
}

TEST_F(SessionInRepository, stagesBeforeItCallsObservers) {
    auto session = Session::create(folder_.root(), u"Engine");
    std::string seen;
    session.events()->onNameChanged([&] { seen = staged(); });

    session.project().setName(u"Pump");

    EXPECT_THAT(seen, HasSubstr("Pump"));
}

TEST_F(SessionInRepository, doesNotStageATextThatGitDoesNotTrack) {
    auto session = Session::create(folder_.root(), u"Engine");
    git_.run({"rm", "-q", "-r", "--cached", ".projectdata"});

    session.project().setName(u"Pump");

    EXPECT_EQ(status(),
              "?? .projectdata/.gitattributes\n?? .projectdata/.gitignore\n?? .projectdata/project.jsonl\n");
}

TEST_F(SessionInRepository, doesNotUseGitIfSourceControlIsOff) {
    auto session = Session::create(folder_.root(), u"Engine", {.sourceControl = SourceControl::Off});
    session.project().getFileManager().add({folder_.file(u"a")});
    session.stage();

    EXPECT_EQ(status(), "?? .projectdata/.gitattributes\n?? .projectdata/.gitignore\n"
                        "?? .projectdata/project.jsonl\n?? a\n");
    EXPECT_THAT(ToolAccess(session).trackedOutsideProject({folder_.root()}), IsEmpty());
}

TEST_F(SessionInRepository, stagesTheTextOnlyWhenAsked) {
    auto session = Session::create(folder_.root(), u"Engine", {.sourceControl = SourceControl::WhenAsked});
    session.project().getFileManager().add({folder_.file(u"a")});
    EXPECT_THAT(status(), AllOf(HasSubstr("A  a\n"), HasSubstr("AM .projectdata/project.jsonl\n")));

    session.stage();

    EXPECT_EQ(status(), std::string(storeAdded) + "A  a\n");
    EXPECT_EQ(staged(), onDisk());
}

TEST_F(SessionInRepository, stagesATidyText) {
    auto session = Session::create(folder_.root(), u"Engine", {.sourceControl = SourceControl::WhenAsked});
    session.project().setDescription(std::u16string(300'000, u'x')); // large enough to be appended to
    session.project().setName(u"Pump");
    EXPECT_EQ(onDisk().find("{\"end\":\"project-definition\"}"),
              onDisk().rfind("{\"end\":\"project-definition\"}"));
    EXPECT_THAT(onDisk(), Not(::testing::EndsWith("{\"end\":\"project-definition\"}\n")));

    session.stage();

    EXPECT_EQ(staged(), onDisk());
    EXPECT_THAT(staged(), ::testing::EndsWith("{\"end\":\"project-definition\"}\n"));
}

TEST_F(SessionInRepository, rollsAnAddBackIfTheIndexIsLocked) {
    auto session = Session::create(folder_.root(), u"Engine");
    auto const file = folder_.file(u"a");
    folder_.addFile(".git/index.lock");

    try {
        session.project().getFileManager().add({file});
        FAIL() << "no error";
    } catch (git::GitError const& error) {
        EXPECT_THAT(error.what(), HasSubstr("index.lock"));
    }
    EXPECT_FALSE(session.project().getFileManager().isFileInProject(file));

    std::filesystem::remove(folder_.onDisk() / ".git" / "index.lock");
    session.project().getFileManager().add({file});
    EXPECT_EQ(status(), std::string(storeAdded) + "A  a\n");
}

TEST_F(SessionInRepository, writesGitsIndexOnceForEachChange) {
    auto session = Session::create(folder_.root(), u"Engine");
    auto& files = session.project().getFileManager();
    auto const file = folder_.file(u"a");
    test::ReplacementCount const replaced(folder_.onDisk() / ".git");
    files.add({file, folder_.file(u"b")});
    EXPECT_EQ(replaced.of("index"), 1);
    files.remove({file});
    EXPECT_EQ(replaced.of("index"), 1);
    session.project().setName(u"Pump");
    EXPECT_EQ(replaced.of("index"), 1);
}

/// A listener that is notified after the one of source control.
class LaterListener : public metadata::FileChangeRequestListener {
public:
    explicit LaterListener(std::function<void()> action) : action_(std::move(action)) {}

    void fileRemovalRequested(metadata::MetadataManager& /*store*/, Path const& /*metadataRoot*/,
                              std::vector<Path> const& /*files*/) override {}

    void fileAdditionRequested(metadata::MetadataManager& /*store*/,
                               std::vector<Path> const& /*files*/) override {
        std::exchange(action_, [] {})();
    }

    bool acceptsFileChangeRequests() override { return true; }

private:
    std::function<void()> action_;
};

TEST_F(SessionInRepository, leavesGitsIndexUnchangedAndUnlockedIfAnotherListenerRefusesTheChange) {
    auto session = Session::create(folder_.root(), u"Engine");
    git_.commitAll();
    auto const file = folder_.file(u"a");
    auto const refusal = std::make_shared<LaterListener>([] { throw std::out_of_range("refused"); });
    session.project().subscribe(refusal);

    EXPECT_THROW(session.project().getFileManager().add({file}), std::out_of_range);

    EXPECT_FALSE(session.project().getFileManager().isFileInProject(file));
    EXPECT_EQ(status(), "?? a\n");
    EXPECT_FALSE(std::filesystem::exists(folder_.onDisk() / ".git" / "index.lock"));
    session.project().getFileManager().add({file});
    EXPECT_EQ(status(), "M  .projectdata/project.jsonl\nA  a\n");
}

TEST_F(SessionInRepository, doesNotLetGitTakeTheLockOfTheIndexUntilTheTextIsStaged) {
    auto session = Session::create(folder_.root(), u"Engine");
    auto const other = folder_.file(u"other");
    auto const git = std::make_shared<LaterListener>([this] {
        EXPECT_THROW(git_.run({"add", "other"}), std::runtime_error);
    });
    session.project().subscribe(git);

    session.project().getFileManager().add({folder_.file(u"a")});

    EXPECT_EQ(status(), std::string(storeAdded) + "A  a\n?? other\n");
    EXPECT_EQ(staged(), onDisk());
}

TEST_F(SessionInRepository, stagesATextThatCouldNotBeStagedWithTheNextChange) {
    auto session = Session::create(folder_.root(), u"Engine");
    folder_.addFile(".git/index.lock");

    EXPECT_THROW(session.project().setName(u"Pump"), git::GitError);
    EXPECT_EQ(session.project().getName(), u"Pump");

    std::filesystem::remove(folder_.onDisk() / ".git" / "index.lock");
    session.project().setDescription(u"About it");
    EXPECT_THAT(staged(), AllOf(HasSubstr("Pump"), HasSubstr("About it")));
}

TEST_F(SessionInRepository, findsTrackedFilesThatAreNotInTheProject) {
    auto session = Session::create(folder_.root(), u"Engine");
    auto const inProject = folder_.file(u"src/a");
    auto const tracked = folder_.file(u"src/b");
    auto const elsewhere = folder_.file(u"other/c");
    session.project().getFileManager().add({inProject});
    git_.commitAll();

    EXPECT_THAT(ToolAccess(session).trackedOutsideProject({folder_.path(u"src")}), ElementsAre(tracked));
    EXPECT_THAT(ToolAccess(session).trackedOutsideProject({inProject, elsewhere}), IsEmpty());
}

TEST_F(SessionInRepository, stagesATextThatIsMarkedForStaging) {
    auto session = Session::create(folder_.root(), u"Engine", {.sourceControl = SourceControl::WhenAsked});
    session.stage();
    auto unaware = Session::open(folder_.root(), {.sourceControl = SourceControl::Off});
    unaware.project().setName(u"Pump");
    session.stage();
    ASSERT_THAT(staged(), Not(HasSubstr("Pump")));

    ToolAccess(session).markTextForStaging();
    session.stage();

    EXPECT_THAT(staged(), HasSubstr("Pump"));
}

TEST_F(SessionInRepository, stagesFilesThatAreAddedAgainWhenAsked) {
    auto session = Session::create(folder_.root(), u"Engine", {.sourceControl = SourceControl::WhenAsked});
    auto const file = folder_.file(u"a");
    session.project().getFileManager().add({file});
    session.stage();
    git_.commitAll();
    session.project().getFileManager().remove({file});
    session.project().getFileManager().add({file});
    ASSERT_THAT(status(), HasSubstr("D  a\n"));

    ToolAccess(session).stageReturned({file});

    EXPECT_EQ(status(), "");
}

TEST_F(SessionInRepository, marksAndStagesNothingIfSourceControlIsOff) {
    auto session = Session::create(folder_.root(), u"Engine", {.sourceControl = SourceControl::Off});

    ToolAccess(session).markTextForStaging();
    ToolAccess(session).stageReturned({folder_.file(u"a")});
    session.stage();

    EXPECT_EQ(git_.run({"ls-files"}), "");
}

TEST_F(SessionInRepository, worksInAFolderBelowTheTopOfTheRepository) {
    folder_.addFolder("engine");
    auto session = Session::create(folder_.root() / u"engine", u"Engine");

    session.project().getFileManager().add({folder_.file(u"engine/src/pump.cpp")});

    EXPECT_EQ(status(), "A  engine/.projectdata/.gitattributes\nA  engine/.projectdata/.gitignore\n"
                        "A  engine/.projectdata/project.jsonl\nA  engine/src/pump.cpp\n");
}

TEST(SessionOutsideAnyRepository, worksWithoutGit) {
    test::TemporaryFolder const folder;
    auto session = Session::create(folder.root(), u"Engine");

    session.project().getFileManager().add({folder.file(u"a")});
    session.stage();

    EXPECT_TRUE(session.project().getFileManager().isFileInProject(folder.path(u"a")));
    EXPECT_THAT(ToolAccess(session).trackedOutsideProject({folder.root()}), IsEmpty());
}

} // namespace
} // namespace project::session
