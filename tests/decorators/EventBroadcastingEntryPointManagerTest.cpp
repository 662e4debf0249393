#include "decorators/EventBroadcastingEntryPointManager.hpp"

#include <stdexcept>

#include <gmock/gmock.h>

#include "support/EventLog.hpp"
#include "support/ManagerMocks.hpp"

namespace project::management {
namespace {

using testing::ByMove;
using testing::ElementsAre;
using testing::Eq;
using testing::IsEmpty;
using testing::Ref;
using testing::Return;
using testing::StrictMock;
using testing::Throw;

class EventBroadcastingEntryPointManagerTest : public testing::Test {
protected:
    StrictMock<test::MockEntryPointManager> inner;
    DispatchableProjectEventBroadcaster broadcaster;
    test::EventLog log{broadcaster};
    EventBroadcastingEntryPointManager entryPoints{inner, broadcaster};

    Path const file = u"/p/run.sh";
    EntryPointDefinition entryPoint{file};
    EntryPointGroupDefinition const group{u"Tools", u"g"};
    std::u16string const name = u"Others";
};

TEST_F(EventBroadcastingEntryPointManagerTest, changesOfEntryPointsRaiseTheEvent) {
    EXPECT_CALL(inner, setEntryPoint(Ref(entryPoint))).WillOnce(log.noting(u"set"));
    EXPECT_CALL(inner, removeEntryPoint(Eq(file))).WillOnce(log.noting(u"removed"));
    entryPoints.setEntryPoint(entryPoint);
    EXPECT_THAT(log.take(), ElementsAre(u"set", u"entryPointsChanged"));
    entryPoints.removeEntryPoint(file);
    EXPECT_THAT(log.take(), ElementsAre(u"removed", u"entryPointsChanged"));
}

TEST_F(EventBroadcastingEntryPointManagerTest, changesOfGroupsRaiseTheSameEvent) {
    EXPECT_CALL(inner, createEntryPointGroup(Ref(group))).WillOnce(log.noting(u"created"));
    EXPECT_CALL(inner, renameEntryPointGroup(Ref(group), Ref(name))).WillOnce(log.noting(u"renamed"));
    EXPECT_CALL(inner, deleteEntryPointGroup(Ref(group))).WillOnce(log.noting(u"deleted"));
    entryPoints.createEntryPointGroup(group);
    EXPECT_THAT(log.take(), ElementsAre(u"created", u"entryPointsChanged"));
    entryPoints.renameEntryPointGroup(group, name);
    EXPECT_THAT(log.take(), ElementsAre(u"renamed", u"entryPointsChanged"));
    entryPoints.deleteEntryPointGroup(group);
    EXPECT_THAT(log.take(), ElementsAre(u"deleted", u"entryPointsChanged"));
}

TEST_F(EventBroadcastingEntryPointManagerTest, queriesRaiseNothing) {
    EXPECT_CALL(inner, getEntryPoints()).WillOnce(Return(ByMove(std::vector<std::unique_ptr<EntryPoint>>{})));
    EXPECT_CALL(inner, getEntryPoint(Eq(file))).WillOnce(Return(ByMove(nullptr)));
    EXPECT_CALL(inner, getEntryPointGroups())
        .WillOnce(Return(ByMove(std::vector<std::unique_ptr<EntryPointGroup>>{})));
    EXPECT_THAT(entryPoints.getEntryPoints(), IsEmpty());
    EXPECT_EQ(entryPoints.getEntryPoint(file), nullptr);
    EXPECT_THAT(entryPoints.getEntryPointGroups(), IsEmpty());
    EXPECT_THAT(log.take(), IsEmpty());
}

TEST_F(EventBroadcastingEntryPointManagerTest, aChangeThatFailsRaisesNothing) {
    EXPECT_CALL(inner, setEntryPoint).WillOnce(Throw(std::out_of_range("no")));
    EXPECT_CALL(inner, removeEntryPoint).WillOnce(Throw(std::out_of_range("no")));
    EXPECT_CALL(inner, createEntryPointGroup).WillOnce(Throw(std::out_of_range("no")));
    EXPECT_CALL(inner, renameEntryPointGroup).WillOnce(Throw(std::out_of_range("no")));
    EXPECT_CALL(inner, deleteEntryPointGroup).WillOnce(Throw(std::out_of_range("no")));
    EXPECT_THROW(entryPoints.setEntryPoint(entryPoint), std::out_of_range);
    EXPECT_THROW(entryPoints.removeEntryPoint(file), std::out_of_range);
    EXPECT_THROW(entryPoints.createEntryPointGroup(group), std::out_of_range);
    EXPECT_THROW(entryPoints.renameEntryPointGroup(group, name), std::out_of_range);
    EXPECT_THROW(entryPoints.deleteEntryPointGroup(group), std::out_of_range);
    EXPECT_THAT(log.take(), IsEmpty());
}

} // namespace
} // namespace project::management
