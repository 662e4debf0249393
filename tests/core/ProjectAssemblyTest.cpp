#include <stdexcept>

#include <gmock/gmock.h>

#include "core/DeletionLog.hpp"
#include "project/core/EntryPointManager.hpp"
#include "project/core/FileManager.hpp"
#include "project/core/FolderReferenceManager.hpp"
#include "project/core/LabelManager.hpp"
#include "project/core/ProjectManagerBase.hpp"
#include "project/core/ProjectPathManager.hpp"
#include "project/core/ProjectReferenceManager.hpp"
#include "project/entrypoints/EntryPoint.hpp"
#include "project/files/FileLabel.hpp"
#include "project/files/FileMetadataManager.hpp"
#include "project/files/LabelIDSet.hpp"
#include "project/references/FolderReference.hpp"
#include "support/RecordingMetadataManager.hpp"
#include "support/TemporaryFolder.hpp"

// The connections between the five managers of a project, and their destruction.

namespace project::management {
namespace {

using test::address;
using testing::ElementsAre;
using testing::IsEmpty;

template <class T>
void const* addressOf(T& object) {
    return dynamic_cast<void const*>(&object);
}

/// A file manager that a decorator could return in place of the project's own. All its operations fail.
class UnusableFileManager : public FileManager {
public:
    Path getProjectRoot() override { fail(); }

    std::unique_ptr<FileMetadataManager> getFileMetadataManagerFor(std::u16string const&) override { fail(); }

    void add(std::vector<Path> const&) override { fail(); }

    bool isFileInProject(Path const&) const override { fail(); }

    std::vector<Path> remove(std::vector<Path> const&) override { fail(); }

    std::vector<Path> getChildProjectFiles(Path const&) const override { fail(); }

    std::vector<Path> getProjectFiles() const override { fail(); }

    std::vector<FileLabel> addLabels(std::vector<Path> const&, std::vector<Label> const&) override { fail(); }

    void removeLabels(std::vector<Path> const&, std::vector<Label> const&) override { fail(); }

    std::vector<LabelIDSet> getLabelIDSets(Path const&) override { fail(); }

    std::vector<FileLabel> getLabels(Path const&) override { fail(); }

    void removeCategory(std::vector<Path> const&, CategoryIdentifier const&) override { fail(); }

private:
    [[noreturn]] static void fail() { throw std::logic_error("a manager has called a decorator"); }
};

class DecoratedProject : public ProjectManagerBase {
public:
    using ProjectManagerBase::ProjectManagerBase;

    FileManager& getFileManager() override { return decorator_; }

