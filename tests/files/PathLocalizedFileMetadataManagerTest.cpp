#include "files/PathLocalizedFileMetadataManager.hpp"

#include <optional>

#include <gmock/gmock.h>
#include <rapidcheck/gtest.h>

#include "project/metadata/Messages.hpp"
#include "project/metadata/MetadataNodeSpecification.hpp"
#include "support/ErrorMatchers.hpp"
#include "support/RecordingMetadataManager.hpp"
#include "support/TemporaryFolder.hpp"

namespace project::management {
namespace {

using metadata::MetadataNodeSpecification;
using metadata::MetadataPath;
using test::address;
using testing::ElementsAre;
using testing::IsEmpty;
using ZEPHRA::project::management::FileNotInProject;
using Nodes = std::map<Path, std::shared_ptr<metadata::MetadataNode>>;
using Guard = test::StoreCall::Guard;

class PathLocalizedFileMetadataManagerTest : public testing::Test {
protected:
    std::shared_ptr<metadata::MetadataNode> node() const {
        return std::make_shared<MetadataNodeSpecification>(u"Info");
    }

    PathLocalizedFileMetadataManager manager(std::u16string const& scope = u"Root") const {
        return {folder.root(), store, scope};
    }

    test::TemporaryFolder folder;
    std::shared_ptr<test::RecordingMetadataManager> store =
        std::make_shared<test::RecordingMetadataManager>();
    PathLocalizedFileMetadataManager files{folder.root(), store, u"Root"};
    PathLocalizedFileMetadataManager plain{u"/root", store, u"Root"};
    MetadataPath const head = address({{u"Files", u"Root"}});
};

TEST_F(PathLocalizedFileMetadataManagerTest, constructionDoesNotAccessTheStore) {
    manager();
    EXPECT_THAT(store->calls(), IsEmpty());
}

TEST_F(PathLocalizedFileMetadataManagerTest, theRootHasTheAddressOfTheScope) {
    EXPECT_EQ(files.toMetadataPath(folder.root()), head);
    EXPECT_EQ(files.toFilePath(head), folder.root());
}

TEST_F(PathLocalizedFileMetadataManagerTest, theRootInAnotherFormHasTheAddressOfTheScopeToo) {
    EXPECT_EQ(files.toMetadataPath(folder.root().native() + u"/"), head);
}

TEST_F(PathLocalizedFileMetadataManagerTest, aFilesAddressHasOneStepForEachNameInBothDirections) {
    auto const path = folder.path(u"c1/c2");
    auto const expected = address({{u"Files", u"Root"}, {u"File", u"c1"}, {u"File", u"c2"}});
    EXPECT_EQ(files.toMetadataPath(path), expected);
    EXPECT_EQ(files.toFilePath(expected), path);
}

RC_GTEST_FIXTURE_PROP(PathLocalizedFileMetadataManagerTest, anAddressDoesNotDependOnThePreviousOne, ()) {
    auto const name = rc::gen::element<std::u16string>(u"a", u"ab", u"b", u"..");
    auto const names = rc::gen::container<std::vector<std::u16string>>(name);
    auto const paths = *rc::gen::container<std::vector<std::vector<std::u16string>>>(names);
    std::optional<MetadataPath> kept; // shares steps with the next one
    for (auto const& path : paths) {
        Path file(u"/root");
        MetadataPath expected = head;
        for (auto const& step : path) {
            file /= step;
            expected = expected.child({u"File", step});
        }
        auto const address = plain.toMetadataPath(file);
        RC_ASSERT(address == expected);
        kept = path.size() % 2 == 0 ? std::optional(address) : std::nullopt;
    }
}

TEST_F(PathLocalizedFileMetadataManagerTest, anAddressHasAPathWithStepsOfAnyType) {
    EXPECT_EQ(files.toFilePath(head.child({u"Other", u"a"}).child({u"File", u""}).child({u"File", u"b"})),
              folder.path(u"a/b"));
}

TEST_F(PathLocalizedFileMetadataManagerTest, conversionDoesNotAccessTheStore) {
    files.toFilePath(files.toMetadataPath(folder.path(u"a")));
    EXPECT_THAT(store->calls(), IsEmpty());
}

TEST_F(PathLocalizedFileMetadataManagerTest, aFolderOnDiskIsStoredWithItsMarker) {
    files.setFileNodes(Nodes{{folder.folder(u"src"), node()}});

    auto const written = store->calls("setNodes");
    ASSERT_EQ(written.size(), 1U);
    auto const path = head.child({u"File", u"src"});
    EXPECT_THAT(written[0].paths, ElementsAre(path, path.child({u"DIR_SIGNIFIER", u"1"})));
    auto const marker = store->content().getNode(path.child({u"DIR_SIGNIFIER", u"1"}));
    EXPECT_EQ(marker->getType(), u"Info");
    EXPECT_THAT(marker->getKeys(), IsEmpty());
    EXPECT_THAT(marker->getChildren(), IsEmpty());
}

TEST_F(PathLocalizedFileMetadataManagerTest, aFileOrADeletedFolderIsStoredWithoutAMarker) {
    files.setFileNodes(Nodes{{folder.file(u"file"), node()}, {folder.path(u"gone"), node()}});

    EXPECT_THAT(store->calls("setNodes").at(0).paths,
                ElementsAre(head.child({u"File", u"file"}), head.child({u"File", u"gone"})));
}

TEST_F(PathLocalizedFileMetadataManagerTest, anEmptyBatchIsWrittenToo) {
    files.setFileNodes({});
    files.removeFileNodes({});

    EXPECT_THAT(store->writes(), ElementsAre("setNodes", "removeNodes"));
    EXPECT_THAT(store->calls("setNodes")[0].paths, IsEmpty());
    EXPECT_THAT(store->calls("removeNodes")[0].paths, IsEmpty());
}

TEST_F(PathLocalizedFileMetadataManagerTest, aBatchIsOneWriteUnderTheWriteLock) {
    files.setFileNodes(Nodes{{folder.file(u"a"), node()}, {folder.file(u"b"), node()}});

    ASSERT_THAT(store->writes(), ElementsAre("setNodes"));
    EXPECT_EQ(store->calls("setNodes")[0].guard, Guard::Write);
}

TEST_F(PathLocalizedFileMetadataManagerTest, addFileNodeReplacesAnEntryOfTheBatch) {
    std::map<MetadataPath, std::shared_ptr<metadata::MetadataNode>> batch;
    auto const second = node();
    files.addFileNode(folder.path(u"a"), node(), batch);
    files.addFileNode(folder.path(u"a"), second, batch);

    ASSERT_EQ(batch.size(), 1U);
    EXPECT_EQ(batch.begin()->second, second);
}

TEST_F(PathLocalizedFileMetadataManagerTest, aNodeIsReadBackAsItWasStored) {
    auto const stored = node();
    stored->put(u"key", u"value");
    files.setFileNodes(Nodes{{folder.path(u"a"), stored}});

    EXPECT_EQ(files.getFileNode(folder.path(u"a"))->get(u"key"), u"value");
}

TEST_F(PathLocalizedFileMetadataManagerTest, aFileWithoutANodeIsReportedByItsPath) {
    auto const path = folder.path(u"missing");
    EXPECT_FALSE(files.hasFileNode(path));
    EXPECT_RAISES(FileNotInProject, (path.native()), files.getFileNode(path));
}

TEST_F(PathLocalizedFileMetadataManagerTest, theRootHasANodeOnceItIsStored) {
    EXPECT_FALSE(files.hasFileNode(folder.root()));
    files.setFileNodes(Nodes{{folder.root(), node()}});
    EXPECT_TRUE(files.hasFileNode(folder.root()));
}

TEST_F(PathLocalizedFileMetadataManagerTest, aNodeWithAStepOfAnotherTypeIsNotAFile) {
    auto const other = head.child({u"LabelData", u"Data"});
    store->put(other, {});
    EXPECT_FALSE(files.isFileMetadataPath(other));
    EXPECT_FALSE(files.isFileMetadataPath(head));
}

TEST_F(PathLocalizedFileMetadataManagerTest, onlyTheAddressesOfTheGivenFilesAreRemoved) {
    files.setFileNodes(Nodes{{folder.folder(u"src"), node()}, {folder.file(u"src/a"), node()}});
    store->clear();

    files.removeFileNodes({folder.path(u"src"), folder.path(u"never")});

    EXPECT_THAT(store->calls("removeNodes").at(0).paths,
                ElementsAre(head.child({u"File", u"src"}), head.child({u"File", u"never"})));
    EXPECT_TRUE(store->isEmpty());
}

TEST_F(PathLocalizedFileMetadataManagerTest, theChildrenOfAFolderAreItsDirectFilesWithoutTheMarker) {
    files.setFileNodes(Nodes{{folder.folder(u"src"), node()},
                             {folder.file(u"src/b"), node()},
                             {folder.folder(u"src/a"), node()},
                             {folder.file(u"src/a/deep"), node()}});
    store->put(files.toMetadataPath(folder.path(u"src")).child({u"LabelData", u"Data"}), {});

    EXPECT_THAT(files.getChildFiles(folder.path(u"src")),
                ElementsAre(folder.path(u"src/a"), folder.path(u"src/b")));
}

TEST_F(PathLocalizedFileMetadataManagerTest, anUnknownPathHasNoChildren) {
    EXPECT_THAT(files.getChildFiles(folder.path(u"unknown")), IsEmpty());
}

TEST_F(PathLocalizedFileMetadataManagerTest, allFileNodesAreListedAtAnyDepthAndNothingElse) {
    files.setFileNodes(
        Nodes{{folder.root(), node()}, {folder.folder(u"src"), node()}, {folder.file(u"src/a"), node()}});
    store->put(files.toMetadataPath(folder.path(u"src/a")).child({u"LabelData", u"Data"}), {});
    store->put(head.child({u"Other", u"x"}).child({u"File", u"y"}), {});

    std::vector<Path> listed;
    for (auto const& [path, content] : files.getAllFileNodes()) {
        EXPECT_NE(content, nullptr);
        listed.push_back(path);
    }

    EXPECT_THAT(listed,
                ElementsAre(folder.root(), folder.path(u"src"), folder.path(u"src/a"), folder.path(u"x/y")));
}

TEST_F(PathLocalizedFileMetadataManagerTest, allFileNodesAreReadUnderOneReadLockWithOneCallForEachAddress) {
    files.setFileNodes(Nodes{{folder.file(u"a"), node()}, {folder.file(u"b"), node()}});
    store->clear();

    files.getAllFileNodes();

    EXPECT_EQ(store->calls("getChildNodes").size(), 3U);
    EXPECT_EQ(store->calls("getNode").size(), 2U);
    EXPECT_EQ(store->calls("acquireReadLock").at(0).guard, Guard::None);
    for (auto const& call : store->calls("getNode")) {
        EXPECT_EQ(call.guard, Guard::Read);
    }
}

TEST_F(PathLocalizedFileMetadataManagerTest, anEmptyScopeHasNoFileNodesAndItsChildrenAreNotRead) {
    EXPECT_THAT(files.getAllFileNodes(), IsEmpty());
    EXPECT_THAT(store->operations(), ElementsAre("pathExists"));
}

TEST_F(PathLocalizedFileMetadataManagerTest, extraEntriesAreAlwaysEmptyAndDoNotAccessTheStore) {
    EXPECT_THAT(files.getExtraEntries(), IsEmpty());
    EXPECT_THAT(store->calls(), IsEmpty());
}

TEST_F(PathLocalizedFileMetadataManagerTest, scopesDoNotSeeEachOthersFiles) {
    auto other = manager(u"Other");
    files.setFileNodes(Nodes{{folder.path(u"a"), node()}});

    EXPECT_FALSE(other.hasFileNode(folder.path(u"a")));
    EXPECT_THAT(other.getAllFileNodes(), IsEmpty());
    EXPECT_TRUE(files.hasFileNode(folder.path(u"a")));
}

TEST_F(PathLocalizedFileMetadataManagerTest, anExceptionOfTheStorePropagatesAndNothingIsWritten) {
    store->failOn("setNodes", [] { throw std::runtime_error("disk full"); });
    EXPECT_THROW(files.setFileNodes(Nodes{{folder.path(u"a"), node()}}), std::runtime_error);
    EXPECT_TRUE(store->isEmpty());
}

} // namespace
} // namespace project::management
