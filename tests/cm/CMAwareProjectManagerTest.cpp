#include "project/cm/CMAwareProjectManager.hpp"

#include <set>

#include <gmock/gmock.h>

#include "project/management.hpp"
#include "project/stores/SystemDisk.hpp"
#include "project/stores/TextBackend.hpp"
#include "project/stores/TreeMetadataManager.hpp"
#include "support/ErrorMatchers.hpp"
#include "support/ManagerMocks.hpp"
#include "support/RecordingCMAdapter.hpp"
#include "support/RecordingMetadataManager.hpp"
#include "support/TemporaryFolder.hpp"

// A project on disk that source control follows.

namespace project::management {
namespace {

using metadata::FileChangeRequestListener;
using metadata::MetadataManager;
using test::AdapterFailure;
using test::line;
using testing::Contains;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::Return;
using testing::ReturnRef;
using testing::StrictMock;
using Paths = std::vector<Path>;
using Lines = std::vector<std::u16string>;

/// Remembers all files that the store reports.
class ReportLog : public FileChangeRequestListener {
public:
    void fileRemovalRequested(MetadataManager&, Path const&, Paths const& files) override {
        removed.insert(files.begin(), files.end());
    }

    void fileAdditionRequested(MetadataManager&, Paths const& files) override {
        added.insert(files.begin(), files.end());
    }

    bool acceptsFileChangeRequests() override { return true; }

    std::set<Path> added;
    std::set<Path> removed;
};

class CMAwareProjectManagerTest : public testing::Test {
protected:
    CMAwareProjectManagerTest() { adapter.setStateOfOthers(0); }

    FileManager& files() { return project->getFileManager(); }

    /// Creates a file, adds it to the project, and forgets the calls of the adapter.
    Path projectFile(std::u16string const& relative) {
        auto file = folder.file(relative);
        files().add({file});
        adapter.take();
        return file;
    }

    /// The adapter's calls if there is nothing to do.
    static Lines emptyQueries() { return {u"getFileStates", u"getFileStates"}; }

    static Lines twoQueriesAnd(std::u16string const& action, Paths const& paths) {
        return {line(u"getFileStates", paths), line(u"getFileStates", paths), line(action, paths)};
    }

