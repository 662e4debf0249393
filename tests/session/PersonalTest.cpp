#include "project/session/Personal.hpp"

#include <csignal>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>
#include <thread>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "project/files/LabelIDSet.hpp"
#include "project/metadata/FileChangeRequestListener.hpp"
#include "project/session.hpp"
#include "project/session/ToolAccess.hpp"
#include "project/stores/StoreError.hpp"
#include "project/stores/TextBackend.hpp"
#include "project/stores/TreeMetadataManager.hpp"
#include "support/ChildProcess.hpp"
#include "support/EventLog.hpp"
#include "support/GitFolder.hpp"
#include "support/TemporaryFolder.hpp"

namespace project::session {
namespace {

using management::CategoryDefinition;
using management::FileManager;
using management::Label;
using management::LabelDefinition;
using management::LabelManager;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::Not;

std::string contentOf(std::filesystem::path const& path) {
    std::ifstream file(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), {}};
}

/// A committed project of three files in a git repository, and a session that has a personal label.
class PersonalLayer : public ::testing::Test {
protected:
    PersonalLayer() {
        projectFiles().add({engine_, pump_, valve_});
        git_.commitAll();
    }

    FileManager& projectFiles() { return session_.project().getFileManager(); }

    FileManager& files() { return session_.personal().getFileManager(); }

    LabelManager& labels() { return session_.personal().getLabelManager(); }

    Label label() const { return Label(mine_, later_); }

    /// Defines the label and puts it on files.
    void put(std::vector<Path> const& on) {
        labels().createCategory(mine_);
        labels().createLabel(mine_, later_);
        files().addLabels(on, {label()});
    }

    bool isLabelled(Session& session, Path const& file) {
        return !session.personal().getFileManager().getLabelIDSets(file).empty();
    }

    bool isLabelled(Path const& file) { return isLabelled(session_, file); }

    /// The labelled files as another program finds them on disk.
    std::vector<FoundFile> foundByOthers() {
        return Session::open(folder_.root()).find({.labels = {{u"mine", u"later"}}});
    }

    std::filesystem::path store() const { return folder_.onDisk() / ".projectdata"; }

    std::string personalText() const { return contentOf(store() / "local" / "project.jsonl"); }

    std::string projectText() const { return contentOf(store() / "project.jsonl"); }

    std::string status() const { return git_.run({"status", "--porcelain", "--untracked-files=all"}); }

