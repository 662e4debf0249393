#include "project/decorators/FolderReferenceManagerDecorator.hpp"

#include <stdexcept>

#include <gmock/gmock.h>

#include "project/decorators/ProjectPathManagerDecorator.hpp"
#include "project/decorators/ProjectReferenceManagerDecorator.hpp"
#include "support/ManagerMocks.hpp"

// The decorator of a list of folder references, and those of the two managers that have such a list.

namespace project::management {
namespace {

using testing::Ref;
using testing::Return;
using testing::ReturnRef;
using testing::StrictMock;
using testing::Throw;

class FolderReferenceManagerDecoratorTest : public testing::Test {
protected:
    StrictMock<test::MockFolderReferenceManager> inner;
    FolderReferenceManagerDecorator references{inner};

    Path const path = u"/lib/a";
    std::vector<FolderReference> const given{FolderReference(u"/lib", u"Absolute", u"/lib", u"1")};
};

TEST_F(FolderReferenceManagerDecoratorTest, referencesAreChangedByTheInnerOne) {
    EXPECT_CALL(inner, addReferences(Ref(given)));
    EXPECT_CALL(inner, removeReferences(Ref(given)));
    references.addReferences(given);
    references.removeReferences(given);
}

TEST_F(FolderReferenceManagerDecoratorTest, referencesAreReadFromTheInnerOne) {
    EXPECT_CALL(inner, getReferences()).WillOnce(Return(given));
    EXPECT_CALL(inner, isReference(Ref(path))).WillOnce(Return(true)).WillOnce(Return(false));
    EXPECT_CALL(inner, getRootReferenceFor(Ref(path)))
        .WillOnce(Return(given[0]))
        .WillOnce(Return(std::nullopt));

    auto const all = references.getReferences();
    ASSERT_EQ(all.size(), 1U);
    EXPECT_EQ(all[0].getUUID(), u"1");
    EXPECT_TRUE(references.isReference(path));
    EXPECT_FALSE(references.isReference(path));
    auto const found = references.getRootReferenceFor(path);
    ASSERT_TRUE(found);
    EXPECT_EQ(found->getUUID(), u"1");
    EXPECT_FALSE(references.getRootReferenceFor(path));
}

TEST_F(FolderReferenceManagerDecoratorTest, anExceptionOfTheInnerOnePropagatesToTheCaller) {
    EXPECT_CALL(inner, addReferences).WillOnce(Throw(std::out_of_range("no")));
    EXPECT_CALL(inner, getReferences).WillOnce(Throw(std::out_of_range("no")));
    EXPECT_THROW(references.addReferences(given), std::out_of_range);
    EXPECT_THROW(references.getReferences(), std::out_of_range);
}

TEST(ProjectPathManagerDecorator, theListIsTheInnerOnes) {
    test::MockFolderReferenceManager list;
    StrictMock<test::MockProjectPathManager> inner;
    ProjectPathManagerDecorator path(inner);
    EXPECT_CALL(inner, getFolderReferenceManager()).WillOnce(ReturnRef(list));
    EXPECT_EQ(&path.getFolderReferenceManager(), &list);
}

TEST(ProjectReferenceManagerDecorator, theListIsTheInnerOnes) {
    test::MockFolderReferenceManager list;
    StrictMock<test::MockProjectReferenceManager> inner;
    ProjectReferenceManagerDecorator references(inner);
    EXPECT_CALL(inner, getFolderReferenceManager()).WillOnce(ReturnRef(list));
    EXPECT_EQ(&references.getFolderReferenceManager(), &list);
}

} // namespace
} // namespace project::management
