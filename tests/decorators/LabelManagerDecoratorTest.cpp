#include "project/decorators/LabelManagerDecorator.hpp"

#include <stdexcept>

#include <gmock/gmock.h>

#include "support/ManagerMocks.hpp"

namespace project::management {
namespace {

using testing::Eq;
using testing::Ref;
using testing::Return;
using testing::StrictMock;
using testing::Throw;

class LabelManagerDecoratorTest : public testing::Test {
protected:
    StrictMock<test::MockLabelManager> inner;
    LabelManagerDecorator labels{inner};

    CategoryDefinition const category{u"Kind", u"c"};
    LabelDefinition const label{u"Source", u"l"};
    CategoryDefinition const answeredCategory{u"State", u"d"};
    LabelDefinition const answeredLabel{u"Done", u"m"};
    std::u16string const text = u"text";
};

TEST_F(LabelManagerDecoratorTest, categoriesAreChangedByTheInnerOne) {
    EXPECT_CALL(inner, createCategory(Ref(category)));
    EXPECT_CALL(inner, deleteCategory(Ref(category)));
    EXPECT_CALL(inner, renameCategory(Ref(category), Ref(text)));
    labels.createCategory(category);
    labels.deleteCategory(category);
    labels.renameCategory(category, text);
}

TEST_F(LabelManagerDecoratorTest, categoriesAreReadFromTheInnerOne) {
    EXPECT_CALL(inner, getCategoryByUUID(Ref(text))).WillOnce(Return(answeredCategory));
    EXPECT_CALL(inner, getAllCategories())
        .WillOnce(Return(std::vector<CategoryIdentifier>{category, answeredCategory}));
    EXPECT_EQ(labels.getCategoryByUUID(text).getUUID(), u"d");
    auto const all = labels.getAllCategories();
    ASSERT_EQ(all.size(), 2U);
    EXPECT_EQ(all[0].getUUID(), u"c");
    EXPECT_EQ(all[1].getUUID(), u"d");
}

TEST_F(LabelManagerDecoratorTest, labelsAreChangedByTheInnerOne) {
    EXPECT_CALL(inner, createLabel(Ref(category), Ref(label)));
    EXPECT_CALL(inner, deleteLabel(Ref(category), Ref(label)));
    labels.createLabel(category, label);
    labels.deleteLabel(category, label);
}

TEST_F(LabelManagerDecoratorTest, labelsAreReadFromTheInnerOne) {
    std::vector<LabelIdentifier> const answer{label, answeredLabel};
    EXPECT_CALL(inner, getLabels(Ref(category))).WillOnce(Return(answer));
    EXPECT_CALL(inner, getLabelByUUID(Ref(category), Eq(text))).WillOnce(Return(answeredLabel));
    EXPECT_EQ(labels.getLabels(category), answer);
    EXPECT_EQ(labels.getLabelByUUID(category, text), answeredLabel);
}

TEST_F(LabelManagerDecoratorTest, anExceptionOfTheInnerOnePropagatesToTheCaller) {
    EXPECT_CALL(inner, createCategory).WillOnce(Throw(std::out_of_range("no")));
    EXPECT_CALL(inner, getCategoryByUUID).WillOnce(Throw(std::out_of_range("no")));
    EXPECT_THROW(labels.createCategory(category), std::out_of_range);
    EXPECT_THROW(labels.getCategoryByUUID(text), std::out_of_range);
}

} // namespace
} // namespace project::management
