#include <algorithm>
#include <stdexcept>

#include "entrypoints/EntryPointManagerBase.hpp"
#include "entrypoints/EntryPointManagerFixture.hpp"

namespace project::management {
namespace {

using metadata::MetadataNode;
using metadata::MetadataNodeSpecification;
using metadata::MetadataPath;
using test::ENTRY_POINTS;
using test::entryPointAt;
using test::GROUPS;
using test::Guard;
using testing::ElementsAre;
using testing::IsEmpty;

class EntryPointManagerReadingTest : public test::EntryPointManagerFixture {
protected:
    /// Stores an entry point of "run.sh" with the given nested nodes, each with its type, "Name" and, if it
    /// is not null, "Value".
    struct Nested {
        char16_t const* type;
        char16_t const* name;
        char16_t const* value;
    };

    void putWithNested(std::vector<Nested> const& nested) {
        auto const node = std::make_shared<MetadataNodeSpecification>(u"Info");
        node->put(u"File", u"run.sh");
        node->put(u"Type", u"Basic");
        for (auto const& [type, name, value] : nested) {
            auto* const child = node->addChild(type);
            child->put(u"Name", name);
            if (value != nullptr) {
                child->put(u"Value", value);
            }
        }
        std::map<MetadataPath, std::shared_ptr<MetadataNode>> batch{{entryPointAt(u"a"), node}};
        store->content().setNodes(batch);
    }

    bool isVisibleWith(std::map<std::u16string, std::u16string> const& values) {
        putEntryPoint(u"a", u"run.sh", values);
        return entryPoints.getEntryPoint(projectFile(u"run.sh"))->isVisible();
    }

