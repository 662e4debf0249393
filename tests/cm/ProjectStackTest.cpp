#include <functional>
#include <ostream>
#include <stdexcept>

#include <gmock/gmock.h>

#include "core/DeletionLog.hpp"
#include "project/management.hpp"
#include "project/stores/SystemDisk.hpp"
#include "project/stores/TextBackend.hpp"
#include "project/stores/TreeMetadataManager.hpp"
#include "support/ErrorMatchers.hpp"
#include "support/EventLog.hpp"
#include "support/RecordingCMAdapter.hpp"
#include "support/TemporaryFolder.hpp"

// Events and source control on one project, in either order.

namespace project::management {
namespace {

using test::AdapterFailure;
using test::line;
using testing::ElementsAre;
using testing::IsEmpty;
using Paths = std::vector<Path>;

enum class Outermost { Events, SourceControl };

void PrintTo(Outermost outermost, std::ostream* out) {
    *out << (outermost == Outermost::Events ? "events outermost" : "source control outermost");
}

std::string nameOf(testing::TestParamInfo<Outermost> const& info) {
    return info.param == Outermost::Events ? "eventsOutermost" : "sourceControlOutermost";
}

class ProjectStackTest : public testing::TestWithParam<Outermost> {
protected:
    ProjectStackTest() {
        adapter.setStateOfOthers(0);
        adapter.onCall = [this](std::u16string const& operation) { log.note(operation); };
        layers = {base};
        std::unique_ptr<ProjectManager> stack(base);
        if (GetParam() == Outermost::Events) {
            stack = withEvents(withSourceControl(std::move(stack)));
        } else {
            stack = withSourceControl(withEvents(std::move(stack)));
        }
        project = std::move(stack);
    }

    std::unique_ptr<ProjectManager> withEvents(std::unique_ptr<ProjectManager> inner) {
        auto result = std::make_unique<EventBroadcastingProjectManager>(std::move(inner), broadcaster);
        layers.push_back(result.get());
        return result;
    }

    std::unique_ptr<ProjectManager> withSourceControl(std::unique_ptr<ProjectManager> inner) {
        auto result = std::make_unique<CMAwareProjectManager>(std::move(inner), adapter);
        layers.push_back(result.get());
        return result;
    }

    FileManager& files() { return project->getFileManager(); }

    /// Creates a file, adds it to the project, and forgets all events and calls.
    Path projectFile(std::u16string const& relative) {
        auto file = folder.file(relative);
        files().add({file});
        adapter.take();
        log.take();
        return file;
    }