    test::TemporaryFolder folder_;
    test::GitFolder const git_{folder_.onDisk()};
    Session session_ = [this] {
        git_.run({"commit", "-q", "--allow-empty", "-m", "first"});
        return Session::create(folder_.root(), u"Engine");
    }();
    Path const engine_ = folder_.file(u"src/engine.cpp");
    Path const pump_ = folder_.file(u"src/io/pump.cpp");
    Path const valve_ = folder_.file(u"valve.cpp");
    CategoryDefinition mine_ = CategoryDefinition(u"Mine", u"mine");
    LabelDefinition later_ = LabelDefinition(u"Later", u"later");
};

TEST_F(PersonalLayer, createsNothingBeforeItsFirstChange) {
    EXPECT_THAT(labels().getAllCategories(), IsEmpty());
    EXPECT_THAT(files().getLabels(engine_), IsEmpty());
    EXPECT_THAT(session_.find({.isUnlabelled = true}), Not(IsEmpty()));
    session_.refresh();
    projectFiles().remove({valve_});

    EXPECT_FALSE(std::filesystem::exists(store() / "local"));
}

TEST_F(PersonalLayer, isStoredInATextOfItsOwnWithTheFormatOfAProject) {
    auto const before = projectText();
    put({engine_});

    EXPECT_EQ(before, projectText());
    EXPECT_THAT(personalText(), HasSubstr("src/engine.cpp"));
    EXPECT_EQ(personalText().substr(0, before.find('\n')), before.substr(0, before.find('\n')));
    EXPECT_TRUE(isLabelled(engine_));
    EXPECT_THAT(projectFiles().getLabels(engine_), IsEmpty());
}

TEST_F(PersonalLayer, isKeptForTheNextSession) {
    put({engine_});
    auto next = Session::open(folder_.root());

    EXPECT_TRUE(isLabelled(next, engine_));
    EXPECT_EQ(u"Later",
              next.personal().getFileManager().getLabels(engine_).at(0).getLabelIdentifier().getName());
}

TEST_F(PersonalLayer, isNeverStaged) {
    put({engine_});
    session_.stage();
    git_.run({"add", "-A"});

    EXPECT_EQ("", status());
    EXPECT_THAT(git_.run({"ls-files"}), Not(HasSubstr("local")));
}

TEST_F(PersonalLayer, isNotStagedByATransactionThatChangesTheProjectToo) {
    auto transaction = session_.transaction();
    put({engine_});
    projectFiles().add({folder_.file(u"new.cpp")});
    transaction.commit();

    EXPECT_EQ("M  .projectdata/project.jsonl\nA  new.cpp\n", status());
    EXPECT_TRUE(isLabelled(engine_));
}

TEST_F(PersonalLayer, isIgnoredByTheFileOfANewProject) {
    EXPECT_THAT(contentOf(store() / ".gitignore"), HasSubstr("\n/local/\n"));
}

TEST_F(PersonalLayer, extendsTheIgnoreFileOfAnOlderProjectOnFirstUseOnly) {
    folder_.addFile(".projectdata/.gitignore", "# ours\n/project.jsonl.*.tmp\n*.bak");
    git_.commitAll();

    put({engine_});
    EXPECT_EQ("# ours\n/project.jsonl.*.tmp\n*.bak\n/local/\n", contentOf(store() / ".gitignore"));
    EXPECT_EQ(" M .projectdata/.gitignore\n", status());

    git_.run({"checkout", "-q", ".projectdata/.gitignore"});
    files().addLabels({valve_}, {label()});
    EXPECT_EQ("", status()); // the folder itself says that it is ignored
}

TEST_F(PersonalLayer, staysOutOfGitWhereAnOldVersionWithoutTheLineIsCheckedOut) {
    folder_.addFile(".projectdata/.gitignore", "/project.jsonl.*.tmp\n");
    git_.commitAll();
    git_.run({"branch", "old"});
    put({engine_});
    git_.commitAll();

    git_.run({"checkout", "-q", "old"});

    EXPECT_EQ("", status());
    git_.run({"add", "-A"});
    EXPECT_EQ("", status());
    EXPECT_TRUE(isLabelled(engine_));
}

TEST_F(PersonalLayer, changesNothingIfTheIgnoreFileCannotBeExtended) {
    std::filesystem::remove(store() / ".gitignore");
    std::filesystem::create_directory(store() / ".gitignore");

    EXPECT_THROW(labels().createCategory(mine_), stores::StoreError);

    EXPECT_FALSE(std::filesystem::exists(store() / "local"));
    EXPECT_THAT(labels().getAllCategories(), IsEmpty());
}

TEST_F(PersonalLayer, putsLabelsOnFilesOfTheProjectOnly) {
    auto const stranger = folder_.file(u"stranger.cpp");
    put({engine_, stranger});

    EXPECT_THAT(personalText(), Not(HasSubstr("stranger")));
    EXPECT_THROW(files().getLabels(stranger), exception::ProjectException);
    EXPECT_THROW(files().removeLabels({stranger}, {label()}), exception::ProjectException);
    EXPECT_THROW(files().addLabels({folder_.root()}, {label()}), exception::ProjectException);
}

TEST_F(PersonalLayer, canLabelAFileThatIsMissingOnDisk) {
    folder_.remove(u"src/engine.cpp");
    put({engine_});

    EXPECT_TRUE(isLabelled(engine_));
}

TEST_F(PersonalLayer, keepsOnlyFilesThatHaveLabels) {
    put({engine_, pump_});
    files().removeLabels({engine_, valve_}, {label()});
    EXPECT_THAT(personalText(), Not(HasSubstr("engine")));
    EXPECT_THAT(personalText(), HasSubstr("src/io/pump.cpp"));

    labels().deleteCategory(mine_);
    EXPECT_THAT(personalText(), Not(HasSubstr("src")));
}

TEST_F(PersonalLayer, removesALabelThatIsDeletedFromItsFiles) {
    put({engine_, pump_});
    labels().deleteLabel(mine_, later_);

    EXPECT_FALSE(isLabelled(engine_));
    EXPECT_THAT(personalText(), Not(HasSubstr("src")));
    EXPECT_EQ(1U, labels().getAllCategories().size());
}

TEST_F(PersonalLayer, removesACategoryFromFiles) {
    put({engine_, pump_});
    files().removeCategory({engine_, valve_}, mine_);

    EXPECT_FALSE(isLabelled(engine_));
    EXPECT_TRUE(isLabelled(pump_));
}

TEST_F(PersonalLayer, replacesTheLabelOfASingleValuedCategory) {
    mine_.setIsSingleValued(true);
    put({engine_});
    LabelDefinition const now(u"Now", u"now");
    labels().createLabel(mine_, now);

    auto const replaced = files().addLabels({engine_}, {Label(mine_, now)});

    ASSERT_EQ(1U, replaced.size());
    EXPECT_EQ(u"later", replaced[0].getUUID());
    EXPECT_EQ(1U, files().getLabelIDSets(engine_).size());
}

TEST_F(PersonalLayer, acceptsTheNamesOfTheProject) {
    session_.project().getLabelManager().createCategory(CategoryDefinition(u"Mine", u"ours"));
    put({engine_});

    EXPECT_EQ(u"ours", session_.project().getLabelManager().getAllCategories().at(0).getUUID());
    EXPECT_EQ(u"mine", labels().getAllCategories().at(0).getUUID());
}

TEST_F(PersonalLayer, isSearchedTogetherWithTheProject) {
    CategoryDefinition const status(u"Status", u"status");
    LabelDefinition const done(u"Done", u"done");
    session_.project().getLabelManager().createCategory(status);
    session_.project().getLabelManager().createLabel(status, done);
    projectFiles().addLabels({engine_, valve_}, {Label(status, done)});
    put({engine_, pump_});
    LabelChoice const isDone{u"status", u"done"};
    LabelChoice const isMine{u"mine", {}};
    auto const found = [this](Query query) {
        query.kind = FileKind::File;
        std::vector<Path> result;
        for (auto const& file : session_.find(query)) {
            result.push_back(file.path);
        }
        return result;
    };

    EXPECT_THAT(found({.labels = {isMine}}), ElementsAre(engine_, pump_));
    EXPECT_THAT(found({.labels = {isMine, isDone}}), ElementsAre(engine_));
    EXPECT_THAT(found({.absentLabels = {isMine}}), ElementsAre(valve_));
    EXPECT_THAT(found({.isUnlabelled = true}), IsEmpty());
    EXPECT_THAT(found({.isUnlabelled = true, .layers = Layers::Project}), ElementsAre(pump_));
    EXPECT_THAT(found({.isUnlabelled = true, .layers = Layers::Personal}), ElementsAre(valve_));
    EXPECT_THAT(found({.labels = {isMine}, .layers = Layers::Project}), IsEmpty());
    EXPECT_THAT(found({.labels = {isDone}, .layers = Layers::Personal}), IsEmpty());
}

TEST_F(PersonalLayer, losesTheLabelsOfAFileThatIsRemovedFromTheProject) {
    put({engine_, valve_});
    projectFiles().remove({valve_});
    EXPECT_THAT(personalText(), Not(HasSubstr("valve")));

    projectFiles().remove({folder_.path(u"src")});
    EXPECT_THAT(personalText(), Not(HasSubstr("src")));

    projectFiles().add({engine_, valve_});
    EXPECT_FALSE(isLabelled(engine_));
    EXPECT_FALSE(isLabelled(valve_));
    EXPECT_EQ(1U, labels().getAllCategories().size());
}

TEST_F(PersonalLayer, keepsTheLabelsOfAFileWhoseRemovalIsRolledBack) {
    put({engine_});
    auto const before = personalText();
    {
        auto const transaction = session_.transaction();
        projectFiles().remove({engine_});
    }
    EXPECT_TRUE(isLabelled(engine_));
    EXPECT_EQ(before, personalText());
}

TEST_F(PersonalLayer, keepsTheLabelsOfAFileWhoseRemovalIsRefused) {
    put({engine_});

    EXPECT_THROW(projectFiles().remove({engine_, folder_.path(u"unknown")}), exception::ProjectException);

    EXPECT_TRUE(isLabelled(engine_));
}

TEST_F(PersonalLayer, keepsTheLabelsOfAFileThatIsAddedAgain) {
    put({engine_});
    projectFiles().add({engine_});

    EXPECT_TRUE(isLabelled(engine_));
}

TEST_F(PersonalLayer, hidesLabelsWhileAnotherBranchIsCheckedOut) {
    git_.run({"branch", "before"});
    auto const fresh = folder_.file(u"fresh.cpp");
    projectFiles().add({fresh});
    git_.commitAll();
    put({fresh, engine_});

    git_.run({"checkout", "-q", "before"});
    EXPECT_THROW(files().getLabels(fresh), exception::ProjectException);
    EXPECT_THAT(session_.find({.labels = {{u"mine", {}}}}), ElementsAre(FoundFile{engine_, FileKind::File}));
    EXPECT_THAT(session_.personal().hiddenFiles(), ElementsAre(fresh));

    git_.run({"checkout", "-q", "main"});
    EXPECT_TRUE(isLabelled(fresh));
    EXPECT_THAT(session_.personal().hiddenFiles(), IsEmpty());
}

TEST_F(PersonalLayer, letsHiddenLabelsFollowAMoveOfAnotherPerson) {
    put({valve_, engine_, pump_});
    auto text = projectText();
    text.replace(text.find("\"valve.cpp\"\n"), std::string("\"valve.cpp\"\n").size(), "\"vent.cpp\"\n");
    folder_.addFile(".projectdata/project.jsonl", text);
    auto const vent = folder_.path(u"vent.cpp");
    test::EventLog log(*session_.personal().events());

    auto const followed = session_.personal().followHidden({{valve_, vent}});

    EXPECT_EQ(followed, (std::vector<Move>{{valve_, vent}}));
    EXPECT_TRUE(isLabelled(vent));
    EXPECT_THAT(session_.personal().hiddenFiles(), IsEmpty());
    EXPECT_THAT(log.take(), ElementsAre(u"metadataChange"));
}

TEST_F(PersonalLayer, leavesHiddenLabelsWhereTheyCannotFollow) {
    put({valve_, engine_});
    auto text = projectText();
    text.erase(text.find("\"valve.cpp\"\n"), std::string("\"valve.cpp\"\n").size());
    folder_.addFile(".projectdata/project.jsonl", text);

    EXPECT_THAT(session_.personal().followHidden({{valve_, engine_}}), IsEmpty()) << "it has labels";
    EXPECT_THAT(session_.personal().followHidden({{valve_, folder_.path(u"none")}}), IsEmpty());
    EXPECT_THAT(session_.personal().followHidden({{engine_, pump_}}), IsEmpty()) << "it is not hidden";

    EXPECT_THAT(session_.personal().hiddenFiles(), ElementsAre(valve_));
    EXPECT_TRUE(isLabelled(engine_));
}

TEST_F(PersonalLayer, deletesHiddenLabelsOnRequest) {
    put({valve_, engine_});
    auto text = projectText();
    text.erase(text.find("\"valve.cpp\"\n"), std::string("\"valve.cpp\"\n").size());
    folder_.addFile(".projectdata/project.jsonl", text);

    EXPECT_THAT(session_.personal().removeHidden(), ElementsAre(valve_));

    EXPECT_THAT(personalText(), Not(HasSubstr("valve")));
    EXPECT_TRUE(isLabelled(engine_));
    EXPECT_THAT(session_.personal().removeHidden(), IsEmpty());
}

TEST_F(PersonalLayer, raisesEventsOfItsOwn) {
    test::EventLog shared(*session_.events());
    test::EventLog personal(*session_.personal().events());

    put({engine_});

    EXPECT_THAT(shared.take(), IsEmpty());
    EXPECT_THAT(personal.take(), ElementsAre(u"categoryAdded mine Mine", u"labelModified mine later",
                                             u"fileLabelsChanged " + engine_.native()));
    labels().renameCategory(mine_, u"Own");
    files().removeLabels({engine_}, {label()});
    labels().deleteLabel(mine_, later_);
    labels().deleteCategory(mine_);
    EXPECT_THAT(personal.take(),
                ElementsAre(u"categoryRenamed mine Mine", u"fileLabelsChanged " + engine_.native(),
                            u"labelModified mine later", u"categoryDeleted mine Mine"));
    EXPECT_THAT(shared.take(), IsEmpty());
}

TEST_F(PersonalLayer, callsObserversWithNoLockHeld) {
    bool hasWritten = false;
    session_.personal().events()->onCategoryAdded([&](management::CategoryIdentifier const&) {
        std::thread([&] { // another thread can change both layers
            session_.project().setName(u"Pump");
            labels().createLabel(mine_, later_);
            hasWritten = true;
        })
            .join();
    });

    labels().createCategory(mine_);

    EXPECT_TRUE(hasWritten);
}

TEST_F(PersonalLayer, belongsToATransactionOfTheSession) {
    test::EventLog personal(*session_.personal().events());
    auto const before = projectText();
    auto transaction = session_.transaction();
    session_.project().setName(u"Pump");
    put({engine_});
    EXPECT_TRUE(isLabelled(engine_));
    EXPECT_THAT(personal.take(), IsEmpty());
    EXPECT_THAT(foundByOthers(), IsEmpty());

    transaction.commit();

    EXPECT_NE(before, projectText());
    EXPECT_EQ(1U, foundByOthers().size());
    EXPECT_EQ(3U, personal.take().size());
}

TEST_F(PersonalLayer, isRolledBackWithATransaction) {
    test::EventLog personal(*session_.personal().events());
    {
        auto const transaction = session_.transaction();
        put({engine_});
    }
    EXPECT_THAT(labels().getAllCategories(), IsEmpty());
    EXPECT_FALSE(std::filesystem::exists(store() / "local"));
    EXPECT_THAT(personal.take(), IsEmpty());
}

TEST_F(PersonalLayer, isRolledBackAloneWithANestedTransaction) {
    auto transaction = session_.transaction();
    put({engine_});
    {
        auto const nested = session_.transaction();
        files().addLabels({valve_}, {label()});
    }
    transaction.commit();

    EXPECT_TRUE(isLabelled(engine_));
    EXPECT_FALSE(isLabelled(valve_));
}

TEST_F(PersonalLayer, rollsBackAnOperationThatThrowsAlone) {
    auto transaction = session_.transaction();
    put({engine_});
    EXPECT_THROW(labels().createCategory(CategoryDefinition(u"Mine", u"twice")), exception::ProjectException);
    transaction.commit();

    EXPECT_EQ(1U, labels().getAllCategories().size());
    EXPECT_TRUE(isLabelled(engine_));
}

TEST_F(PersonalLayer, isUnchangedIfTheProjectCannotBeCommitted) {
    put({engine_});
    auto transaction = session_.transaction();
    files().addLabels({valve_}, {label()});
    session_.project().setName(u"Pump");
    // Another definition in place of the text: the commit finds it and refuses to overwrite it.
    folder_.addFile(".projectdata/project.jsonl", projectText() + "<<<<<<< ours\n");

    EXPECT_THROW(transaction.commit(), stores::StoreError);

    EXPECT_THAT(personalText(), Not(HasSubstr("valve")));
}

TEST_F(PersonalLayer, keepsTheChangesOfTheProjectIfOnlyThePersonalTextCannotBeWritten) {
    put({engine_});
    test::EventLog shared(*session_.events());
    folder_.addFile(".projectdata/local/project.jsonl", "damaged\n" + personalText());

    EXPECT_THROW(projectFiles().remove({engine_}), stores::StoreError);

    EXPECT_FALSE(projectFiles().isFileInProject(engine_));
    EXPECT_THAT(shared.take(), ElementsAre(u"fileListUpdate " + engine_.native()));
}

TEST_F(PersonalLayer, doesNotHinderChangesOfOtherFilesIfItCannotBeOpened) {
    std::filesystem::create_symlink(folder_.onDisk(), store() / "local");

    EXPECT_THROW(labels().createCategory(mine_), stores::StoreError);
    session_.project().setName(u"Pump");
    EXPECT_EQ(3U, session_.find({.kind = FileKind::File}).size());
    EXPECT_THROW(projectFiles().remove({engine_}), stores::StoreError);
    EXPECT_FALSE(projectFiles().isFileInProject(engine_));
}

TEST_F(PersonalLayer, reportsTheChangesOfOtherProgramsOnItsOwnEvents) {
    session_.refresh();
    put({engine_}); // so that the text exists
    auto observer = Session::open(folder_.root());
    observer.refresh();
    test::EventLog shared(*observer.events());
    test::EventLog personal(*observer.personal().events());
    EXPECT_FALSE(observer.refresh());

    files().addLabels({pump_}, {label()});
    EXPECT_TRUE(observer.refresh());
    EXPECT_THAT(personal.take(), ElementsAre(u"fileLabelsChanged " + pump_.native()));

    files().removeLabels({pump_, engine_}, {label()});
    labels().renameCategory(mine_, u"Own");
    observer.refresh();
    EXPECT_THAT(personal.take(),
                ElementsAre(u"categoryRenamed mine Mine",
                            u"fileLabelsChanged " + engine_.native() + u" " + pump_.native()));
    EXPECT_THAT(shared.take(), IsEmpty());
}

TEST_F(PersonalLayer, isWatched) {
    put({engine_});
    auto observer = Session::open(folder_.root());
    observer.refresh();
    test::EventLog personal(*observer.personal().events());
    std::thread other([this] { labels().renameCategory(mine_, u"Own"); });

    EXPECT_TRUE(observer.watch(std::chrono::seconds(20)));

    other.join();
    EXPECT_THAT(personal.take(), ElementsAre(u"categoryRenamed mine Mine"));
}

TEST_F(PersonalLayer, isEmptyAfterItsFolderIsDeleted) {
    put({engine_});
    std::filesystem::remove_all(store() / "local"); // as git clean -x does

    EXPECT_THAT(labels().getAllCategories(), IsEmpty());
    put({valve_});
    EXPECT_TRUE(isLabelled(valve_));
    EXPECT_FALSE(isLabelled(engine_));
}

TEST_F(PersonalLayer, needsNoWriteLockOfTheProject) {
    auto other = Session::open(folder_.root());
    auto const transaction = other.transaction(); // holds the lock of the project's text

    put({engine_});

    EXPECT_TRUE(isLabelled(engine_));
}

TEST_F(PersonalLayer, canBeChangedByTwoThreadsWhileTheProjectChanges) {
    put({engine_});
    constexpr int rounds = 20;
    auto const toggle = [this](Path const& file) {
        for (int round = 0; round < rounds; ++round) {
            files().addLabels({file}, {label()});
            files().removeLabels({file}, {label()});
        }
        files().addLabels({file}, {label()});
    };
    std::thread first([&] { toggle(pump_); });
    std::thread second([&] { toggle(valve_); });
    for (int round = 0; round < rounds; ++round) {
        auto transaction = session_.transaction();
        session_.project().setName(u"Engine " + std::u16string(1, char16_t(u'a' + round)));
        files().getLabels(engine_);
        files().addLabels({engine_}, {label()});
        files().removeLabels({engine_}, {label()});
        transaction.commit();
    }
    first.join();
    second.join();

    EXPECT_TRUE(isLabelled(pump_));
    EXPECT_TRUE(isLabelled(valve_));
}

TEST_F(PersonalLayer, isWritableInAProjectThatIsNot) {
    using std::filesystem::perms;
    put({engine_});
    std::filesystem::permissions(folder_.onDisk(), perms(0755));
    std::filesystem::permissions(store() / "local", perms(0777));
    std::filesystem::permissions(store() / "local" / "project.jsonl", perms(0666));

    auto const answer = test::inUnprivilegedProcess([this] {
        auto session = Session::open(folder_.root(), {.sourceControl = SourceControl::Off});
        session.personal().getFileManager().addLabels({valve_}, {label()});
        try {
            session.project().setName(u"Pump");
        } catch (stores::StoreError const&) {
            return std::string("the project is not writable");
        }
        return std::string("the project is writable");
    });

    EXPECT_EQ("the project is not writable", answer);
    EXPECT_EQ(2U, foundByOthers().size());
}

TEST_F(PersonalLayer, followsAFileThatMoves) {
    put({engine_});
    auto const moved = folder_.path(u"motor.cpp");

    session_.move({engine_}, moved);

    EXPECT_TRUE(isLabelled(moved));
    EXPECT_THAT(personalText(), Not(HasSubstr("src")));
    EXPECT_THAT(session_.personal().hiddenFiles(), IsEmpty());
}

TEST_F(PersonalLayer, followsAFolderThatMovesWithEverythingBelowIt) {
    put({engine_, pump_, folder_.path(u"src/io"), valve_});

    session_.move({folder_.path(u"src")}, folder_.path(u"lib"));

    EXPECT_TRUE(isLabelled(folder_.path(u"lib/engine.cpp")));
    EXPECT_TRUE(isLabelled(folder_.path(u"lib/io/pump.cpp")));
    EXPECT_TRUE(isLabelled(folder_.path(u"lib/io")));
    EXPECT_FALSE(isLabelled(folder_.path(u"lib")));
    EXPECT_TRUE(isLabelled(valve_));
    EXPECT_THAT(personalText(), Not(HasSubstr("src")));
    EXPECT_EQ(4U, session_.find({.labels = {{u"mine", {}}}}).size());
}

TEST_F(PersonalLayer, followsAFileThatMovesToTheFolderOfAnUnlabelledOne) {
    put({valve_});

    session_.move({valve_}, folder_.path(u"src/io"));

    EXPECT_THAT(session_.find({.labels = {{u"mine", {}}}}),
                ElementsAre(FoundFile{folder_.path(u"src/io/valve.cpp"), FileKind::File}));
}

TEST_F(PersonalLayer, followsAnAdoptedMoveAndTheReverseRestoresItsText) {
    put({engine_, valve_});
    auto const before = personalText();
    std::filesystem::rename(folder_.onDisk() / "valve.cpp", folder_.onDisk() / "vent.cpp");
    auto const vent = folder_.path(u"vent.cpp");

    session_.adopt({{valve_, vent}});
    EXPECT_TRUE(isLabelled(vent));

    std::filesystem::rename(folder_.onDisk() / "vent.cpp", folder_.onDisk() / "valve.cpp");
    session_.adopt({{vent, valve_}});
    EXPECT_EQ(before, personalText());
}

TEST_F(PersonalLayer, staysIfAMoveIsRolledBack) {
    put({engine_});
    auto const before = personalText();
    {
        auto const transaction = session_.transaction();
        session_.move({engine_}, folder_.path(u"motor.cpp"));
    }
    EXPECT_TRUE(isLabelled(engine_));
    EXPECT_EQ(before, personalText());
}

/// Kills the process when the personal text is committed.
class Killer : public metadata::FileChangeRequestListener {
public:
    void fileRemovalRequested(metadata::MetadataManager& /*store*/, Path const& /*metadataRoot*/,
                              std::vector<Path> const& /*files*/) override {
        ::raise(SIGKILL);
    }