    test::TemporaryFolder folder;
    std::shared_ptr<MetadataManager> store = std::make_shared<stores::TreeMetadataManager>(
        std::make_unique<stores::TextBackend>(
            stores::makeSystemDisk(folder.root(), stores::TextBackend::folderName)),
        folder.path(u".projectdata"));
    test::RecordingCMAdapter adapter;
    std::unique_ptr<ProjectManager> project = std::make_unique<CMAwareProjectManager>(
        std::make_unique<ProjectManagerBase>(folder.root(), store), adapter);
};

TEST_F(CMAwareProjectManagerTest, creatingAndReadingAProjectDoesNotCallTheAdapter) {
    project->getName();
    files().getProjectFiles();
    files().isFileInProject(folder.path(u"a"));
    project->getLabelManager().getAllCategories();
    project->getEntryPointManager().getEntryPoints();
    EXPECT_THAT(adapter.take(), IsEmpty());
}

TEST_F(CMAwareProjectManagerTest, anAddedFileIsPassedInOneCallWithItsFoldersAndTheStoresNewFiles) {
    auto const reports = std::make_shared<ReportLog>();
    project->subscribe(reports);
    auto const file = folder.file(u"x/y/a");
    files().add({file});
    EXPECT_THAT(reports->added, Contains(folder.path(u".projectdata/project.jsonl")));

    auto expected = reports->added;
    expected.insert({folder.path(u".projectdata"), folder.path(u"x"), folder.path(u"x/y"), file});
    EXPECT_EQ(adapter.take(), twoQueriesAnd(u"addToSourceControl", Paths(expected.begin(), expected.end())));
}

TEST_F(CMAwareProjectManagerTest, onceTheStoresFilesExistACallContainsOnlyTheAddedFiles) {
    projectFile(u"first");
    auto const b = folder.file(u"x/b");
    auto const a = folder.file(u"x/a");
    files().add({b, a});
    EXPECT_EQ(adapter.take(), twoQueriesAnd(u"addToSourceControl", {folder.path(u"x"), a, b}));
}

TEST_F(CMAwareProjectManagerTest, aRemovedFolderIsPassedAsTheCallerPassedIt) {
    projectFile(u"x/a");
    adapter.setStateOfOthers(1);
    auto const x = folder.path(u"x");
    EXPECT_THAT(files().remove({x}), ElementsAre(x, folder.path(u"x/a")));
    EXPECT_EQ(adapter.take(), twoQueriesAnd(u"removeFromSourceControl", {x}));
}

TEST_F(CMAwareProjectManagerTest, theFirstReportOfARemovalPassesAllFilesAndTheOthersNone) {
    auto const file = projectFile(u"a");
    auto const nodes = files().getFileMetadataManagerFor(u"Another");
    nodes->setFileNodes({{file, std::make_shared<metadata::MetadataNodeSpecification>(u"Info")}});
    adapter.take();
    adapter.setStateOfOthers(1);
    files().remove({file});
    // One report for each scope.
    auto expected = twoQueriesAnd(u"removeFromSourceControl", {file});
    expected.insert(expected.end(), {u"getFileStates", u"getFileStates"});
    EXPECT_EQ(adapter.take(), expected);
}

TEST_F(CMAwareProjectManagerTest, anyWriteOfTheStoreCallsTheAdapter) {
    projectFile(u"a");
    project->setDescription(u"Two strokes");
    EXPECT_EQ(adapter.take(), emptyQueries());
    project->getLabelManager().createCategory(CategoryDefinition(u"Kind"));
    EXPECT_EQ(adapter.take(), emptyQueries());
}

TEST_F(CMAwareProjectManagerTest, aFileThatTheProjectRefusesIsPassedWithTheNextWriteWhicheverItIs) {
    projectFile(u"a");
    auto const missing = folder.path(u"x/missing");
    folder.folder(u"x");
    EXPECT_RAISES(FileDoesNotExistError, (missing), files().add({missing}));
    EXPECT_RAISES(FileNotInProjectRoot, (u"/elsewhere/a/b", folder.root()), files().add({u"/elsewhere/a/b"}));
    EXPECT_THAT(adapter.take(), IsEmpty());

    project->setName(u"Engine");
    EXPECT_EQ(adapter.take(),
              twoQueriesAnd(u"addToSourceControl", {u"/elsewhere/a/b", folder.path(u"x"), missing}));
    project->setName(u"Motor");
    EXPECT_EQ(adapter.take(), emptyQueries());
}

TEST_F(CMAwareProjectManagerTest, aRefusedRemovalWaitsForTheNextRemovalEvenIfFilesAreAddedMeanwhile) {
    auto const file = projectFile(u"a");
    auto const other = folder.file(u"b");
    adapter.setStateOfOthers(1);
    EXPECT_RAISES(FileNotInProject, (other), files().remove({other}));
    EXPECT_THAT(adapter.take(), IsEmpty());
    project->setName(u"Engine");
    EXPECT_EQ(adapter.take(), emptyQueries());
    files().remove({file});
    EXPECT_EQ(adapter.take(), twoQueriesAnd(u"removeFromSourceControl", {file, other}));
}

TEST_F(CMAwareProjectManagerTest, aRefusedAdditionWaitsEvenIfFilesAreRemovedMeanwhile) {
    auto const file = projectFile(u"a");
    auto const missing = folder.path(u"missing");
    EXPECT_RAISES(FileDoesNotExistError, (missing), files().add({missing}));
    adapter.setStateOfOthers(1);
    files().remove({file});
    EXPECT_EQ(adapter.take(), twoQueriesAnd(u"removeFromSourceControl", {file}));
    adapter.setStateOfOthers(0);
    project->setName(u"Engine");
    EXPECT_EQ(adapter.take(), twoQueriesAnd(u"addToSourceControl", {missing}));
}

TEST_F(CMAwareProjectManagerTest, anErrorOfTheAdapterInAnAdditionPropagatesAndTheFilesAreNotTriedAgain) {
    projectFile(u"a");
    auto const file = folder.file(u"b");
    adapter.failOnce(u"addToSourceControl");
    EXPECT_THROW(files().add({file}), AdapterFailure);
    EXPECT_FALSE(files().isFileInProject(file)); // this store rolls a write back if a listener throws
    adapter.take();
    project->setName(u"Engine");
    EXPECT_EQ(adapter.take(), emptyQueries());
}

TEST_F(CMAwareProjectManagerTest, anErrorOfTheAdapterInARemovalPropagatesAndTheFilesAreNotTriedAgain) {
    auto const file = projectFile(u"a");
    auto const other = projectFile(u"b");
    adapter.setStateOfOthers(1);
    adapter.failOnce(u"getFileStates");
    EXPECT_THROW(files().remove({file}), AdapterFailure);
    EXPECT_TRUE(files().isFileInProject(file));
    adapter.take();
    files().remove({other});
    EXPECT_EQ(adapter.take(), twoQueriesAnd(u"removeFromSourceControl", {other}));
}

TEST_F(CMAwareProjectManagerTest, anErrorOfTheAdapterPropagatesToTheCallerOfAnyWrite) {
    projectFile(u"a");
    adapter.failOnce(u"getFileStates");
    EXPECT_THROW(project->setName(u"Engine"), AdapterFailure);
    EXPECT_EQ(project->getName(), u"");
}

TEST_F(CMAwareProjectManagerTest, itsDestructionDropsPendingFilesWithoutACallOfTheAdapter) {
    projectFile(u"a");
    auto const missing = folder.path(u"missing");
    EXPECT_RAISES(FileDoesNotExistError, (missing), files().add({missing}));
    EXPECT_RAISES(FileNotInProject, (missing), files().remove({missing}));
    project.reset();
    EXPECT_THAT(adapter.take(), IsEmpty());
    ProjectManagerBase(folder.root(), store).setName(u"Engine");
    EXPECT_THAT(adapter.take(), IsEmpty());
}

TEST_F(CMAwareProjectManagerTest, aListenerReachesTheStore) {
    auto const reports = std::make_shared<ReportLog>();
    project->subscribe(reports);
    project->setName(u"Engine");
    EXPECT_THAT(reports->added, Contains(folder.path(u".projectdata/project.jsonl")));
}

/// Records, when it is destroyed, whether the listener that it was given still exists.
class EndingProject : public StrictMock<test::MockProjectManager> {
public:
    explicit EndingProject(std::vector<bool>& listenerWasThere) : listenerWasThere_(listenerWasThere) {}

