#include "files/FileManagerBase.hpp"

#include <gmock/gmock.h>

#include "entrypoints/EntryPointManagerBase.hpp"
#include "project/entrypoints/EntryPoint.hpp"
#include "project/metadata/Messages.hpp"
#include "support/ErrorMatchers.hpp"
#include "support/RecordingMetadataManager.hpp"
#include "support/TemporaryFolder.hpp"

namespace project::management {
namespace {

using metadata::MetadataPath;
using test::address;
using testing::Contains;
using testing::ElementsAre;
using testing::Field;
using testing::IsEmpty;
using ZEPHRA::project::management::EntryPointTypeUndefined;
using ZEPHRA::project::management::FileDoesNotExistError;
using ZEPHRA::project::management::FileIsMetadataError;
using ZEPHRA::project::management::FileNotInProject;
using ZEPHRA::project::management::FileNotInProjectRoot;
using ZEPHRA::project::management::RootFolderNotRemoveable;
using Guard = test::StoreCall::Guard;

class FileManagerBaseTest : public testing::Test {
protected:
    FileManagerBaseTest() {
        files.setEntryPointManager(&entryPoints);
        store->clear();
    }

    MetadataPath at(std::u16string const& relative) const {
        return PathLocalizedFileMetadataManager(folder.root(), store, u"Root")
            .toMetadataPath(folder.path(relative));
    }

    /// Stores data in a file's node, which only a new node does not have.
    void mark(std::u16string const& relative) { store->put(at(relative), {{u"mark", u"here"}}); }

    bool isMarked(std::u16string const& relative) {
        auto const node = store->content().getNode(at(relative));
        return node && node->get(u"mark") == u"here";
    }

