#include "project/entrypoints/EntryPoint.hpp"

#include <utility>

#include <gmock/gmock.h>

#include "entrypoints/EntryPointBase.hpp"

namespace project::management {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

EntryPointBase makeStored(std::unique_ptr<EntryPointGroup> group) {
    return EntryPointBase(u"/p/run.sh", EntryPointType::Startup, u"Run", u"x", false, std::move(group),
                          {{u"args", u"-v"}, {u"empty", u""}});
}

/// An entry point that lists a key and has no data for it.
class EntryPointWithoutData : public EntryPointDefinition {
public:
    using EntryPointDefinition::EntryPointDefinition;

    std::optional<std::u16string> getExtensionData(std::u16string const& key) const override {
        return key == u"gone" ? std::nullopt : EntryPointDefinition::getExtensionData(key);
    }
};

TEST(EntryPointDefinition, aNewOneIsABasicEntryPointNamedAfterItsFile) {
    EntryPointDefinition const entryPoint(u"/p/a/b.txt");
    EXPECT_EQ(entryPoint.getFile(), Path(u"/p/a/b.txt"));
    EXPECT_EQ(entryPoint.getName(), u"b");
    EXPECT_EQ(entryPoint.getUUID(), u"");
    EXPECT_EQ(entryPoint.getType(), EntryPointType::Basic);
    EXPECT_TRUE(entryPoint.isVisible());
    ASSERT_NE(entryPoint.getGroup(), nullptr);
    EXPECT_EQ(entryPoint.getGroup()->getUUID(), u"default");
    EXPECT_EQ(entryPoint.getGroup()->getName(), u"Default");
    EXPECT_THAT(entryPoint.getExtensionKeys(), IsEmpty());
}

TEST(EntryPointDefinition, onlyTheLastExtensionIsLeftOutOfTheName) {
    EXPECT_EQ(EntryPointDefinition(u"/p/archive.tar.gz").getName(), u"archive.tar");
    EXPECT_EQ(EntryPointDefinition(u"/p/.profile").getName(), u".profile");
}

TEST(EntryPointDefinition, aCopyHasEverythingButTheUUID) {
    auto const original = makeStored(std::make_unique<EntryPointGroupDefinition>(u"Tools", u"u1"));
    EntryPointDefinition const copy(original);

    EXPECT_EQ(copy.getUUID(), u"");
    EXPECT_EQ(copy.getFile(), Path(u"/p/run.sh"));
    EXPECT_EQ(copy.getName(), u"Run");
    EXPECT_EQ(copy.getType(), EntryPointType::Startup);
    EXPECT_FALSE(copy.isVisible());
    ASSERT_NE(copy.getGroup(), nullptr);
    EXPECT_EQ(copy.getGroup()->getName(), u"Tools");
    EXPECT_EQ(copy.getGroup()->getUUID(), u"u1");
    EXPECT_THAT(copy.getExtensionKeys(), ElementsAre(u"args", u"empty"));
    EXPECT_EQ(copy.getExtensionData(u"args"), u"-v");
    EXPECT_EQ(copy.getExtensionData(u"empty"), u"");
}

TEST(EntryPointDefinition, aCopyOfADefinitionHasNoUUIDEither) {
    EntryPointDefinition original(u"/p/b.txt");
    original.setUUID(u"x").setName(u"Other");
    EntryPointDefinition const copy = original;
    EXPECT_EQ(copy.getUUID(), u"");
    EXPECT_EQ(copy.getName(), u"Other");
    EXPECT_EQ(original.getUUID(), u"x");
}

TEST(EntryPointDefinition, aMovedOneKeepsItsUUID) {
    EntryPointDefinition original(u"/p/b.txt");
    original.setUUID(u"x");
    EntryPointDefinition const moved(std::move(original));
    EXPECT_EQ(moved.getUUID(), u"x");
}

TEST(EntryPointDefinition, aCopyOfOneWithoutAGroupHasNone) {
    EXPECT_EQ(EntryPointDefinition(makeStored(nullptr)).getGroup(), nullptr);
}

TEST(EntryPointDefinition, aKeyWithoutDataIsNotCopied) {
    EntryPointWithoutData original(u"/p/b.txt");
    original.setExtensionData(u"gone", u"1").setExtensionData(u"here", u"2");
    EntryPointDefinition const copy(original);
    EXPECT_THAT(copy.getExtensionKeys(), ElementsAre(u"here"));
}

TEST(EntryPointDefinition, changesCanBeChained) {
    EntryPointDefinition entryPoint(u"/p/b.txt");
    auto& result = entryPoint.setName(u"B").setType(EntryPointType::Shutdown).setUUID(u"x").setVisible(false);
    EXPECT_EQ(&result, &entryPoint);
    EXPECT_EQ(entryPoint.getName(), u"B");
    EXPECT_EQ(entryPoint.getType(), EntryPointType::Shutdown);
    EXPECT_EQ(entryPoint.getUUID(), u"x");
    EXPECT_FALSE(entryPoint.isVisible());

    EntryPointGroupDefinition group(u"Tools");
    EXPECT_EQ(&entryPoint.setGroup(group), &entryPoint);
    EXPECT_EQ(&entryPoint.setExtensionData(u"k", u"v").removeExtensionData(u"k"), &entryPoint);
    EXPECT_EQ(&entryPoint.generateUUIDIfNotSpecified(), &entryPoint);
}

TEST(EntryPointDefinition, theFirstGeneratedUUIDStays) {
    EntryPointDefinition entryPoint(u"/p/b.txt");
    auto const first = entryPoint.generateUUIDIfNotSpecified().getUUID();
    EXPECT_EQ(first.size(), 36U);
    EXPECT_EQ(entryPoint.generateUUIDIfNotSpecified().getUUID(), first);
}

TEST(EntryPointDefinition, editingAGroupLaterDoesNotChangeTheEntryPointsGroup) {
    EntryPointDefinition entryPoint(u"/p/b.txt");
    EntryPointGroupDefinition group(u"Tools");
    entryPoint.setGroup(group);
    group.generateUUIDIfNotSet();
    EXPECT_EQ(entryPoint.getGroup()->getName(), u"Tools");
    EXPECT_EQ(entryPoint.getGroup()->getUUID(), u"");
}

TEST(EntryPointDefinition, theGroupIsReturnedAsACopyAtEachCall) {
    EntryPointDefinition const entryPoint(u"/p/b.txt");
    auto const first = entryPoint.getGroup();
    EXPECT_NE(first.get(), entryPoint.getGroup().get());
}

TEST(EntryPointDefinition, settingAnExtensionKeyAgainReplacesItsValue) {
    EntryPointDefinition entryPoint(u"/p/b.txt");
    entryPoint.setExtensionData(u"k", u"1").setExtensionData(u"k", u"2");
    EXPECT_EQ(entryPoint.getExtensionData(u"k"), u"2");
    EXPECT_THAT(entryPoint.getExtensionKeys(), ElementsAre(u"k"));
}

TEST(EntryPointDefinition, extensionKeysAreSortedByCodeUnits) {
    EntryPointDefinition entryPoint(u"/p/b.txt");
    // U+1F600 is a surrogate pair, whose units precede U+FF5E although the character follows it.
    for (auto const* key : {u"\uFF5E", u"b", u"\U0001F600", u"B", u"a"}) {
        entryPoint.setExtensionData(key, u"");
    }
    EXPECT_THAT(entryPoint.getExtensionKeys(), ElementsAre(u"B", u"a", u"b", u"\U0001F600", u"\uFF5E"));
}

TEST(EntryPointDefinition, anAbsentExtensionKeyHasNoDataAndCanBeRemoved) {
    EntryPointDefinition entryPoint(u"/p/b.txt");
    entryPoint.setExtensionData(u"k", u"").removeExtensionData(u"other");
    EXPECT_EQ(entryPoint.getExtensionData(u"other"), std::nullopt);
    EXPECT_EQ(entryPoint.getExtensionData(u"k"), u"");
    entryPoint.removeExtensionData(u"k");
    EXPECT_EQ(entryPoint.getExtensionData(u"k"), std::nullopt);
}

TEST(EntryPointBase, hasTheConstructorsArguments) {
    auto const entryPoint = makeStored(std::make_unique<EntryPointGroupDefinition>(u"Tools", u"u1"));
    EXPECT_EQ(entryPoint.getFile(), Path(u"/p/run.sh"));
    EXPECT_EQ(entryPoint.getType(), EntryPointType::Startup);
    EXPECT_EQ(entryPoint.getName(), u"Run");
    EXPECT_EQ(entryPoint.getUUID(), u"x");
    EXPECT_FALSE(entryPoint.isVisible());
    EXPECT_EQ(entryPoint.getGroup()->getName(), u"Tools");
    EXPECT_EQ(entryPoint.getGroup()->getUUID(), u"u1");
    EXPECT_THAT(entryPoint.getExtensionKeys(), ElementsAre(u"args", u"empty"));
    EXPECT_EQ(entryPoint.getExtensionData(u"args"), u"-v");
    EXPECT_EQ(entryPoint.getExtensionData(u"other"), std::nullopt);
}

TEST(EntryPointBase, theGroupIsReturnedAsACopyAtEachCallOrNull) {
    auto const entryPoint = makeStored(std::make_unique<EntryPointGroupDefinition>(u"Tools", u"u1"));
    auto const first = entryPoint.getGroup();
    EXPECT_NE(first.get(), entryPoint.getGroup().get());
    EXPECT_EQ(makeStored(nullptr).getGroup(), nullptr);
}

} // namespace
} // namespace project::management