    void fileAdditionRequested(metadata::MetadataManager& /*store*/,
                               std::vector<Path> const& /*files*/) override {
        ::raise(SIGKILL);
    }

    bool acceptsFileChangeRequests() override { return true; }
};

TEST_F(PersonalLayer, followsAMoveThatIsInterruptedBetweenTheTextsWithTheNextChange) {
    put({engine_, valve_});
    auto const killer = std::make_shared<Killer>();
    auto const moved = folder_.path(u"motor.cpp");
    test::ChildProcess child([&](test::ChildProcess::Parent const&) {
        auto session = Session::open(folder_.root());
        ToolAccess(session).personalStore().subscribe(killer);
        session.move({engine_}, moved);
    });
    EXPECT_FALSE(child.join());
    ASSERT_TRUE(projectFiles().isFileInProject(moved));
    ASSERT_FALSE(isLabelled(moved));
    std::filesystem::remove(folder_.onDisk() / ".git" / "index.lock"); // of the dead process

    session_.project().setName(u"Pump");

    EXPECT_TRUE(isLabelled(moved));
    EXPECT_TRUE(isLabelled(valve_));
    EXPECT_THAT(session_.personal().hiddenFiles(), IsEmpty());
}

TEST_F(PersonalLayer, hidesTheLabelsOfAFileIfItsRemovalIsInterruptedBetweenTheTexts) {
    put({engine_, valve_});
    auto const killer = std::make_shared<Killer>();
    test::ChildProcess child([&](test::ChildProcess::Parent const&) {
        auto session = Session::open(folder_.root());
        ToolAccess(session).personalStore().subscribe(killer);
        session.project().getFileManager().remove({engine_});
    });
    EXPECT_FALSE(child.join());

    EXPECT_FALSE(projectFiles().isFileInProject(engine_));
    EXPECT_THAT(personalText(), HasSubstr("engine"));
    EXPECT_THAT(foundByOthers(), ElementsAre(FoundFile{valve_, FileKind::File}));
    EXPECT_THAT(session_.personal().removeHidden(), ElementsAre(engine_));
}

} // namespace
} // namespace project::session
