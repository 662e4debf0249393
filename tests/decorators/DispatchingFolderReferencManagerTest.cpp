#include "decorators/DispatchingFolderReferencManager.hpp"

#include <stdexcept>

#include <gmock/gmock.h>

#include "decorators/EventBroadcastingProjectPathManager.hpp"
#include "decorators/EventBroadcastingProjectReferenceManager.hpp"
#include "support/EventLog.hpp"
#include "support/ManagerMocks.hpp"

// The lists of folder references that raise events, each in the manager that returns it.

namespace project::management {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testing::Ref;
using testing::Return;
using testing::ReturnRef;
using testing::StrictMock;
using testing::Throw;

/// One of the two managers that return a list, with everything that it needs.
template <class Decorator, class MockManager>
struct ListOfReferences {
    ListOfReferences() {
        EXPECT_CALL(manager, getFolderReferenceManager()).WillOnce(ReturnRef(inner));
        decorator = std::make_unique<Decorator>(manager, broadcaster);
    }

    FolderReferenceManager& list() { return decorator->getFolderReferenceManager(); }

    StrictMock<test::MockFolderReferenceManager> inner;
    StrictMock<MockManager> manager; // its list is requested once, when the decorator is created
    DispatchableProjectEventBroadcaster broadcaster;
    test::EventLog log{broadcaster};
    std::unique_ptr<Decorator> decorator;
};

struct ListOfThePath : ListOfReferences<EventBroadcastingProjectPathManager, test::MockProjectPathManager> {
    static constexpr char16_t const* event = u"pathChanged";
};

struct ListOfReferencedProjects
    : ListOfReferences<EventBroadcastingProjectReferenceManager, test::MockProjectReferenceManager> {
    static constexpr char16_t const* event = u"referencesChanged";
};

template <class List>
class DispatchingFolderReferencManagerTest : public testing::Test {
protected:
    List with;
    Path const path = u"/lib/a";
    std::vector<FolderReference> const given{FolderReference(u"/lib", u"Absolute", u"/lib", u"1")};
};

using Lists = testing::Types<ListOfThePath, ListOfReferencedProjects>;
TYPED_TEST_SUITE(DispatchingFolderReferencManagerTest, Lists);

TYPED_TEST(DispatchingFolderReferencManagerTest, theListIsTheSameObjectAtEachCall) {
    EXPECT_EQ(&this->with.list(), &this->with.list());
    EXPECT_NE(&this->with.list(), &this->with.inner);
}

TYPED_TEST(DispatchingFolderReferencManagerTest, changesAreToldOfWhenTheyAreMade) {
    auto& log = this->with.log;
    EXPECT_CALL(this->with.inner, addReferences(Ref(this->given))).WillOnce(log.noting(u"added"));
    EXPECT_CALL(this->with.inner, removeReferences(Ref(this->given))).WillOnce(log.noting(u"removed"));
    this->with.list().addReferences(this->given);
    EXPECT_THAT(log.take(), ElementsAre(u"added", TypeParam::event));
    this->with.list().removeReferences(this->given);
    EXPECT_THAT(log.take(), ElementsAre(u"removed", TypeParam::event));
}

TYPED_TEST(DispatchingFolderReferencManagerTest, queriesRaiseNothing) {
    EXPECT_CALL(this->with.inner, getReferences()).WillOnce(Return(this->given));
    EXPECT_CALL(this->with.inner, isReference(Ref(this->path))).WillOnce(Return(true));
    EXPECT_CALL(this->with.inner, getRootReferenceFor(Ref(this->path))).WillOnce(Return(this->given[0]));
    EXPECT_EQ(this->with.list().getReferences().size(), 1U);
    EXPECT_TRUE(this->with.list().isReference(this->path));
    EXPECT_TRUE(this->with.list().getRootReferenceFor(this->path));
    EXPECT_THAT(this->with.log.take(), IsEmpty());
}

TYPED_TEST(DispatchingFolderReferencManagerTest, aChangeThatFailsRaisesNothing) {
    EXPECT_CALL(this->with.inner, addReferences).WillOnce(Throw(std::out_of_range("no")));
    EXPECT_CALL(this->with.inner, removeReferences).WillOnce(Throw(std::out_of_range("no")));
    EXPECT_THROW(this->with.list().addReferences(this->given), std::out_of_range);
    EXPECT_THROW(this->with.list().removeReferences(this->given), std::out_of_range);
    EXPECT_THAT(this->with.log.take(), IsEmpty());
}

} // namespace
} // namespace project::management
