#include "entrypoints/EntryPointManagerBase.hpp"

#include "entrypoints/EntryPointBase.hpp"
#include "entrypoints/EntryPointManagerFixture.hpp"

// Setting and removing entry points. EntryPointManagerReadingTest.cpp tests the queries.

namespace project::management {
namespace {

using test::ENTRY_POINTS;
using test::entryPointAt;
using test::Guard;
using testing::ElementsAre;
using testing::IsEmpty;

class EntryPointManagerBaseTest : public test::EntryPointManagerFixture {
protected:
    /// The UUID under which the only entry point is stored.
    std::u16string onlyUUID() {
        auto const uuids = locationsBelow(ENTRY_POINTS);
        EXPECT_EQ(uuids.size(), 1U);
        return uuids.empty() ? u"" : uuids.front();
    }
};

TEST_F(EntryPointManagerBaseTest, constructionDoesNotAccessTheStore) {
    EntryPointManagerBase const another(store, &files, root);
    EXPECT_THAT(store->calls(), IsEmpty());
}

TEST_F(EntryPointManagerBaseTest, aNewEntryPointIsStoredInOneWriteUnderANewUUID) {
    EntryPointDefinition entryPoint(projectFile(u"run.sh"));
    entryPoint.setName(u"Run").setType(EntryPointType::BatchJob).setVisible(false);
    entryPoints.setEntryPoint(entryPoint);

    EXPECT_THAT(store->writes(), ElementsAre("setNodes"));
    auto const uuid = onlyUUID();
    EXPECT_EQ(uuid.size(), 36U);
    EXPECT_THAT(store->calls("setNodes").at(0).paths, ElementsAre(entryPointAt(uuid)));
    EXPECT_EQ(store->content().getNode(entryPointAt(uuid))->getType(), u"Info");
    EXPECT_THAT(storedKeys(entryPointAt(uuid)),
                ElementsAre(u"File", u"GroupUUID", u"Name", u"Type", u"Visible"));
    EXPECT_EQ(stored(entryPointAt(uuid), u"File"), u"run.sh");
    EXPECT_EQ(stored(entryPointAt(uuid), u"Name"), u"Run");
    EXPECT_EQ(stored(entryPointAt(uuid), u"Type"), u"Batch_Job");
    EXPECT_EQ(stored(entryPointAt(uuid), u"Visible"), u"0");
    EXPECT_EQ(stored(entryPointAt(uuid), u"GroupUUID"), u"default");
}

TEST_F(EntryPointManagerBaseTest, theGeneratedUUIDIsNotSetInTheCallersObject) {
    EntryPointDefinition entryPoint(projectFile(u"run.sh"));
    entryPoints.setEntryPoint(entryPoint);
    EXPECT_EQ(entryPoint.getUUID(), u"");
}

TEST_F(EntryPointManagerBaseTest, aVisibleEntryPointIsStoredAsOne) {
    EntryPointDefinition entryPoint(projectFile(u"run.sh"));
    entryPoints.setEntryPoint(entryPoint);
    EXPECT_EQ(stored(entryPointAt(onlyUUID()), u"Visible"), u"1");
}

TEST_F(EntryPointManagerBaseTest, settingAFilesEntryPointTwiceLeavesOneNodeUnderTheFirstUUID) {
    EntryPointDefinition first(projectFile(u"run.sh"));
    first.setName(u"First").setExtensionData(u"args", u"-v");
    entryPoints.setEntryPoint(first);
    auto const uuid = onlyUUID();

    EntryPointDefinition second(root / u"run.sh");
    second.setName(u"Second");
    entryPoints.setEntryPoint(second);

    EXPECT_EQ(onlyUUID(), uuid);
    EXPECT_EQ(stored(entryPointAt(uuid), u"Name"), u"Second");
    EXPECT_THAT(store->content().getNode(entryPointAt(uuid))->getChildren(), IsEmpty());
}

TEST_F(EntryPointManagerBaseTest, theFirstOfSeveralEntryPointsOfAFileIsReplaced) {
    auto const file = projectFile(u"run.sh");
    putEntryPoint(u"a", u"other.sh");
    putEntryPoint(u"b", u"run.sh");
    putEntryPoint(u"c", u"run.sh");
    EntryPointDefinition entryPoint(file);
    entryPoint.setName(u"New");
    entryPoints.setEntryPoint(entryPoint);

    EXPECT_EQ(stored(entryPointAt(u"b"), u"Name"), u"New");
    EXPECT_EQ(stored(entryPointAt(u"c"), u"Name"), u"some name");
    EXPECT_EQ(store->calls("getNode").size(), 2U);
}

TEST_F(EntryPointManagerBaseTest, anEntryPointWithAUUIDIsWrittenThereWithoutACheckOfOthers) {
    auto const file = projectFile(u"run.sh");
    putEntryPoint(u"a", u"run.sh");
    EntryPointDefinition entryPoint(file);
    entryPoint.setUUID(u"b");
    entryPoints.setEntryPoint(entryPoint);

    EXPECT_THAT(store->calls("getNode"), IsEmpty());
    EXPECT_THAT(store->calls("getChildNodes"), IsEmpty());
    EXPECT_EQ(stored(entryPointAt(u"a"), u"File"), u"run.sh");
    EXPECT_EQ(stored(entryPointAt(u"b"), u"File"), u"run.sh");
}

TEST_F(EntryPointManagerBaseTest, anEntryPointWithAUUIDMovesItsNodeToAnotherFile) {
    putEntryPoint(u"a", u"old.sh");
    EntryPointDefinition entryPoint(projectFile(u"new.sh"));
    entryPoint.setUUID(u"a");
    entryPoints.setEntryPoint(entryPoint);
    EXPECT_EQ(onlyUUID(), u"a");
    EXPECT_EQ(stored(entryPointAt(u"a"), u"File"), u"new.sh");
}

TEST_F(EntryPointManagerBaseTest, aFileInASubfolderIsStoredWithSlashes) {
    EntryPointDefinition entryPoint(projectFile(u"a/b/run.sh"));
    entryPoints.setEntryPoint(entryPoint);
    EXPECT_EQ(stored(entryPointAt(onlyUUID()), u"File"), u"a/b/run.sh");
}

TEST_F(EntryPointManagerBaseTest, aBackslashIsStoredAsASlashAndLeadsElsewhereWhenRead) {
    EntryPointDefinition entryPoint(projectFile(u"a\\b.sh"));
    entryPoints.setEntryPoint(entryPoint);
    EXPECT_EQ(stored(entryPointAt(onlyUUID()), u"File"), u"a/b.sh");
    EXPECT_THAT(entryPoints.getEntryPoints(), IsEmpty());

    auto const other = projectFile(u"a/b.sh");
    ASSERT_EQ(entryPoints.getEntryPoints().size(), 1U);
    EXPECT_EQ(entryPoints.getEntryPoints().at(0)->getFile(), other);
}

TEST_F(EntryPointManagerBaseTest, anEntryPointWithoutAGroupIsReadBackInTheDefaultGroup) {
    EntryPointBase entryPoint(projectFile(u"run.sh"), EntryPointType::Basic, u"Run", u"a", true, nullptr, {});
    entryPoints.setEntryPoint(entryPoint);
    EXPECT_THAT(storedKeys(entryPointAt(u"a")), ElementsAre(u"File", u"Name", u"Type", u"Visible"));
    EXPECT_EQ(entryPoints.getEntryPoint(root / u"run.sh")->getGroup()->getUUID(), u"default");
}

TEST_F(EntryPointManagerBaseTest, aGroupThatIsNotStoredIsWrittenToo) {
    EntryPointDefinition entryPoint(projectFile(u"run.sh"));
    EntryPointGroupDefinition group(u"Nowhere", u"u1");
    entryPoint.setUUID(u"a").setGroup(group);
    entryPoints.setEntryPoint(entryPoint);
    EXPECT_EQ(stored(entryPointAt(u"a"), u"GroupUUID"), u"u1");
    EXPECT_EQ(entryPoints.getEntryPoint(root / u"run.sh")->getGroup(), nullptr);
}

TEST_F(EntryPointManagerBaseTest, aTypeThatIsUnknownHereIsWrittenWithAnEmptyName) {
    EntryPointDefinition entryPoint(projectFile(u"run.sh"));
    entryPoint.setUUID(u"a").setType(static_cast<EntryPointType>(9));
    entryPoints.setEntryPoint(entryPoint);
    EXPECT_THAT(storedKeys(entryPointAt(u"a")),
                ElementsAre(u"File", u"GroupUUID", u"Name", u"Type", u"Visible"));
    EXPECT_EQ(stored(entryPointAt(u"a"), u"Type"), u"");
}

TEST_F(EntryPointManagerBaseTest, extensionDataIsStoredAsNestedNodes) {
    EntryPointDefinition entryPoint(projectFile(u"run.sh"));
    entryPoint.setUUID(u"a").setExtensionData(u"b", u"2").setExtensionData(u"a", u"");
    entryPoints.setEntryPoint(entryPoint);

    auto const node = store->content().getNode(entryPointAt(u"a"));
    ASSERT_EQ(node->getChildren().size(), 2U);
    EXPECT_EQ(node->getChildren().at(0)->getType(), u"Extension");
    EXPECT_EQ(node->getChildren().at(0)->get(u"Name"), u"a");
    EXPECT_THAT(node->getChildren().at(0)->getKeys(), ElementsAre(u"Name", u"Value"));
    EXPECT_EQ(node->getChildren().at(1)->get(u"Name"), u"b");
    EXPECT_EQ(node->getChildren().at(1)->get(u"Value"), u"2");
}

TEST_F(EntryPointManagerBaseTest, anExtensionKeyWithoutDataIsStoredWithoutAValue) {
    struct WithoutData : EntryPointDefinition {
        using EntryPointDefinition::EntryPointDefinition;

        std::optional<std::u16string> getExtensionData(std::u16string const&) const override { return {}; }
    };

    WithoutData entryPoint(projectFile(u"run.sh"));
    entryPoint.setUUID(u"a").setExtensionData(u"key", u"value");
    entryPoints.setEntryPoint(entryPoint);

    auto const node = store->content().getNode(entryPointAt(u"a"));
    ASSERT_EQ(node->getChildren().size(), 1U);
    EXPECT_THAT(node->getChildren().at(0)->getKeys(), ElementsAre(u"Name"));
}

TEST_F(EntryPointManagerBaseTest, setEntryPointRefusesAFileOutsideTheProjectAndWritesNothing) {
    EntryPointDefinition entryPoint(root / u"run.sh");
    EXPECT_RAISES(FileNotInProject, (u"/project/run.sh"), entryPoints.setEntryPoint(entryPoint));
    EXPECT_THAT(store->writes(), IsEmpty());
    EXPECT_TRUE(store->isEmpty());
}

TEST_F(EntryPointManagerBaseTest, aFailedOperationHoldsNoGuardAfterwards) {
    EntryPointDefinition entryPoint(root / u"run.sh");
    EXPECT_RAISES(FileNotInProject, (u"/project/run.sh"), entryPoints.setEntryPoint(entryPoint));
    store->clear();
    entryPoints.getEntryPoints();
    EXPECT_EQ(store->calls().at(0).guard, Guard::None);
}

TEST_F(EntryPointManagerBaseTest, removeEntryPointRemovesAllOfThatFileInOneWrite) {
    auto const file = projectFile(u"run.sh");
    putEntryPoint(u"a", u"run.sh");
    putEntryPoint(u"b", u"other.sh");
    putEntryPoint(u"c", u"run.sh");
    entryPoints.removeEntryPoint(file);

    EXPECT_THAT(store->writes(), ElementsAre("removeNodes"));
    EXPECT_THAT(store->calls("removeNodes").at(0).paths, ElementsAre(entryPointAt(u"a"), entryPointAt(u"c")));
    EXPECT_THAT(locationsBelow(ENTRY_POINTS), ElementsAre(u"b"));
}

TEST_F(EntryPointManagerBaseTest, removeEntryPointOfAFileWithoutOneDoesNothing) {
    auto const file = projectFile(u"run.sh");
    putEntryPoint(u"b", u"other.sh");
    entryPoints.removeEntryPoint(file);
    EXPECT_THAT(store->writes(), IsEmpty());
}

TEST_F(EntryPointManagerBaseTest, removeEntryPointRefusesAFileOutsideTheProjectAlsoWhenItHasOne) {
    putEntryPoint(u"a", u"run.sh");
    EXPECT_RAISES(FileNotInProject, (u"/project/run.sh"), entryPoints.removeEntryPoint(root / u"run.sh"));
    EXPECT_THAT(store->writes(), IsEmpty());
    EXPECT_THAT(locationsBelow(ENTRY_POINTS), ElementsAre(u"a"));
}

TEST_F(EntryPointManagerBaseTest, changesHoldTheWriteGuardFromTheFirstStoreCallToTheLast) {
    auto const file = projectFile(u"run.sh");
    EntryPointDefinition entryPoint(file);
    EXPECT_THAT(guardsHeldBy([&] { entryPoints.setEntryPoint(entryPoint); }), ElementsAre(Guard::Write));
    EXPECT_THAT(guardsHeldBy([&] { entryPoints.removeEntryPoint(file); }), ElementsAre(Guard::Write));
}

TEST_F(EntryPointManagerBaseTest, exceptionsOfTheStorePropagate) {
    EntryPointDefinition entryPoint(projectFile(u"run.sh"));
    store->failOn("setNodes", [] { throw std::runtime_error("disk full"); });
    EXPECT_THROW(entryPoints.setEntryPoint(entryPoint), std::runtime_error);
    EXPECT_THAT(locationsBelow(ENTRY_POINTS), IsEmpty());
}

} // namespace
} // namespace project::management