    test::TemporaryFolder folder;
    std::shared_ptr<test::RecordingMetadataManager> store =
        std::make_shared<test::RecordingMetadataManager>(folder.path(u".projectdata"));
    FileManagerBase files{folder.root(), store};
    EntryPointManagerBase entryPoints{store, &files, folder.root()};
};

TEST_F(FileManagerBaseTest, constructionDoesNotAccessTheStore) {
    FileManagerBase const another(folder.root(), store);
    EXPECT_THAT(store->calls(), IsEmpty());
}

TEST_F(FileManagerBaseTest, theRootIsInTheProjectWithoutAccessToTheStore) {
    EXPECT_TRUE(files.isFileInProject(folder.root()));
    EXPECT_THAT(store->operations(), IsEmpty());
    EXPECT_THAT(files.getProjectFiles(), IsEmpty());
}

TEST_F(FileManagerBaseTest, theProjectRootIsReturnedUnchanged) {
    EXPECT_EQ(files.getProjectRoot(), folder.root());
}

TEST_F(FileManagerBaseTest, aFileTwoFoldersDownAddsThreeEntriesInOneWrite) {
    files.add({folder.file(u"a/b/c.txt")});

    auto const written = store->calls("setNodes");
    ASSERT_EQ(written.size(), 1U);
    EXPECT_EQ(written[0].guard, Guard::Write);
    EXPECT_THAT(files.getProjectFiles(),
                ElementsAre(folder.path(u"a"), folder.path(u"a/b"), folder.path(u"a/b/c.txt")));
}

TEST_F(FileManagerBaseTest, anEntryIsAnEmptyNodeOfTypeInfo) {
    files.add({folder.file(u"a")});

    auto const node = store->content().getNode(at(u"a"));
    EXPECT_EQ(node->getType(), u"Info");
    EXPECT_THAT(node->getKeys(), IsEmpty());
    EXPECT_THAT(node->getChildren(), IsEmpty());
}

TEST_F(FileManagerBaseTest, addingNothingWritesOneEmptyBatch) {
    files.add({});

    ASSERT_THAT(store->writes(), ElementsAre("setNodes"));
    EXPECT_THAT(store->calls("setNodes")[0].paths, IsEmpty());
}

TEST_F(FileManagerBaseTest, addingTheRootWritesNothingAndDoesNotThrow) {
    files.add({folder.root()});

    EXPECT_THAT(store->calls("setNodes").at(0).paths, IsEmpty());
    EXPECT_TRUE(store->isEmpty());
}

TEST_F(FileManagerBaseTest, addingAFolderDoesNotAddItsContents) {
    folder.file(u"src/a");
    files.add({folder.path(u"src")});
    EXPECT_THAT(files.getProjectFiles(), ElementsAre(folder.path(u"src")));
}

TEST_F(FileManagerBaseTest, addingAFileAgainStoresANewEmptyNode) {
    files.add({folder.file(u"a")});
    mark(u"a");

    files.add({folder.path(u"a")});

    EXPECT_TRUE(files.isFileInProject(folder.path(u"a")));
    EXPECT_FALSE(isMarked(u"a"));
}

TEST_F(FileManagerBaseTest, addingBelowAFolderStoresNewEmptyNodesForThatFolderAndThoseAboveIt) {
    files.add({folder.file(u"a/b/c")});
    mark(u"a");
    mark(u"a/b");
    mark(u"a/b/c");

    files.add({folder.file(u"a/b/d")});

    EXPECT_FALSE(isMarked(u"a"));
    EXPECT_FALSE(isMarked(u"a/b"));
    EXPECT_TRUE(isMarked(u"a/b/c"));
}

TEST_F(FileManagerBaseTest, addingDoesNotReadTheOldNode) {
    files.add({folder.file(u"a")});
    store->clear();
    files.add({folder.path(u"a")});
    EXPECT_THAT(store->calls("getNode"), IsEmpty());
}

TEST_F(FileManagerBaseTest, oneBadPathAddsNoneOfThePaths) {
    auto const missing = folder.path(u"missing");
    EXPECT_RAISES(FileDoesNotExistError, (missing.native()), files.add({folder.file(u"a"), missing}));
    EXPECT_TRUE(store->isEmpty());
    EXPECT_THAT(store->writes(), IsEmpty());
}

TEST_F(FileManagerBaseTest, ofAMissingFileInAMissingFolderTheFolderIsReported) {
    EXPECT_RAISES(FileDoesNotExistError, (folder.path(u"no").native()), files.add({folder.path(u"no/file")}));
}

TEST_F(FileManagerBaseTest, theStoresOwnFilesCannotBeAdded) {
    auto const file = folder.file(u".projectdata/project.jsonl");
    EXPECT_RAISES(FileIsMetadataError, (folder.path(u".projectdata").native()), files.add({file}));
    EXPECT_RAISES(FileIsMetadataError, (folder.path(u".projectdata").native()),
                  files.add({folder.path(u".projectdata")}));
}

TEST_F(FileManagerBaseTest, theStoresFilesAreReportedAsSuchAlsoOutsideTheRoot) {
    test::TemporaryFolder elsewhere;
    auto const outside = std::make_shared<test::RecordingMetadataManager>(elsewhere.root());
    FileManagerBase manager(folder.root(), outside);
    auto const file = elsewhere.file(u"store");
    EXPECT_RAISES(FileIsMetadataError, (file.native()), manager.add({file}));
}

TEST_F(FileManagerBaseTest, aPathOutsideTheRootIsReportedWithTheRoot) {
    test::TemporaryFolder elsewhere;
    auto const file = elsewhere.file(u"a");
    EXPECT_RAISES(FileNotInProjectRoot, (file.native(), folder.root().native()), files.add({file}));
}

TEST_F(FileManagerBaseTest, aNameInTheRootThatBeginsWithTwoDotsCountsAsOutside) {
    auto const file = folder.file(u"..hidden");
    EXPECT_RAISES(FileNotInProjectRoot, (file.native(), folder.root().native()), files.add({file}));
}

TEST_F(FileManagerBaseTest, aPathInTheProjectCanBeAddedAfterItWasDeletedFromTheDisk) {
    files.add({folder.file(u"a")});
    folder.remove(u"a");

    files.add({folder.path(u"a")});

    EXPECT_TRUE(files.isFileInProject(folder.path(u"a")));
}

TEST_F(FileManagerBaseTest, aFileIsFoundUnderTheReadLock) {
    files.isFileInProject(folder.path(u"a"));
    auto const asked = store->calls("hasNode");
    ASSERT_EQ(asked.size(), 1U);
    EXPECT_EQ(asked[0].guard, Guard::Read);
}

TEST_F(FileManagerBaseTest, projectFilesAreInPathOrderAFolderBeforeItsContents) {
    files.add({folder.file(u"b.txt"), folder.file(u"B"), folder.file(u"b/z"), folder.file(u"b/Z")});

    EXPECT_THAT(files.getProjectFiles(),
                ElementsAre(folder.path(u"B"), folder.path(u"b"), folder.path(u"b/Z"), folder.path(u"b/z"),
                            folder.path(u"b.txt")));
}

TEST_F(FileManagerBaseTest, projectFilesAreReadWithoutAGuardAcrossTheWalk) {
    files.add({folder.file(u"a/b")});
    store->clear();

    files.getProjectFiles();

    auto const asked = store->calls("acquireReadLock");
    auto const outermost =
        std::count_if(asked.begin(), asked.end(), [](auto const& call) { return call.guard == Guard::None; });
    EXPECT_EQ(outermost, 4); // for the check of the root, and for the children of the root, a, and a/b
}

TEST_F(FileManagerBaseTest, childrenAreTheDirectOnes) {
    files.add({folder.file(u"a/b/c"), folder.file(u"a/d")});
    EXPECT_THAT(files.getChildProjectFiles(folder.path(u"a")),
                ElementsAre(folder.path(u"a/b"), folder.path(u"a/d")));
    EXPECT_THAT(files.getChildProjectFiles(folder.path(u"unknown")), IsEmpty());
}

class AnsweringOtherwise : public FileManagerBase {
public:
    using FileManagerBase::FileManagerBase;