    test::TemporaryFolder folder;
    std::shared_ptr<DispatchableProjectEventBroadcaster> broadcaster =
        std::make_shared<DispatchableProjectEventBroadcaster>();
    test::EventLog log{*broadcaster}; // of the events and the adapter's calls
    test::RecordingCMAdapter adapter;
    std::shared_ptr<stores::TreeMetadataManager> store{
        new stores::TreeMetadataManager(std::make_unique<stores::TextBackend>(stores::makeSystemDisk(
                                            folder.root(), stores::TextBackend::folderName)),
                                        folder.path(u".projectdata"))};
    ProjectManagerBase* const base = new ProjectManagerBase(folder.root(), store); // owned by the stack
    std::vector<ProjectManager*> layers; // the base first, then those that wrap it
    std::unique_ptr<ProjectManager> project;
};

INSTANTIATE_TEST_SUITE_P(EitherOrder, ProjectStackTest,
                         testing::Values(Outermost::Events, Outermost::SourceControl), nameOf);

TEST_P(ProjectStackTest, anAddedFileIsPassedToTheAdapterBeforeItsEvent) {
    projectFile(u"first");
    auto const file = folder.file(u"x/a");
    files().add({file});
    EXPECT_THAT(log.take(), ElementsAre(u"getFileStates", u"getFileStates", u"addToSourceControl",
                                        line(u"fileListUpdate", {file})));
    EXPECT_EQ(adapter.take().back(), line(u"addToSourceControl", {folder.path(u"x"), file}));
    EXPECT_TRUE(base->getFileManager().isFileInProject(file));
}

TEST_P(ProjectStackTest, aRemovedFileIsPassedToTheAdapterBeforeItsEvent) {
    auto const file = projectFile(u"a");
    adapter.setStateOfOthers(1);
    EXPECT_THAT(files().remove({file}), ElementsAre(file));
    EXPECT_THAT(log.take(), ElementsAre(u"getFileStates", u"getFileStates", u"removeFromSourceControl",
                                        line(u"fileListUpdate", {file})));
    EXPECT_EQ(adapter.take().back(), line(u"removeFromSourceControl", {file}));
}

TEST_P(ProjectStackTest, aRefusedFileRaisesNoEventAndIsNotPassedToTheAdapterYet) {
    projectFile(u"a");
    auto const missing = folder.path(u"missing");
    EXPECT_RAISES(FileDoesNotExistError, (missing), files().add({missing}));
    EXPECT_THAT(log.take(), IsEmpty());
    project->setName(u"Engine");
    EXPECT_EQ(adapter.take().back(), line(u"addToSourceControl", {missing}));
}

TEST_P(ProjectStackTest, aChangeThatTheAdapterRefusesRaisesNoEvent) {
    projectFile(u"a");
    adapter.failOnce(u"addToSourceControl");
    EXPECT_THROW(files().add({folder.file(u"b")}), AdapterFailure);
    EXPECT_THAT(log.take(), ElementsAre(u"getFileStates", u"getFileStates", u"addToSourceControl"));
}

TEST_P(ProjectStackTest, anExceptionOfASlotLeavesTheFileAddedAndUnderSourceControl) {
    projectFile(u"a");
    broadcaster->onFileListUpdate([](Paths const&) { throw std::out_of_range("no"); });
    auto const file = folder.file(u"b");
    EXPECT_THROW(files().add({file}), std::out_of_range);
    EXPECT_TRUE(files().isFileInProject(file));
    EXPECT_EQ(adapter.take().back(), line(u"addToSourceControl", {file}));
}

TEST_P(ProjectStackTest, aSlotMayAddFilesItself) {
    auto const first = projectFile(u"a");
    auto const second = folder.file(u"b");
    broadcaster->onFileListUpdate([&](Paths const&) {
        if (!files().isFileInProject(second)) {
            files().add({second});
        }
    });
    files().add({first});
    EXPECT_EQ(adapter.take().back(), line(u"addToSourceControl", {second}));
    EXPECT_THAT(files().getProjectFiles(), ElementsAre(first, second));
}

TEST_P(ProjectStackTest, everyOperationPassesThroughTheWholeStack) {
    project->create(u"Engine");
    EXPECT_EQ(base->getName(), u"Engine");
    log.take();
    project->setName(u"Motor");
    EXPECT_EQ(log.take().back(), u"nameChanged");
    project->setDescription(u"Two strokes");
    EXPECT_EQ(base->getName(), u"Motor");
    EXPECT_EQ(project->getName(), u"Motor");
    EXPECT_EQ(base->getDescription(), u"Two strokes");
    EXPECT_EQ(project->getDescription(), u"Two strokes");
}

TEST_P(ProjectStackTest, allManagersRaiseEvents) {
    EntryPointDefinition entryPoint(projectFile(u"run.sh"));
    auto const reference = relativeFolderReference(folder.path(u"lib"), folder.root());
    project->getLabelManager().createCategory(CategoryDefinition(u"Kind", u"c"));
    EXPECT_EQ(log.take().back(), u"categoryAdded c Kind");
    project->getEntryPointManager().setEntryPoint(entryPoint);
    EXPECT_EQ(log.take().back(), u"entryPointsChanged");
    project->getProjectPathManager().getFolderReferenceManager().addReferences({reference});
    EXPECT_EQ(log.take().back(), u"pathChanged");
    project->getProjectReferenceManager().getFolderReferenceManager().addReferences({reference});
    EXPECT_EQ(log.take().back(), u"referencesChanged");
}

TEST_P(ProjectStackTest, itsManagersAreAlwaysTheSameObjectsAndNotTheBases) {
    EXPECT_EQ(&project->getFileManager(), &project->getFileManager());
    EXPECT_NE(&project->getFileManager(), &base->getFileManager());
    EXPECT_EQ(&project->getLabelManager(), &project->getLabelManager());
    EXPECT_NE(&project->getLabelManager(), &base->getLabelManager());
    for (auto* const layer : layers) {
        if (layer != project.get()) {
            EXPECT_NE(&layer->getFileManager(), &project->getFileManager());
        }
    }
}

/// Counts the reports that it gets.
class CountingListener : public metadata::FileChangeRequestListener {
public:
    void fileRemovalRequested(metadata::MetadataManager&, Path const&, Paths const&) override { ++reports; }

    void fileAdditionRequested(metadata::MetadataManager&, Paths const&) override { ++reports; }

    bool acceptsFileChangeRequests() override { return true; }

    int reports = 0;
};

TEST_P(ProjectStackTest, aListenerSubscribedToTheOutermostProjectReachesTheStore) {
    auto const listener = std::make_shared<CountingListener>();
    project->subscribe(listener);
    base->setName(u"Engine");
    EXPECT_EQ(listener->reports, 1);
}

TEST_P(ProjectStackTest, itIsDestroyedFromTheOutermostInwardsAndTheStoreLast) {
    std::vector<void const*> expected{
        dynamic_cast<void const*>(&project->getProjectReferenceManager().getFolderReferenceManager()),
        dynamic_cast<void const*>(&project->getProjectPathManager().getFolderReferenceManager()),
        dynamic_cast<void const*>(&base->getFileManager()),
        store.get(),
    };
    // The memory of each layer is freed after everything that it owns, so the outermost is last.
    expected.insert(expected.end(), layers.begin(), layers.end());
    store.reset();

    test::DeletionLog const deletions(expected);
    project.reset();
    EXPECT_EQ(deletions.deleted(), expected);
    EXPECT_THAT(adapter.take(), IsEmpty());
}

} // namespace
} // namespace project::management