    FileManager& undecorated() { return ProjectManagerBase::getFileManager(); }

private:
    UnusableFileManager decorator_;
};

class ProjectAssemblyTest : public testing::Test {
protected:
    test::TemporaryFolder folder;
    std::shared_ptr<test::RecordingMetadataManager> store =
        std::make_shared<test::RecordingMetadataManager>(folder.path(u".projectdata"));
    DecoratedProject decorated{folder.root(), store};
    ProjectManagerBase project{folder.root(), store};
};

TEST_F(ProjectAssemblyTest, constructingAProjectDoesNotAccessTheStore) {
    EXPECT_THAT(store->calls(), IsEmpty());
    EXPECT_TRUE(store->isEmpty());
}

TEST_F(ProjectAssemblyTest, eachManagerIsTheSameObjectAtEachCallAndTakesNoLock) {
    EXPECT_EQ(&project.getFileManager(), &project.getFileManager());
    EXPECT_EQ(&project.getLabelManager(), &project.getLabelManager());
    EXPECT_EQ(&project.getEntryPointManager(), &project.getEntryPointManager());
    EXPECT_EQ(&project.getProjectReferenceManager(), &project.getProjectReferenceManager());
    EXPECT_EQ(&project.getProjectPathManager(), &project.getProjectPathManager());
    EXPECT_THAT(store->calls(), IsEmpty());
}

TEST_F(ProjectAssemblyTest, everyManagerWorksOnTheOneStoreAndRoot) {
    auto const file = folder.file(u"run.sh");
    project.getFileManager().add({file});
    EntryPointDefinition entryPoint(file);
    project.getEntryPointManager().setEntryPoint(entryPoint);
    project.getLabelManager().createCategory(CategoryDefinition(u"Kind"));
    auto const here = relativeFolderReference(folder.path(u"a"), folder.root());
    project.getProjectPathManager().getFolderReferenceManager().addReferences({here});
    project.getProjectReferenceManager().getFolderReferenceManager().addReferences({here});

    std::vector<std::u16string> heads;
    for (auto const& head : store->content().getChildNodes(metadata::MetadataPath::root())) {
        heads.push_back(head.getLeaf().getType());
    }
    EXPECT_THAT(heads, ElementsAre(u"Categories", u"EntryPoints", u"Files", u"ProjectPath", u"References"));
    EXPECT_EQ(project.getFileManager().getProjectRoot(), folder.root());
    EXPECT_EQ(project.getEntryPointManager().getEntryPoints().at(0)->getFile(), file);
    EXPECT_TRUE(project.getProjectPathManager().getFolderReferenceManager().isReference(here.getLocation()));
    EXPECT_TRUE(
        project.getProjectReferenceManager().getFolderReferenceManager().isReference(here.getLocation()));
}

TEST_F(ProjectAssemblyTest, removingAFileThatIsAnEntryPointRemovesBoth) {
    auto const file = folder.file(u"a/run.sh");
    auto const other = folder.file(u"other.sh");
    project.getFileManager().add({file, other});
    for (auto const& path : {file, other}) {
        EntryPointDefinition entryPoint(path);
        project.getEntryPointManager().setEntryPoint(entryPoint);
    }

    project.getFileManager().remove({folder.path(u"a")});
    EXPECT_FALSE(project.getFileManager().isFileInProject(file));
    EXPECT_EQ(store->content().getChildNodes(address({{u"EntryPoints", u"Root"}})).size(), 1U);
    EXPECT_EQ(project.getEntryPointManager().getEntryPoints().at(0)->getFile(), other);
}

TEST_F(ProjectAssemblyTest, aFilesLabelsAreResolvedThroughTheProjectsLabelManager) {
    auto const file = folder.file(u"a.txt");
    CategoryDefinition const category(u"Kind", u"c");
    LabelDefinition const label(u"Source", u"l");
    project.getFileManager().add({file});
    project.getLabelManager().createCategory(category);
    project.getLabelManager().createLabel(category, label);
    project.getFileManager().addLabels({file}, {Label(category, label)});
    ASSERT_EQ(project.getFileManager().getLabels(file).size(), 1U);
    EXPECT_EQ(project.getFileManager().getLabels(file).at(0).getLabelIdentifier().getName(), u"Source");
}

TEST_F(ProjectAssemblyTest, aDeletedCategoryIsRemovedFromTheFilesPastAnyDecorator) {
    auto const file = folder.file(u"a.txt");
    CategoryDefinition const category(u"Kind", u"c");
    LabelDefinition const label(u"Source", u"l");
    decorated.undecorated().add({file});
    decorated.getLabelManager().createCategory(category);
    decorated.getLabelManager().createLabel(category, label);
    decorated.undecorated().addLabels({file}, {Label(category, label)});
    ASSERT_EQ(decorated.undecorated().getLabelIDSets(file).size(), 1U);

    EXPECT_NO_THROW(decorated.getLabelManager().deleteCategory(category));
    EXPECT_THAT(decorated.undecorated().getLabelIDSets(file), IsEmpty());
}

TEST_F(ProjectAssemblyTest, anEntryPointIsCheckedAgainstTheFilesPastAnyDecorator) {
    auto const file = folder.file(u"run.sh");
    decorated.undecorated().add({file});
    EntryPointDefinition entryPoint(file);
    EXPECT_NO_THROW(decorated.getEntryPointManager().setEntryPoint(entryPoint));
    EXPECT_EQ(decorated.getEntryPointManager().getEntryPoints().size(), 1U);
}

TEST_F(ProjectAssemblyTest, theStoreOutlivesTheProjectIfItIsShared) {
    std::weak_ptr<test::RecordingMetadataManager> const watched = store;
    auto owned = std::make_shared<test::RecordingMetadataManager>();
    std::weak_ptr<test::RecordingMetadataManager> const watchedOwned = owned;
    {
        ProjectManagerBase const sharing(u"/project", store);
        ProjectManagerBase const owning(u"/project", std::move(owned));
        EXPECT_FALSE(watchedOwned.expired());
    }
    EXPECT_TRUE(watchedOwned.expired());
    EXPECT_FALSE(watched.expired());
}

TEST_F(ProjectAssemblyTest, theManagersAreDestroyedInReverseOrderOfConstructionAndTheStoreLast) {
    auto* const bareStore = new test::RecordingMetadataManager();
    auto owned = std::make_unique<ProjectManagerBase>(u"/project",
                                                      std::shared_ptr<metadata::MetadataManager>(bareStore));
    std::vector<void const*> const expected{
        addressOf(owned->getProjectPathManager()), addressOf(owned->getProjectReferenceManager()),
        addressOf(owned->getEntryPointManager()),  addressOf(owned->getLabelManager()),
        addressOf(owned->getFileManager()),        addressOf(*bareStore),
    };

    test::DeletionLog const log(expected);
    owned.reset();
    EXPECT_EQ(log.deleted(), expected);
}

} // namespace
} // namespace project::management