    bool isFileInProject(Path const& path) const override {
        return answer && FileManagerBase::isFileInProject(path);
    }

    std::vector<Path> getChildProjectFiles(Path const& path) const override {
        return path.native().ends_with(u"/added") ? std::vector<Path>{}
                                                  : std::vector<Path>{path / Path(u"added")};
    }

    bool answer = true;
};

TEST_F(FileManagerBaseTest, aSubclassMayOverrideWhetherTheRootIsInTheProject) {
    AnsweringOtherwise manager(folder.root(), store);
    EXPECT_THAT(manager.getProjectFiles(), ElementsAre(folder.path(u"added")));
    manager.answer = false;
    EXPECT_THAT(manager.getProjectFiles(), IsEmpty());
}

TEST_F(FileManagerBaseTest, removingAFolderReturnsTheFolderAndThenItsFiles) {
    files.add({folder.file(u"a/b"), folder.file(u"c")});

    auto const removed = files.remove({folder.path(u"a")});

    EXPECT_THAT(removed, ElementsAre(folder.path(u"a"), folder.path(u"a/b")));
    EXPECT_THAT(files.getProjectFiles(), ElementsAre(folder.path(u"c")));
}

TEST_F(FileManagerBaseTest, removingPassesOnlyTheGivenPathsToTheStore) {
    files.add({folder.file(u"a/b")});
    store->clear();

    files.remove({folder.path(u"a")});

    ASSERT_THAT(store->writes(), ElementsAre("removeNodes"));
    EXPECT_THAT(store->calls("removeNodes")[0].paths, ElementsAre(at(u"a")));
    EXPECT_EQ(store->calls("removeNodes")[0].guard, Guard::Write);
}

TEST_F(FileManagerBaseTest, removingTheRootIsRefusedAndChangesNothing) {
    files.add({folder.file(u"a")});
    EXPECT_RAISES(RootFolderNotRemoveable, (folder.root().native()), files.remove({folder.root()}));
    EXPECT_TRUE(files.isFileInProject(folder.path(u"a")));
}

TEST_F(FileManagerBaseTest, removingAPathThatIsNotInTheProjectIsRefusedAndChangesNothing) {
    files.add({folder.file(u"a")});
    store->clear();
    auto const unknown = folder.file(u"unknown");

    EXPECT_RAISES(FileNotInProject, (unknown.native()), files.remove({folder.path(u"a"), unknown}));

    EXPECT_TRUE(files.isFileInProject(folder.path(u"a")));
    EXPECT_THAT(store->writes(), IsEmpty());
}

TEST_F(FileManagerBaseTest, anEntryPointOfAnUnknownTypeRefusesEveryRemovalAndChangesNothing) {
    files.add({folder.file(u"a"), folder.file(u"b")});
    store->put(address({{u"EntryPoints", u"Root"}, {u"EntryPoint", u"e"}}),
               {{u"File", u"b"}, {u"Type", u"Unknown"}});
    store->clear();

    EXPECT_RAISES_NESTED(EntryPointTypeUndefined, (u"Unknown"), std::out_of_range,
                         files.remove({folder.path(u"a")}));

    EXPECT_TRUE(files.isFileInProject(folder.path(u"a")));
    EXPECT_THAT(store->writes(), IsEmpty());
}

TEST_F(FileManagerBaseTest, aFileThatWasDeletedFromTheDiskCanBeRemoved) {
    files.add({folder.file(u"a")});
    folder.remove(u"a");
    EXPECT_THAT(files.remove({folder.path(u"a")}), ElementsAre(folder.path(u"a")));
}

TEST_F(FileManagerBaseTest, theParentsOfARemovedFileStay) {
    files.add({folder.file(u"a/b")});
    files.remove({folder.path(u"a/b")});
    EXPECT_THAT(files.getProjectFiles(), ElementsAre(folder.path(u"a")));
}

TEST_F(FileManagerBaseTest, anEntryPointIsRemovedBeforeAnyNodeOfItsFile) {
    files.add({folder.file(u"a/start.m")});
    EntryPointDefinition start(folder.path(u"a/start.m"));
    entryPoints.setEntryPoint(start);
    store->clear();

    files.remove({folder.path(u"a")});

    auto const removed = store->calls("removeNodes");
    ASSERT_EQ(removed.size(), 2U);
    ASSERT_EQ(removed[0].paths.size(), 1U);
    EXPECT_EQ(removed[0].paths[0].getLeaf().getType(), u"EntryPoint");
    EXPECT_THAT(removed[1].paths, ElementsAre(at(u"a")));
    EXPECT_THAT(entryPoints.getEntryPoints(), IsEmpty());
}

TEST_F(FileManagerBaseTest, aFileIsRemovedFromEveryScope) {
    files.add({folder.file(u"a/b")});
    auto const other = files.getFileMetadataManagerFor(u"Other");
    other->setFileNodes(
        {{folder.path(u"a/b"), std::make_shared<metadata::MetadataNodeSpecification>(u"Info")}});
    store->clear();

    files.remove({folder.path(u"a")});

    EXPECT_FALSE(other->hasFileNode(folder.path(u"a/b")));
    EXPECT_THAT(store->writes(), ElementsAre("removeNodes", "removeNodes")); // one for each scope
}

TEST_F(FileManagerBaseTest, eachCallForAScopeReturnsANewManagerAndWritesNothing) {
    auto const first = files.getFileMetadataManagerFor(u"Root");
    auto const second = files.getFileMetadataManagerFor(u"Root");
    EXPECT_NE(first, second);
    EXPECT_THAT(store->calls(), IsEmpty());
    files.add({folder.file(u"a")});
    EXPECT_TRUE(first->hasFileNode(folder.path(u"a")));
}

TEST_F(FileManagerBaseTest, aFailingWriteReleasesTheLock) {
    store->failOn("setNodes", [] { throw std::runtime_error("disk full"); });
    EXPECT_THROW(files.add({folder.file(u"a")}), std::runtime_error);
    store->clear();
    files.isFileInProject(folder.path(u"a"));
    EXPECT_THAT(store->calls(), Contains(Field(&test::StoreCall::guard, Guard::None)));
}

} // namespace
} // namespace project::management
