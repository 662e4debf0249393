#include "project/decorators/EntryPointManagerDecorator.hpp"

#include <stdexcept>
#include <utility>

#include <gmock/gmock.h>

#include "support/ManagerMocks.hpp"

namespace project::management {
namespace {

using testing::ByMove;
using testing::Eq;
using testing::Ref;
using testing::Return;
using testing::StrictMock;
using testing::Throw;

class EntryPointManagerDecoratorTest : public testing::Test {
protected:
    StrictMock<test::MockEntryPointManager> inner;
    EntryPointManagerDecorator entryPoints{inner};

    Path const file = u"/p/run.sh";
    EntryPointGroupDefinition const group{u"Tools", u"g"};
};

TEST_F(EntryPointManagerDecoratorTest, entryPointsAreChangedByTheInnerOne) {
    EntryPointDefinition entryPoint(file);
    EXPECT_CALL(inner, setEntryPoint(Ref(entryPoint)));
    EXPECT_CALL(inner, removeEntryPoint(Eq(file)));
    entryPoints.setEntryPoint(entryPoint);
    entryPoints.removeEntryPoint(file);
}

TEST_F(EntryPointManagerDecoratorTest, anEntryPointIsTheObjectThatTheInnerOneReturns) {
    auto made = std::make_unique<EntryPointDefinition>(file);
    auto const* const expected = made.get();
    EXPECT_CALL(inner, getEntryPoint(Eq(file))).WillOnce(Return(ByMove(std::move(made))));
    EXPECT_EQ(entryPoints.getEntryPoint(file).get(), expected);
}

TEST_F(EntryPointManagerDecoratorTest, noEntryPointIsReturnedIfTheInnerOneReturnsNone) {
    EXPECT_CALL(inner, getEntryPoint(Eq(file))).WillOnce(Return(ByMove(nullptr)));
    EXPECT_EQ(entryPoints.getEntryPoint(file), nullptr);
}

TEST_F(EntryPointManagerDecoratorTest, allEntryPointsAreTheObjectsThatTheInnerOneReturns) {
    std::vector<std::unique_ptr<EntryPoint>> made;
    made.push_back(std::make_unique<EntryPointDefinition>(file));
    auto const* const expected = made[0].get();
    EXPECT_CALL(inner, getEntryPoints()).WillOnce(Return(ByMove(std::move(made))));
    auto const all = entryPoints.getEntryPoints();
    ASSERT_EQ(all.size(), 1U);
    EXPECT_EQ(all[0].get(), expected);
}

TEST_F(EntryPointManagerDecoratorTest, groupsAreTheObjectsThatTheInnerOneReturns) {
    std::vector<std::unique_ptr<EntryPointGroup>> made;
    made.push_back(std::make_unique<EntryPointGroupDefinition>(group));
    auto const* const expected = made[0].get();
    EXPECT_CALL(inner, getEntryPointGroups()).WillOnce(Return(ByMove(std::move(made))));
    auto const all = entryPoints.getEntryPointGroups();
    ASSERT_EQ(all.size(), 1U);
    EXPECT_EQ(all[0].get(), expected);
}

TEST_F(EntryPointManagerDecoratorTest, groupsAreChangedByTheInnerOne) {
    std::u16string const name = u"Others";
    EXPECT_CALL(inner, createEntryPointGroup(Ref(group)));
    EXPECT_CALL(inner, renameEntryPointGroup(Ref(group), Ref(name)));
    EXPECT_CALL(inner, deleteEntryPointGroup(Ref(group)));
    entryPoints.createEntryPointGroup(group);
    entryPoints.renameEntryPointGroup(group, name);
    entryPoints.deleteEntryPointGroup(group);
}

TEST_F(EntryPointManagerDecoratorTest, anExceptionOfTheInnerOnePropagatesToTheCaller) {
    EXPECT_CALL(inner, getEntryPoint).WillOnce(Throw(std::out_of_range("no")));
    EXPECT_CALL(inner, removeEntryPoint).WillOnce(Throw(std::out_of_range("no")));
    EXPECT_THROW(entryPoints.getEntryPoint(file), std::out_of_range);
    EXPECT_THROW(entryPoints.removeEntryPoint(file), std::out_of_range);
}

} // namespace
} // namespace project::management
