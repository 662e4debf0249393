#include "decorators/EventBroadcastingLabelManager.hpp"

#include <stdexcept>

#include <gmock/gmock.h>

#include "support/EventLog.hpp"
#include "support/ManagerMocks.hpp"

namespace project::management {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testing::Ref;
using testing::Return;
using testing::StrictMock;
using testing::Throw;

class EventBroadcastingLabelManagerTest : public testing::Test {
protected:
    StrictMock<test::MockLabelManager> inner;
    DispatchableProjectEventBroadcaster broadcaster;
    test::EventLog log{broadcaster};
    EventBroadcastingLabelManager labels{inner, broadcaster};

    CategoryDefinition const category{u"Kind", u"c"};
    LabelDefinition const label{u"Source", u"l"};
    std::u16string const text = u"State";
};

TEST_F(EventBroadcastingLabelManagerTest, aNewCategoryRaisesItsEvent) {
    EXPECT_CALL(inner, createCategory(Ref(category))).WillOnce(log.noting(u"created"));
    labels.createCategory(category);
    EXPECT_THAT(log.take(), ElementsAre(u"created", u"categoryAdded c Kind"));
}

TEST_F(EventBroadcastingLabelManagerTest, aDeletedCategoryRaisesItsEvent) {
    EXPECT_CALL(inner, deleteCategory(Ref(category))).WillOnce(log.noting(u"deleted"));
    labels.deleteCategory(category);
    EXPECT_THAT(log.take(), ElementsAre(u"deleted", u"categoryDeleted c Kind"));
}

TEST_F(EventBroadcastingLabelManagerTest, aRenamedCategoryRaisesItsEventWithTheOldName) {
    EXPECT_CALL(inner, renameCategory(Ref(category), Ref(text))).WillOnce(log.noting(u"renamed"));
    labels.renameCategory(category, text);
    EXPECT_THAT(log.take(), ElementsAre(u"renamed", u"categoryRenamed c Kind"));
}

TEST_F(EventBroadcastingLabelManagerTest, theCategoryOfAnEventIsTheCallersObject) {
    std::vector<CategoryIdentifier const*> received;
    auto const receive = [&](CategoryIdentifier const& raised) { received.push_back(&raised); };
    broadcaster.onCategoryAdded(receive);
    broadcaster.onCategoryRenamed(receive);
    broadcaster.onCategoryDeleted(receive);
    EXPECT_CALL(inner, createCategory);
    EXPECT_CALL(inner, renameCategory);
    EXPECT_CALL(inner, deleteCategory);
    labels.createCategory(category);
    labels.renameCategory(category, text);
    labels.deleteCategory(category);
    EXPECT_THAT(received, ElementsAre(&category, &category, &category));
}

TEST_F(EventBroadcastingLabelManagerTest, newAndDeletedLabelsRaiseTheSameEvent) {
    EXPECT_CALL(inner, createLabel(Ref(category), Ref(label))).WillOnce(log.noting(u"created"));
    EXPECT_CALL(inner, deleteLabel(Ref(category), Ref(label))).WillOnce(log.noting(u"deleted"));
    labels.createLabel(category, label);
    labels.deleteLabel(category, label);
    EXPECT_THAT(log.take(), ElementsAre(u"created", u"labelModified c l", u"deleted", u"labelModified c l"));
}

TEST_F(EventBroadcastingLabelManagerTest, theLabelOfAnEventConsistsOfBothArguments) {
    CategoryDefinition single(u"Kind", u"c");
    single.setIsSingleValued(true);
    EXPECT_CALL(inner, createLabel);
    EXPECT_CALL(inner, deleteLabel);
    int events = 0;
    broadcaster.onLabelModified([&](Label const& made) {
        ++events;
        EXPECT_EQ(made.getLabelIdentifier(), label);
        EXPECT_EQ(made.getCategory().getName(), u"Kind");
        EXPECT_TRUE(made.getCategory().isSingleValued());
    });
    labels.createLabel(single, label);
    labels.deleteLabel(single, label);
    EXPECT_EQ(events, 2);
}

TEST_F(EventBroadcastingLabelManagerTest, queriesRaiseNothing) {
    EXPECT_CALL(inner, getCategoryByUUID(Ref(text))).WillOnce(Return(category));
    EXPECT_CALL(inner, getAllCategories()).WillOnce(Return(std::vector<CategoryIdentifier>{category}));
    EXPECT_CALL(inner, getLabels(Ref(category))).WillOnce(Return(std::vector<LabelIdentifier>{label}));
    EXPECT_CALL(inner, getLabelByUUID(Ref(category), text)).WillOnce(Return(label));
    EXPECT_EQ(labels.getCategoryByUUID(text).getUUID(), u"c");
    EXPECT_EQ(labels.getAllCategories().size(), 1U);
    EXPECT_THAT(labels.getLabels(category), ElementsAre(label));
    EXPECT_EQ(labels.getLabelByUUID(category, text), label);
    EXPECT_THAT(log.take(), IsEmpty());
}

TEST_F(EventBroadcastingLabelManagerTest, aChangeThatFailsRaisesNothing) {
    EXPECT_CALL(inner, createCategory).WillOnce(Throw(std::out_of_range("no")));
    EXPECT_CALL(inner, deleteCategory).WillOnce(Throw(std::out_of_range("no")));
    EXPECT_CALL(inner, renameCategory).WillOnce(Throw(std::out_of_range("no")));
    EXPECT_CALL(inner, createLabel).WillOnce(Throw(std::out_of_range("no")));
    EXPECT_CALL(inner, deleteLabel).WillOnce(Throw(std::out_of_range("no")));
    EXPECT_THROW(labels.createCategory(category), std::out_of_range);
    EXPECT_THROW(labels.deleteCategory(category), std::out_of_range);
    EXPECT_THROW(labels.renameCategory(category, text), std::out_of_range);
    EXPECT_THROW(labels.createLabel(category, label), std::out_of_range);
    EXPECT_THROW(labels.deleteLabel(category, label), std::out_of_range);
    EXPECT_THAT(log.take(), IsEmpty());
}

} // namespace
} // namespace project::management
