#include "project/entrypoints/EntryPointGroup.hpp"

#include <gtest/gtest.h>

namespace project::management {
namespace {

TEST(EntryPointGroupDefinition, aNewGroupHasItsNameAndNoUUID) {
    EntryPointGroupDefinition const group(u"Tools");
    EXPECT_EQ(group.getName(), u"Tools");
    EXPECT_EQ(group.getUUID(), u"");
}

TEST(EntryPointGroupDefinition, nameComesBeforeUUID) {
    EntryPointGroupDefinition const group(u"Tools", u"u1");
    EXPECT_EQ(group.getName(), u"Tools");
    EXPECT_EQ(group.getUUID(), u"u1");
}

TEST(EntryPointGroupDefinition, aCopyIsTheSameGroup) {
    EntryPointGroupDefinition const original(u"Tools", u"u1");
    EntryPointGroup const& group = original;
    EntryPointGroupDefinition const copy(group);
    EXPECT_EQ(copy.getName(), u"Tools");
    EXPECT_EQ(copy.getUUID(), u"u1");
}

TEST(EntryPointGroupDefinition, aGeneratedUUIDIsOfTheUsualForm) {
    EntryPointGroupDefinition group(u"Tools");
    group.generateUUIDIfNotSet();
    EXPECT_EQ(group.getUUID().size(), 36U);
}

TEST(EntryPointGroupDefinition, anExistingUUIDStays) {
    EntryPointGroupDefinition group(u"Tools", u"u1");
    group.generateUUIDIfNotSet();
    EXPECT_EQ(group.getUUID(), u"u1");
}

TEST(EntryPointGroupDefinition, twoGroupsGetDifferentUUIDs) {
    EntryPointGroupDefinition first(u"Tools");
    EntryPointGroupDefinition second(u"Tools");
    first.generateUUIDIfNotSet();
    second.generateUUIDIfNotSet();
    EXPECT_NE(first.getUUID(), second.getUUID());
}

} // namespace
} // namespace project::management
