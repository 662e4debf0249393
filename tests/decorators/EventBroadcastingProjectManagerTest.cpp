#include "project/decorators/EventBroadcastingProjectManager.hpp"

#include <stdexcept>

#include <gmock/gmock.h>

#include "core/DeletionLog.hpp"
#include "project/core/ProjectManagerBase.hpp"
#include "support/ErrorMatchers.hpp"
#include "support/EventLog.hpp"
#include "support/ManagerMocks.hpp"
#include "support/RecordingMetadataManager.hpp"
#include "support/TemporaryFolder.hpp"

// The events of a real project. Each manager's decorator has a test of its own.

namespace project::management {
namespace {

using test::line;
using testing::ElementsAre;
using testing::InSequence;
using testing::IsEmpty;
using testing::ReturnRef;
using testing::StrictMock;
using Paths = std::vector<Path>;

class EventBroadcastingProjectManagerTest : public testing::Test {
protected:
    /// Creates a file, adds it to the project, and forgets the events.
    Path projectFile(std::u16string const& relative) {
        auto file = folder.file(relative);
        project.getFileManager().add({file});
        log.take();
        return file;
    }

    test::TemporaryFolder folder;
    std::shared_ptr<test::RecordingMetadataManager> store =
        std::make_shared<test::RecordingMetadataManager>(folder.path(u".projectdata"));
    std::shared_ptr<DispatchableProjectEventBroadcaster> broadcaster =
        std::make_shared<DispatchableProjectEventBroadcaster>();
    test::EventLog log{*broadcaster};
    EventBroadcastingProjectManager project{std::make_unique<ProjectManagerBase>(folder.root(), store),
                                            broadcaster};
    CategoryDefinition const category{u"Kind", u"c"};
    LabelDefinition const label{u"Source", u"l"};
};

TEST_F(EventBroadcastingProjectManagerTest, constructionRaisesNothingAndDoesNotUseTheStore) {
    EXPECT_THAT(log.take(), IsEmpty());
    EXPECT_THAT(store->calls(), IsEmpty());
}

TEST_F(EventBroadcastingProjectManagerTest, eachManagerIsAlwaysTheSameObject) {
    EXPECT_EQ(&project.getFileManager(), &project.getFileManager());
    EXPECT_EQ(&project.getLabelManager(), &project.getLabelManager());
    EXPECT_EQ(&project.getEntryPointManager(), &project.getEntryPointManager());
    EXPECT_EQ(&project.getProjectReferenceManager(), &project.getProjectReferenceManager());
    EXPECT_EQ(&project.getProjectPathManager(), &project.getProjectPathManager());
}

TEST_F(EventBroadcastingProjectManagerTest, settingTheNameRaisesOneEvent) {
    project.setName(u"Engine");
    EXPECT_THAT(log.take(), ElementsAre(u"nameChanged"));
    EXPECT_EQ(project.getName(), u"Engine");
}

TEST_F(EventBroadcastingProjectManagerTest, creatingTheProjectRaisesNothingThoughItSetsTheName) {
    project.create(u"Engine");
    EXPECT_EQ(project.getName(), u"Engine");
    EXPECT_THAT(log.take(), IsEmpty());
}

TEST_F(EventBroadcastingProjectManagerTest, settingTheDescriptionRaisesNothing) {
    project.setDescription(u"Two strokes");
    EXPECT_EQ(project.getDescription(), u"Two strokes");
    EXPECT_THAT(log.take(), IsEmpty());
}

TEST_F(EventBroadcastingProjectManagerTest, aNameThatTheStoreRefusesRaisesNothing) {
    store->failOn("setNodes", [] { throw std::runtime_error("disk full"); });
    EXPECT_THROW(project.setName(u"Engine"), std::runtime_error);
    EXPECT_THAT(log.take(), IsEmpty());
}

TEST_F(EventBroadcastingProjectManagerTest, theEventOfAnAddContainsTheCallersFilesWithoutTheirFolders) {
    auto const b = folder.file(u"x/b");
    auto const a = folder.file(u"x/a");
    project.getFileManager().add({b, a});
    EXPECT_THAT(log.take(), ElementsAre(line(u"fileListUpdate", {b, a})));
    EXPECT_TRUE(project.getFileManager().isFileInProject(folder.path(u"x")));
}

TEST_F(EventBroadcastingProjectManagerTest, anAddThatIsRefusedRaisesNothing) {
    EXPECT_RAISES(FileNotInProjectRoot, (u"/elsewhere/a", folder.root()),
                  project.getFileManager().add({u"/elsewhere/a"}));
    EXPECT_THAT(log.take(), IsEmpty());
}

TEST_F(EventBroadcastingProjectManagerTest, addingNothingRaisesTheEventWithTheEmptyList) {
    project.getFileManager().add({});
    EXPECT_THAT(log.take(), ElementsAre(u"fileListUpdate"));
}

TEST_F(EventBroadcastingProjectManagerTest, theEventOfARemoveContainsTheCallersFilesNotAllRemovedOnes) {
    auto const inside = projectFile(u"x/a");
    auto const x = folder.path(u"x");
    EXPECT_THAT(project.getFileManager().remove({x}), ElementsAre(x, inside));
    EXPECT_THAT(log.take(), ElementsAre(line(u"fileListUpdate", {x})));
}

TEST_F(EventBroadcastingProjectManagerTest, aRemovalThatIsRefusedRaisesNothing) {
    projectFile(u"a");
    EXPECT_RAISES(RootFolderNotRemoveable, (folder.root()), project.getFileManager().remove({folder.root()}));
    EXPECT_THAT(log.take(), IsEmpty());
}

TEST_F(EventBroadcastingProjectManagerTest, changesOfLabelsOnFilesRaiseTheEvent) {
    auto const file = projectFile(u"a");
    project.getLabelManager().createCategory(category);
    project.getLabelManager().createLabel(category, label);
    EXPECT_THAT(log.take(), ElementsAre(u"categoryAdded c Kind", u"labelModified c l"));
    project.getFileManager().addLabels({file}, {Label(category, label)});
    project.getFileManager().removeLabels({file}, {Label(category, label)});
    auto const expected = line(u"fileLabelsChanged", {file});
    EXPECT_THAT(log.take(), ElementsAre(expected, expected));
}

TEST_F(EventBroadcastingProjectManagerTest, takingACategoryOffFilesRaisesNothing) {
    auto const file = projectFile(u"a");
    project.getFileManager().addLabels({file}, {Label(category, label)});
    log.take();
    project.getFileManager().removeCategory({file}, category);
    EXPECT_THAT(project.getFileManager().getLabelIDSets(file), IsEmpty());
    EXPECT_THAT(log.take(), IsEmpty());
}

TEST_F(EventBroadcastingProjectManagerTest, writingThroughAStoreForFilesRaisesNothing) {
    auto const file = projectFile(u"a");
    auto const nodes = project.getFileManager().getFileMetadataManagerFor(u"Mine");
    nodes->setFileNodes({{file, std::make_shared<metadata::MetadataNodeSpecification>(u"Info")}});
    EXPECT_TRUE(nodes->hasFileNode(file));
    nodes->removeFileNodes({file});
    EXPECT_FALSE(nodes->hasFileNode(file));
    EXPECT_THAT(log.take(), IsEmpty());
}

TEST_F(EventBroadcastingProjectManagerTest, writingThroughTheStoreOfTheFileListItselfRaisesNothing) {
    auto const file = folder.path(u"a");
    auto const nodes = project.getFileManager().getFileMetadataManagerFor(u"Root");
    nodes->setFileNodes({{file, std::make_shared<metadata::MetadataNodeSpecification>(u"Info")}});
    EXPECT_TRUE(project.getFileManager().isFileInProject(file));
    EXPECT_THAT(log.take(), IsEmpty());
}

TEST_F(EventBroadcastingProjectManagerTest, aDeletedCategoryRaisesItsEventButNoneForFilesThatLoseItsLabels) {
    auto const file = projectFile(u"a");
    project.getLabelManager().createCategory(category);
    project.getLabelManager().createLabel(category, label);
    project.getFileManager().addLabels({file}, {Label(category, label)});
    log.take();
    project.getLabelManager().deleteCategory(category);
    EXPECT_THAT(project.getFileManager().getLabelIDSets(file), IsEmpty());
    EXPECT_THAT(log.take(), ElementsAre(u"categoryDeleted c Kind"));
}

TEST_F(EventBroadcastingProjectManagerTest, aDeletedLabelRaisesItsEventButNoneForFilesThatLoseIt) {
    auto const file = projectFile(u"a");
    project.getLabelManager().createCategory(category);
    project.getLabelManager().createLabel(category, label);
    project.getFileManager().addLabels({file}, {Label(category, label)});
    log.take();
    project.getLabelManager().deleteLabel(category, label);
    EXPECT_THAT(project.getFileManager().getLabelIDSets(file), IsEmpty());
    EXPECT_THAT(log.take(), ElementsAre(u"labelModified c l"));
}

TEST_F(EventBroadcastingProjectManagerTest, theEventOfARenameContainsTheOldNameWhenTheStoreHasTheNewOne) {
    project.getLabelManager().createCategory(category);
    log.take();
    std::u16string stored;
    broadcaster->onCategoryRenamed([&](CategoryIdentifier const& raised) {
        stored = project.getLabelManager().getCategoryByUUID(raised.getUUID()).getName();
    });
    project.getLabelManager().renameCategory(category, u"State");
    EXPECT_THAT(log.take(), ElementsAre(u"categoryRenamed c Kind"));
    EXPECT_EQ(stored, u"State");
}

TEST_F(EventBroadcastingProjectManagerTest, aRefusedCategoryRaisesNothing) {
    project.getLabelManager().createCategory(category);
    log.take();
    EXPECT_RAISES(CategoryExistsByName, (u"Kind"),
                  project.getLabelManager().createCategory(CategoryDefinition(u"Kind", u"other")));
    EXPECT_THAT(log.take(), IsEmpty());
}

TEST_F(EventBroadcastingProjectManagerTest, changesOfEntryPointsRaiseTheEvent) {
    EntryPointDefinition entryPoint(projectFile(u"run.sh"));
    auto& entryPoints = project.getEntryPointManager();
    entryPoints.setEntryPoint(entryPoint);
    EXPECT_EQ(entryPoints.getEntryPoints().size(), 1U);
    EXPECT_THAT(log.take(), ElementsAre(u"entryPointsChanged"));
    entryPoints.removeEntryPoint(entryPoint.getFile());
    EXPECT_THAT(log.take(), ElementsAre(u"entryPointsChanged"));
}

TEST_F(EventBroadcastingProjectManagerTest, anEntryPointThatIsRemovedWithItsFileRaisesNoEvent) {
    EntryPointDefinition entryPoint(projectFile(u"run.sh"));
    project.getEntryPointManager().setEntryPoint(entryPoint);
    log.take();
    project.getFileManager().remove({entryPoint.getFile()});
    EXPECT_THAT(project.getEntryPointManager().getEntryPoints(), IsEmpty());
    EXPECT_THAT(log.take(), ElementsAre(line(u"fileListUpdate", {entryPoint.getFile()})));
}

TEST_F(EventBroadcastingProjectManagerTest, thePathAndTheReferencesHaveDifferentEvents) {
    auto const reference = absoluteFolderReference(folder.root());
    auto& path = project.getProjectPathManager().getFolderReferenceManager();
    auto& references = project.getProjectReferenceManager().getFolderReferenceManager();
    auto const inProject = relativeFolderReference(folder.path(u"lib"), folder.root());
    path.addReferences({inProject});
    EXPECT_THAT(log.take(), ElementsAre(u"pathChanged"));
    references.addReferences({reference});
    EXPECT_THAT(log.take(), ElementsAre(u"referencesChanged"));

    EXPECT_EQ(path.getReferences().size(), 1U);
    EXPECT_TRUE(references.isReference(reference.getLocation()));
    EXPECT_TRUE(references.getRootReferenceFor(folder.path(u"a")));
    EXPECT_THAT(log.take(), IsEmpty());

    path.removeReferences({inProject});
    EXPECT_THAT(log.take(), ElementsAre(u"pathChanged"));
    references.removeReferences({reference});
    EXPECT_THAT(log.take(), ElementsAre(u"referencesChanged"));
}

TEST_F(EventBroadcastingProjectManagerTest, aSlotSeesTheProjectAfterTheChange) {
    Paths seen;
    broadcaster->onFileListUpdate([&](Paths const&) { seen = project.getFileManager().getProjectFiles(); });
    auto const file = projectFile(u"a");
    EXPECT_THAT(seen, ElementsAre(file));
    project.getFileManager().remove({file});
    EXPECT_THAT(seen, IsEmpty());
}

TEST_F(EventBroadcastingProjectManagerTest, aSlotMayChangeTheProjectItself) {
    broadcaster->onFileListUpdate([&](Paths const&) { project.setName(u"Engine"); });
    project.getFileManager().add({folder.file(u"a")});
    EXPECT_EQ(project.getName(), u"Engine");
}

TEST_F(EventBroadcastingProjectManagerTest, aSlotRunsWithoutAGuardOfTheStore) {
    broadcaster->onNameChanged([&] {
        store->clear();
        project.getDescription();
    });
    project.setName(u"Engine");
    ASSERT_FALSE(store->calls().empty());
    EXPECT_EQ(store->calls().front().operation, "acquireReadLock");
    EXPECT_EQ(store->calls().front().guard, test::StoreCall::Guard::None);
}

TEST_F(EventBroadcastingProjectManagerTest, anExceptionOfASlotKeepsTheChangeAndLaterSlotsAreNotCalled) {
    bool isLaterCalled = false;
    broadcaster->onFileListUpdate([](Paths const&) { throw std::out_of_range("no"); });
    broadcaster->onFileListUpdate([&](Paths const&) { isLaterCalled = true; });
    auto const file = folder.file(u"a");
    EXPECT_THROW(project.getFileManager().add({file}), std::out_of_range);
    EXPECT_TRUE(project.getFileManager().isFileInProject(file));
    EXPECT_THROW(project.getFileManager().remove({file}), std::out_of_range);
    EXPECT_FALSE(project.getFileManager().isFileInProject(file));
    EXPECT_FALSE(isLaterCalled);
}

TEST_F(EventBroadcastingProjectManagerTest, queriesRaiseNothing) {
    auto const file = projectFile(u"a");
    project.getName();
    project.getDescription();
    project.getFileManager().getProjectFiles();
    project.getFileManager().getLabels(file);
    project.getLabelManager().getAllCategories();
    project.getEntryPointManager().getEntryPoint(file);
    project.getEntryPointManager().getEntryPointGroups();
    project.getProjectPathManager().getFolderReferenceManager().getReferences();
    project.getProjectReferenceManager().getFolderReferenceManager().getReferences();
    EXPECT_THAT(log.take(), IsEmpty());
}

TEST_F(EventBroadcastingProjectManagerTest, aListenerReachesTheStore) {
    project.subscribe({});
    ASSERT_EQ(store->calls().size(), 1U);
    EXPECT_EQ(store->calls().front().operation, "subscribe");
}

TEST_F(EventBroadcastingProjectManagerTest, theBroadcasterLivesAsLongAsTheProject) {
    auto owned = std::make_shared<DispatchableProjectEventBroadcaster>();
    std::weak_ptr<DispatchableProjectEventBroadcaster> const watched = owned;
    auto other = std::make_unique<EventBroadcastingProjectManager>(
        std::make_unique<ProjectManagerBase>(folder.root(), store), std::move(owned));
    EXPECT_FALSE(watched.expired());
    other->setName(u"Engine");
    other.reset();
    EXPECT_TRUE(watched.expired());
}

TEST_F(EventBroadcastingProjectManagerTest, aBroadcasterMayOutliveItsProject) {
    {
        EventBroadcastingProjectManager other(std::make_unique<ProjectManagerBase>(folder.root(), store),
                                              broadcaster);
        other.setName(u"Engine");
    }
    EXPECT_THAT(log.take(), ElementsAre(u"nameChanged"));
    broadcaster->dispatchMetadataChange();
    EXPECT_THAT(log.take(), ElementsAre(u"metadataChange"));
}

TEST(EventBroadcastingProjectManager, theManagersAreRequestedOnceAndInOrder) {
    test::MockFileManager files;
    test::MockLabelManager labels;
    test::MockEntryPointManager entryPoints;
    StrictMock<test::MockProjectPathManager> path;
    StrictMock<test::MockProjectReferenceManager> references;
    test::MockFolderReferenceManager list;
    auto inner = std::make_unique<StrictMock<test::MockProjectManager>>();
    InSequence const inThisOrder;
    EXPECT_CALL(*inner, getFileManager()).WillOnce(ReturnRef(files));
    EXPECT_CALL(*inner, getLabelManager()).WillOnce(ReturnRef(labels));
    EXPECT_CALL(*inner, getEntryPointManager()).WillOnce(ReturnRef(entryPoints));
    EXPECT_CALL(*inner, getProjectPathManager()).WillOnce(ReturnRef(path));
    EXPECT_CALL(path, getFolderReferenceManager()).WillOnce(ReturnRef(list));
    EXPECT_CALL(*inner, getProjectReferenceManager()).WillOnce(ReturnRef(references));
    EXPECT_CALL(references, getFolderReferenceManager()).WillOnce(ReturnRef(list));

    EventBroadcastingProjectManager project(std::move(inner),
                                            std::make_shared<DispatchableProjectEventBroadcaster>());
    // All further calls return the decorators.
    EXPECT_NE(&project.getFileManager(), &files);
    EXPECT_NE(&project.getLabelManager(), &labels);
    EXPECT_NE(&project.getEntryPointManager(), &entryPoints);
    EXPECT_NE(&project.getProjectPathManager(), &path);
    EXPECT_NE(&project.getProjectReferenceManager(), &references);
    EXPECT_NE(&project.getProjectPathManager().getFolderReferenceManager(), &list);
    EXPECT_NE(&project.getProjectReferenceManager().getFolderReferenceManager(), &list);
}

TEST(EventBroadcastingProjectManager,
     theDecoratorsAreDestroyedFirstThenTheBroadcasterThenTheProjectAndItsStore) {
    auto* const store = new test::RecordingMetadataManager();
    auto* const broadcaster = new DispatchableProjectEventBroadcaster();
    auto inner =
        std::make_unique<ProjectManagerBase>(u"/project", std::shared_ptr<metadata::MetadataManager>(store));
    void const* const innerFiles = dynamic_cast<void const*>(&inner->getFileManager());
    void const* const innerProject = inner.get();
    auto project = std::make_unique<EventBroadcastingProjectManager>(
        std::move(inner), std::shared_ptr<DispatchableProjectEventBroadcaster>(broadcaster));
    std::vector<void const*> const expected{
        dynamic_cast<void const*>(&project->getProjectReferenceManager().getFolderReferenceManager()),
        dynamic_cast<void const*>(&project->getProjectPathManager().getFolderReferenceManager()),
        broadcaster,
        innerFiles,
        store,
        innerProject, // its memory, after its members are destroyed
    };

    test::DeletionLog const log(expected);
    project.reset();
    EXPECT_EQ(log.deleted(), expected);
}

} // namespace
} // namespace project::management
