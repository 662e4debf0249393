#include "entrypoints/EntryPointGroupBase.hpp"
#include "entrypoints/EntryPointManagerBase.hpp"
#include "entrypoints/EntryPointManagerFixture.hpp"

namespace project::management {
namespace {

using test::groupAt;
using test::GROUPS;
using test::Guard;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::Pair;

using EntryPointManagerGroupsTest = test::EntryPointManagerFixture;

/// A manager that lists one group, which is not stored.
class OneGroupManager : public EntryPointManagerBase {
public:
    using EntryPointManagerBase::EntryPointManagerBase;

    std::vector<std::unique_ptr<EntryPointGroup>> getEntryPointGroups() override {
        std::vector<std::unique_ptr<EntryPointGroup>> result;
        result.push_back(std::make_unique<EntryPointGroupBase>(u"Only", u"only"));
        return result;
    }
};

TEST_F(EntryPointManagerGroupsTest, anEmptyStoreHasTheDefaultGroupOnly) {
    EXPECT_THAT(listedGroups(), ElementsAre(Pair(u"Default", u"default")));
    EXPECT_THAT(store->calls("getChildNodes"), IsEmpty());
    EXPECT_TRUE(store->isEmpty());
}

TEST_F(EntryPointManagerGroupsTest, theDefaultGroupIsFirstThenTheOthersInTheOrderOfTheStore) {
    putGroup(u"b", u"A");
    putGroup(u"a", u"B");
    EXPECT_THAT(listedGroups(),
                ElementsAre(Pair(u"Default", u"default"), Pair(u"B", u"a"), Pair(u"A", u"b")));
}

TEST_F(EntryPointManagerGroupsTest, addressesOfOtherTypesBelowTheHeadAreNotListed) {
    store->put(GROUPS.child({u"Other", u"x"}), {{u"Name", u"X"}});
    EXPECT_THAT(listedGroups(), ElementsAre(Pair(u"Default", u"default")));
}

TEST_F(EntryPointManagerGroupsTest, aNewGroupIsStoredInOneWriteWithItsNameOnly) {
    entryPoints.createEntryPointGroup(EntryPointGroupDefinition(u"Tools", u"g"));
    EXPECT_THAT(store->writes(), ElementsAre("setNodes"));
    EXPECT_THAT(store->calls("setNodes").at(0).paths, ElementsAre(groupAt(u"g")));
    EXPECT_EQ(store->content().getNode(groupAt(u"g"))->getType(), u"Info");
    EXPECT_THAT(storedKeys(groupAt(u"g")), ElementsAre(u"Name"));
    EXPECT_EQ(stored(groupAt(u"g"), u"Name"), u"Tools");
}

TEST_F(EntryPointManagerGroupsTest, aGroupWithoutAUUIDGetsOneThatOnlyTheListShows) {
    EntryPointGroupDefinition const group(u"Tools");
    entryPoints.createEntryPointGroup(group);
    EXPECT_EQ(group.getUUID(), u"");
    ASSERT_EQ(listedGroups().size(), 2U);
    EXPECT_EQ(listedGroups().at(1).first, u"Tools");
    EXPECT_EQ(listedGroups().at(1).second.size(), 36U);
}

TEST_F(EntryPointManagerGroupsTest, theDefaultGroupsNameIsInUseAlsoIfNothingIsStored) {
    EXPECT_RAISES(EntryPointGroupNameDefined, (u"Default"),
                  entryPoints.createEntryPointGroup(EntryPointGroupDefinition(u"Default")));
    EXPECT_THAT(store->writes(), IsEmpty());
    EXPECT_TRUE(store->isEmpty());
}

TEST_F(EntryPointManagerGroupsTest, theDefaultGroupsNameIsInUseAlsoIfTheListLacksIt) {
    OneGroupManager manager(store, &files, root);
    EXPECT_RAISES(EntryPointGroupNameDefined, (u"Default"),
                  manager.createEntryPointGroup(EntryPointGroupDefinition(u"Default")));
}

TEST_F(EntryPointManagerGroupsTest, theDefaultGroupsNameIsInUseAlsoAfterItWasRenamed) {
    putGroup(u"default", u"Mine");
    EXPECT_RAISES(EntryPointGroupNameDefined, (u"Default"),
                  entryPoints.createEntryPointGroup(EntryPointGroupDefinition(u"Default")));
    EXPECT_RAISES(EntryPointGroupNameDefined, (u"Mine"),
                  entryPoints.createEntryPointGroup(EntryPointGroupDefinition(u"Mine")));
}

TEST_F(EntryPointManagerGroupsTest, theDefaultGroupsUUIDIsInUse) {
    EXPECT_RAISES(EntryPointGroupUUIDDefined, (u"default"),
                  entryPoints.createEntryPointGroup(EntryPointGroupDefinition(u"New", u"default")));
    EXPECT_THAT(store->writes(), IsEmpty());
}

TEST_F(EntryPointManagerGroupsTest, aListedNameIsInUse) {
    putGroup(u"g", u"Tools");
    EXPECT_RAISES(EntryPointGroupNameDefined, (u"Tools"),
                  entryPoints.createEntryPointGroup(EntryPointGroupDefinition(u"Tools")));
    EXPECT_THAT(store->writes(), IsEmpty());
}

TEST_F(EntryPointManagerGroupsTest, namesDifferByLetterCase) {
    putGroup(u"g", u"Tools");
    entryPoints.createEntryPointGroup(EntryPointGroupDefinition(u"tools", u"h"));
    entryPoints.createEntryPointGroup(EntryPointGroupDefinition(u"default", u"i"));
    EXPECT_EQ(listedGroups().size(), 4U);
}

TEST_F(EntryPointManagerGroupsTest, aNameIsReportedBeforeTheUUIDOfTheSameGroup) {
    putGroup(u"g", u"Tools");
    EXPECT_RAISES(EntryPointGroupNameDefined, (u"Tools"),
                  entryPoints.createEntryPointGroup(EntryPointGroupDefinition(u"Tools", u"g")));
}

TEST_F(EntryPointManagerGroupsTest, theUUIDOfAnEarlyGroupIsReportedBeforeTheNameOfALaterOne) {
    putGroup(u"g", u"Tools");
    putGroup(u"h", u"Jobs");
    EXPECT_RAISES(EntryPointGroupUUIDDefined, (u"g"),
                  entryPoints.createEntryPointGroup(EntryPointGroupDefinition(u"Jobs", u"g")));
}

TEST_F(EntryPointManagerGroupsTest, theGroupsThatASubclassListsCount) {
    OneGroupManager manager(store, &files, root);
    putGroup(u"g", u"Tools");
    EXPECT_RAISES(EntryPointGroupNameDefined, (u"Only"),
                  manager.createEntryPointGroup(EntryPointGroupDefinition(u"Only")));
    EXPECT_RAISES(EntryPointGroupNameDefined, (u"Only"),
                  manager.renameEntryPointGroup(EntryPointGroupDefinition(u"", u"g"), u"Only"));
    manager.createEntryPointGroup(EntryPointGroupDefinition(u"Tools", u"h"));
    EXPECT_EQ(stored(groupAt(u"h"), u"Name"), u"Tools");

    auto const file = projectFile(u"run.sh");
    putEntryPoint(u"a", u"run.sh", {{u"GroupUUID", u"only"}});
    EXPECT_EQ(manager.getEntryPoint(file)->getGroup()->getName(), u"Only");
}

TEST_F(EntryPointManagerGroupsTest, renamingWritesTheNewNameInOneWrite) {
    putGroup(u"g", u"Tools");
    entryPoints.renameEntryPointGroup(EntryPointGroupDefinition(u"Tools", u"g"), u"Jobs");
    EXPECT_THAT(store->writes(), ElementsAre("setNodes"));
    EXPECT_THAT(store->calls("setNodes").at(0).paths, ElementsAre(groupAt(u"g")));
    EXPECT_EQ(store->content().getNode(groupAt(u"g"))->getType(), u"Info");
    EXPECT_THAT(listedGroups(), ElementsAre(Pair(u"Default", u"default"), Pair(u"Jobs", u"g")));
}

TEST_F(EntryPointManagerGroupsTest, renamingToTheGroupsOwnNameDoesNothing) {
    putGroup(u"g", u"Tools");
    entryPoints.renameEntryPointGroup(EntryPointGroupDefinition(u"whatever", u"g"), u"Tools");
    EXPECT_THAT(store->writes(), IsEmpty());
    EXPECT_EQ(stored(groupAt(u"g"), u"Name"), u"Tools");
}

TEST_F(EntryPointManagerGroupsTest, renamingToTheNameOfAnotherGroupIsAnError) {
    putGroup(u"g", u"Tools");
    putGroup(u"h", u"Jobs");
    EntryPointGroupDefinition const group(u"Tools", u"g");
    EXPECT_RAISES(EntryPointGroupNameDefined, (u"Jobs"), entryPoints.renameEntryPointGroup(group, u"Jobs"));
    EXPECT_RAISES(EntryPointGroupNameDefined, (u"Default"),
                  entryPoints.renameEntryPointGroup(group, u"Default"));
    EXPECT_THAT(store->writes(), IsEmpty());
}

TEST_F(EntryPointManagerGroupsTest, renamingWithoutAUUIDDoesNothingAlsoForANameInUse) {
    putGroup(u"g", u"Tools");
    entryPoints.renameEntryPointGroup(EntryPointGroupDefinition(u"Jobs"), u"Tools");
    entryPoints.renameEntryPointGroup(EntryPointGroupDefinition(u"Tools"), u"New");
    EXPECT_THAT(store->writes(), IsEmpty());
    EXPECT_THAT(listedGroups(), ElementsAre(Pair(u"Default", u"default"), Pair(u"Tools", u"g")));
}

TEST_F(EntryPointManagerGroupsTest, renamingAGroupThatIsNotStoredCreatesIt) {
    entryPoints.renameEntryPointGroup(EntryPointGroupDefinition(u"ignored", u"g"), u"Tools");
    EXPECT_THAT(listedGroups(), ElementsAre(Pair(u"Default", u"default"), Pair(u"Tools", u"g")));
}

TEST_F(EntryPointManagerGroupsTest, theDefaultGroupIsListedTwiceOnceItWasRenamed) {
    entryPoints.renameEntryPointGroup(*getDefaultGroup(), u"Mine");
    EXPECT_THAT(listedGroups(), ElementsAre(Pair(u"Default", u"default"), Pair(u"Mine", u"default")));
    EXPECT_THAT(locationsBelow(GROUPS), ElementsAre(u"default"));

    auto const file = projectFile(u"run.sh");
    EntryPointDefinition entryPoint(file);
    entryPoints.setEntryPoint(entryPoint);
    EXPECT_EQ(entryPoints.getEntryPoint(file)->getGroup()->getName(), u"Mine");
}

TEST_F(EntryPointManagerGroupsTest, renamingTheDefaultGroupToItsOwnNameDoesNothing) {
    entryPoints.renameEntryPointGroup(*getDefaultGroup(), u"Default");
    EXPECT_THAT(store->writes(), IsEmpty());
}

TEST_F(EntryPointManagerGroupsTest, deletingAGroupRemovesItsNodeInOneWrite) {
    putGroup(u"g", u"Tools");
    putGroup(u"h", u"Jobs");
    entryPoints.deleteEntryPointGroup(EntryPointGroupDefinition(u"another name", u"g"));
    EXPECT_THAT(store->writes(), ElementsAre("removeNodes"));
    EXPECT_THAT(store->calls("removeNodes").at(0).paths, ElementsAre(groupAt(u"g")));
    EXPECT_THAT(listedGroups(), ElementsAre(Pair(u"Default", u"default"), Pair(u"Jobs", u"h")));
}

TEST_F(EntryPointManagerGroupsTest, deletingKeepsAddressesOfOtherTypes) {
    store->put(GROUPS.child({u"Other", u"g"}), {});
    entryPoints.deleteEntryPointGroup(EntryPointGroupDefinition(u"", u"g"));
    EXPECT_THAT(locationsBelow(GROUPS), ElementsAre(u"g"));
}

TEST_F(EntryPointManagerGroupsTest, deletingAnUnknownGroupRemovesNothing) {
    putGroup(u"g", u"Tools");
    entryPoints.deleteEntryPointGroup(EntryPointGroupDefinition(u"Tools", u"other"));
    ASSERT_EQ(store->calls("removeNodes").size(), 1U);
    EXPECT_THAT(store->calls("removeNodes").at(0).paths, IsEmpty());
    EXPECT_EQ(listedGroups().size(), 2U);
}

TEST_F(EntryPointManagerGroupsTest, deletingFromAStoreWithoutGroupsRemovesNothing) {
    entryPoints.deleteEntryPointGroup(EntryPointGroupDefinition(u"Tools", u"g"));
    EXPECT_THAT(store->operations(), ElementsAre("getChildNodes", "removeNodes"));
    EXPECT_THAT(store->calls("removeNodes").at(0).paths, IsEmpty());
    EXPECT_TRUE(store->isEmpty());
}

TEST_F(EntryPointManagerGroupsTest, deletingTheDefaultGroupOnlyUndoesItsRenaming) {
    putGroup(u"default", u"Mine");
    entryPoints.deleteEntryPointGroup(*getDefaultGroup());
    EXPECT_THAT(listedGroups(), ElementsAre(Pair(u"Default", u"default")));
    entryPoints.deleteEntryPointGroup(*getDefaultGroup());
    EXPECT_THAT(listedGroups(), ElementsAre(Pair(u"Default", u"default")));
}

TEST_F(EntryPointManagerGroupsTest, changesHoldTheWriteGuardFromTheFirstStoreCallToTheLast) {
    EntryPointGroupDefinition const group(u"Tools", u"g");
    EXPECT_THAT(guardsHeldBy([&] { entryPoints.createEntryPointGroup(group); }), ElementsAre(Guard::Write));
    EXPECT_THAT(guardsHeldBy([&] { entryPoints.renameEntryPointGroup(group, u"Jobs"); }),
                ElementsAre(Guard::Write));
    EXPECT_THAT(guardsHeldBy([&] { entryPoints.deleteEntryPointGroup(group); }), ElementsAre(Guard::Write));
}

} // namespace
} // namespace project::management