    ~EndingProject() override { listenerWasThere_.push_back(!listener.expired()); }

    std::weak_ptr<FileChangeRequestListener> listener;

private:
    std::vector<bool>& listenerWasThere_;
};

class CMAwareProjectManagerOverMocksTest : public testing::Test {
protected:
    CMAwareProjectManagerOverMocksTest() {
        EXPECT_CALL(*inner, getFileManager()).WillRepeatedly(ReturnRef(files));
        EXPECT_CALL(files, getProjectRoot()).WillOnce(Return(u"/p/x"));
        EXPECT_CALL(*inner, subscribe).WillOnce([this](auto given) { inner->listener = given; });
        project = std::make_unique<CMAwareProjectManager>(std::unique_ptr<ProjectManager>(inner), adapter);
    }

    std::vector<bool> listenerWasThere;
    StrictMock<test::MockFileManager> files;
    test::RecordingCMAdapter adapter;
    EndingProject* const inner = new EndingProject(listenerWasThere); // owned by the project
    std::unique_ptr<ProjectManager> project;
};

TEST_F(CMAwareProjectManagerOverMocksTest, theListenerAcceptsReportsAndUsesTheRootOfTheInnerFiles) {
    auto const listener = inner->listener.lock();
    ASSERT_TRUE(listener);
    EXPECT_TRUE(listener->acceptsFileChangeRequests());
    EXPECT_THAT(adapter.take(), IsEmpty());
    test::RecordingMetadataManager unused;
    adapter.setStateOfOthers(0);
    listener->fileAdditionRequested(unused, {u"/p/x/a/b"});
    EXPECT_EQ(adapter.take().back(), u"addToSourceControl /p/x/a /p/x/a/b");
}

TEST_F(CMAwareProjectManagerOverMocksTest, itsFileManagerIsItsOwnAndAlwaysTheSame) {
    auto& own = project->getFileManager();
    EXPECT_NE(&own, &files);
    EXPECT_EQ(&project->getFileManager(), &own);
    EXPECT_CALL(files, add);
    own.add({u"/p/x/a"});
    test::RecordingMetadataManager unused;
    inner->listener.lock()->fileAdditionRequested(unused, {});
    EXPECT_EQ(adapter.take().back(), u"getFileStates /p/x/a");
}

TEST_F(CMAwareProjectManagerOverMocksTest, allOtherManagersAreThoseOfTheInnerProject) {
    test::MockLabelManager labels;
    test::MockEntryPointManager entryPoints;
    test::MockProjectPathManager path;
    test::MockProjectReferenceManager references;
    EXPECT_CALL(*inner, getLabelManager()).WillOnce(ReturnRef(labels));
    EXPECT_CALL(*inner, getEntryPointManager()).WillOnce(ReturnRef(entryPoints));
    EXPECT_CALL(*inner, getProjectPathManager()).WillOnce(ReturnRef(path));
    EXPECT_CALL(*inner, getProjectReferenceManager()).WillOnce(ReturnRef(references));
    EXPECT_EQ(&project->getLabelManager(), &labels);
    EXPECT_EQ(&project->getEntryPointManager(), &entryPoints);
    EXPECT_EQ(&project->getProjectPathManager(), &path);
    EXPECT_EQ(&project->getProjectReferenceManager(), &references);
}

TEST_F(CMAwareProjectManagerOverMocksTest, theListenerIsDestroyedBeforeTheInnerProject) {
    EXPECT_FALSE(inner->listener.expired());
    project.reset();
    EXPECT_THAT(listenerWasThere, ElementsAre(false));
}

} // namespace
} // namespace project::management