    std::size_t callsAt(std::string const& operation, MetadataPath const& path) const {
        auto const calls = store->calls(operation);
        return static_cast<std::size_t>(std::count_if(
            calls.begin(), calls.end(), [&](auto const& call) { return call.paths.front() == path; }));
    }
};

TEST_F(EntryPointManagerReadingTest, anEmptyStoreHasNoEntryPointsAndItsChildrenAreNotRead) {
    EXPECT_THAT(entryPoints.getEntryPoints(), IsEmpty());
    EXPECT_THAT(store->calls("getChildNodes"), IsEmpty());
    EXPECT_THAT(store->writes(), IsEmpty());
    EXPECT_TRUE(store->isEmpty());
}

TEST_F(EntryPointManagerReadingTest, aFileWithoutAnEntryPointHasADefinitionAndStoresNothing) {
    auto const entryPoint = entryPoints.getEntryPoint(projectFile(u"a/run.sh"));
    ASSERT_NE(entryPoint, nullptr);
    EXPECT_EQ(entryPoint->getFile(), root / u"a/run.sh");
    EXPECT_EQ(entryPoint->getName(), u"run");
    EXPECT_EQ(entryPoint->getUUID(), u"");
    EXPECT_EQ(entryPoint->getType(), EntryPointType::Basic);
    EXPECT_EQ(entryPoint->getGroup()->getUUID(), u"default");
    EXPECT_THAT(store->writes(), IsEmpty());
    EXPECT_FALSE(store->content().pathExists(ENTRY_POINTS));
}

TEST_F(EntryPointManagerReadingTest, aFileOutsideTheProjectWithoutAnEntryPointHasADefinitionToo) {
    auto const entryPoint = entryPoints.getEntryPoint(u"/elsewhere/run.sh");
    ASSERT_NE(entryPoint, nullptr);
    EXPECT_EQ(entryPoint->getFile(), Path(u"/elsewhere/run.sh"));
    EXPECT_EQ(entryPoint->getUUID(), u"");
    EXPECT_THAT(store->calls("hasNode"), IsEmpty());
}

TEST_F(EntryPointManagerReadingTest, allPropertiesAreReadAsTheyWereSet) {
    auto const file = projectFile(u"a/run.sh");
    putGroup(u"g", u"Tools");
    EntryPointDefinition written(file);
    EntryPointGroupDefinition group(u"another name", u"g");
    written.setUUID(u"x").setName(u"Run").setType(EntryPointType::Shutdown).setVisible(false).setGroup(group);
    written.setExtensionData(u"args", u"-v").setExtensionData(u"empty", u"");
    entryPoints.setEntryPoint(written);

    auto const read = entryPoints.getEntryPoint(file);
    EXPECT_EQ(read->getFile(), file);
    EXPECT_EQ(read->getUUID(), u"x");
    EXPECT_EQ(read->getName(), u"Run");
    EXPECT_EQ(read->getType(), EntryPointType::Shutdown);
    EXPECT_FALSE(read->isVisible());
    EXPECT_EQ(read->getGroup()->getUUID(), u"g");
    EXPECT_EQ(read->getGroup()->getName(), u"Tools");
    EXPECT_THAT(read->getExtensionKeys(), ElementsAre(u"args", u"empty"));
    EXPECT_EQ(read->getExtensionData(u"args"), u"-v");
}

TEST_F(EntryPointManagerReadingTest, theListIsInTheOrderOfTheStore) {
    for (auto const* file : {u"1.sh", u"2.sh", u"3.sh"}) {
        projectFile(file);
    }
    putEntryPoint(u"c", u"1.sh", {{u"Name", u"A"}});
    putEntryPoint(u"b", u"2.sh", {{u"Name", u"C"}});
    putEntryPoint(u"a", u"3.sh", {{u"Name", u"B"}});
    EXPECT_THAT(listedUUIDs(), ElementsAre(u"a", u"b", u"c"));
}

TEST_F(EntryPointManagerReadingTest, addressesOfAnyTypeBelowTheHeadAreRead) {
    auto const file = projectFile(u"run.sh");
    store->put(ENTRY_POINTS.child({u"Other", u"x"}), {{u"File", u"run.sh"}, {u"Type", u"Basic"}});
    EXPECT_THAT(listedUUIDs(), ElementsAre(u"x"));
    EXPECT_EQ(callsAt("getNode", ENTRY_POINTS.child({u"Other", u"x"})), 1U);
}

TEST_F(EntryPointManagerReadingTest, anEntryPointWhoseFileIsNotInTheProjectIsHiddenAndStays) {
    projectFile(u"run.sh");
    putEntryPoint(u"a", u"gone.sh");
    putEntryPoint(u"b", u"run.sh");
    EXPECT_THAT(listedUUIDs(), ElementsAre(u"b"));
    EXPECT_EQ(entryPoints.getEntryPoint(root / u"gone.sh"), nullptr);
    EXPECT_THAT(store->writes(), IsEmpty());
    EXPECT_THAT(locationsBelow(ENTRY_POINTS), ElementsAre(u"a", u"b"));
}

TEST_F(EntryPointManagerReadingTest, anUnknownTypeOfAFileThatIsNotInTheProjectIsNotAnError) {
    putEntryPoint(u"a", u"gone.sh", {{u"Type", u"Other"}});
    EXPECT_THAT(listedUUIDs(), IsEmpty());
    EXPECT_EQ(entryPoints.getEntryPoint(root / u"gone.sh"), nullptr);
}

TEST_F(EntryPointManagerReadingTest, anUnknownTypeOfAProjectFileFailsTheWholeCall) {
    auto const file = projectFile(u"run.sh");
    auto const other = projectFile(u"other.sh");
    putEntryPoint(u"a", u"other.sh");
    putEntryPoint(u"b", u"run.sh", {{u"Type", u"Other"}});
    EXPECT_RAISES_NESTED(EntryPointTypeUndefined, (u"Other"), std::out_of_range,
                         entryPoints.getEntryPoints());
    EXPECT_RAISES_NESTED(EntryPointTypeUndefined, (u"Other"), std::out_of_range,
                         entryPoints.getEntryPoint(file));
    EXPECT_EQ(entryPoints.getEntryPoint(other)->getUUID(), u"a");
}

TEST_F(EntryPointManagerReadingTest, olderSpellingsOfTypesAreReadAndWrittenAnew) {
    auto const file = projectFile(u"run.sh");
    putEntryPoint(u"a", u"run.sh", {{u"Type", u"Batch Job"}});
    auto const read = entryPoints.getEntryPoint(file);
    EXPECT_EQ(read->getType(), EntryPointType::BatchJob);
    entryPoints.setEntryPoint(*read);
    EXPECT_EQ(stored(entryPointAt(u"a"), u"Type"), u"Batch_Job");
}

TEST_F(EntryPointManagerReadingTest, onlyAZeroHidesAnEntryPoint) {
    EXPECT_TRUE(isVisibleWith({{u"Visible", u"1"}}));
    EXPECT_FALSE(isVisibleWith({{u"Visible", u"0"}}));
    EXPECT_TRUE(isVisibleWith({{u"Visible", u"false"}}));
    EXPECT_TRUE(isVisibleWith({{u"Visible", u""}}));
    EXPECT_TRUE(isVisibleWith({}));
}

TEST_F(EntryPointManagerReadingTest, anAbsentOrEmptyGroupIsTheDefaultGroup) {
    auto const file = projectFile(u"run.sh");
    putEntryPoint(u"a", u"run.sh");
    EXPECT_EQ(entryPoints.getEntryPoint(file)->getGroup()->getUUID(), u"default");
    putEntryPoint(u"a", u"run.sh", {{u"GroupUUID", u""}});
    EXPECT_EQ(entryPoints.getEntryPoint(file)->getGroup()->getName(), u"Default");
}

TEST_F(EntryPointManagerReadingTest, anEntryPointOfADeletedGroupHasNoneAndKeepsItsStoredUUID) {
    auto const file = projectFile(u"run.sh");
    putGroup(u"g", u"Tools");
    putEntryPoint(u"a", u"run.sh", {{u"GroupUUID", u"g"}});
    ASSERT_EQ(entryPoints.getEntryPoint(file)->getGroup()->getName(), u"Tools");

    entryPoints.deleteEntryPointGroup(EntryPointGroupDefinition(u"Tools", u"g"));
    EXPECT_EQ(entryPoints.getEntryPoint(file)->getGroup(), nullptr);
    EXPECT_EQ(entryPoints.getEntryPoints().at(0)->getGroup(), nullptr);
    EXPECT_EQ(stored(entryPointAt(u"a"), u"GroupUUID"), u"g");
}

TEST_F(EntryPointManagerReadingTest, writingAnEntryPointOfADeletedGroupMovesItToTheDefaultGroup) {
    auto const file = projectFile(u"run.sh");
    putEntryPoint(u"a", u"run.sh", {{u"GroupUUID", u"g"}});
    entryPoints.setEntryPoint(*entryPoints.getEntryPoint(file));
    EXPECT_THAT(storedKeys(entryPointAt(u"a")), ElementsAre(u"File", u"Name", u"Type", u"Visible"));
    EXPECT_EQ(entryPoints.getEntryPoint(file)->getGroup()->getUUID(), u"default");
}

TEST_F(EntryPointManagerReadingTest, entryPointsOfTheDefaultGroupShowTheNameThatItWasGiven) {
    auto const file = projectFile(u"run.sh");
    putEntryPoint(u"a", u"run.sh");
    putGroup(u"default", u"Mine");
    auto const group = entryPoints.getEntryPoint(file)->getGroup();
    EXPECT_EQ(group->getName(), u"Mine");
    EXPECT_EQ(group->getUUID(), u"default");
}

TEST_F(EntryPointManagerReadingTest, theLaterOfTwoExtensionsWithOneNameCounts) {
    auto const file = projectFile(u"run.sh");
    putWithNested({{u"Extension", u"key", u"first"}, {u"Extension", u"key", u"second"}});
    EXPECT_EQ(entryPoints.getEntryPoint(file)->getExtensionData(u"key"), u"second");
}

TEST_F(EntryPointManagerReadingTest, anExtensionWithoutAValueHasAnEmptyOne) {
    auto const file = projectFile(u"run.sh");
    putWithNested({{u"Extension", u"key", u"first"}, {u"Extension", u"key", nullptr}});
    EXPECT_EQ(entryPoints.getEntryPoint(file)->getExtensionData(u"key"), u"");
}

TEST_F(EntryPointManagerReadingTest, nestedNodesOfAnotherTypeAreNotExtensions) {
    auto const file = projectFile(u"run.sh");
    putWithNested({{u"Other", u"key", u"value"}});
    EXPECT_THAT(entryPoints.getEntryPoint(file)->getExtensionKeys(), IsEmpty());
}

TEST_F(EntryPointManagerReadingTest, anExtensionSurvivesReadingAndWriting) {
    auto const file = projectFile(u"run.sh");
    // Lone surrogates are text like any other.
    putWithNested({{u"Extension", u"key \xD800", u"value \xDC00"}});
    entryPoints.setEntryPoint(*entryPoints.getEntryPoint(file));
    auto const read = entryPoints.getEntryPoint(file);
    EXPECT_THAT(read->getExtensionKeys(), ElementsAre(u"key \xD800"));
    EXPECT_EQ(read->getExtensionData(u"key \xD800"), u"value \xDC00");
}

TEST_F(EntryPointManagerReadingTest, anEmptyFileIsTheProjectRoot) {
    putEntryPoint(u"a", u"");
    ASSERT_EQ(entryPoints.getEntryPoints().size(), 1U);
    EXPECT_EQ(entryPoints.getEntryPoints().at(0)->getFile(), root);
    EXPECT_EQ(entryPoints.getEntryPoint(root)->getUUID(), u"a");
}

TEST_F(EntryPointManagerReadingTest, aFileIsFoundByTheExactTextThatIsStored) {
    projectFile(u"run.sh");
    putEntryPoint(u"a", u"./run.sh");
    putEntryPoint(u"b", u"RUN.sh");
    EXPECT_EQ(entryPoints.getEntryPoint(root / u"run.sh")->getUUID(), u"");
}

TEST_F(EntryPointManagerReadingTest, theFirstOfSeveralEntryPointsOfAFileIsReturned) {
    auto const file = projectFile(u"run.sh");
    putEntryPoint(u"b", u"run.sh");
    putEntryPoint(u"a", u"run.sh");
    EXPECT_EQ(entryPoints.getEntryPoint(file)->getUUID(), u"a");
    EXPECT_THAT(listedUUIDs(), ElementsAre(u"a", u"b"));
}

TEST_F(EntryPointManagerReadingTest, anAddressWithoutANodeIsSkipped) {
    auto const file = projectFile(u"run.sh");
    store->put(entryPointAt(u"a").child({u"Below", u"1"}), {});
    store->put(test::groupAt(u"g").child({u"Below", u"1"}), {});
    EXPECT_THAT(listedUUIDs(), IsEmpty());
    EXPECT_EQ(listedGroups().size(), 1U);
    EXPECT_EQ(entryPoints.getEntryPoint(file)->getUUID(), u"");
    entryPoints.removeEntryPoint(file);
    EXPECT_THAT(store->writes(), IsEmpty());
}

TEST_F(EntryPointManagerReadingTest, theListReadsEachNodeAndTheGroupsOnce) {
    for (auto const* name : {u"1", u"2", u"3"}) {
        projectFile(name);
        putEntryPoint(name, name);
    }
    putGroup(u"g", u"Tools");
    entryPoints.getEntryPoints();
    EXPECT_EQ(store->calls("getNode").size(), 4U);
    EXPECT_EQ(callsAt("getNode", test::groupAt(u"g")), 1U);
    EXPECT_EQ(callsAt("getChildNodes", GROUPS), 1U);
    EXPECT_EQ(callsAt("getChildNodes", ENTRY_POINTS), 1U);
}

TEST_F(EntryPointManagerReadingTest, queriesHoldTheReadGuardFromTheFirstStoreCallToTheLast) {
    auto const file = projectFile(u"run.sh");
    putEntryPoint(u"a", u"run.sh");
    EXPECT_THAT(guardsHeldBy([&] { entryPoints.getEntryPoints(); }), ElementsAre(Guard::Read));
    EXPECT_THAT(guardsHeldBy([&] { entryPoints.getEntryPoint(file); }), ElementsAre(Guard::Read));
    EXPECT_THAT(guardsHeldBy([&] { entryPoints.getEntryPointGroups(); }), ElementsAre(Guard::Read));
}

} // namespace
} // namespace project::management
