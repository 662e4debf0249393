#include "ChangeExecutor.hpp"

#include <memory>
#include <stdexcept>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "project/stores/MemoryBackend.hpp"
#include "project/stores/TreeMetadataManager.hpp"
#include "support/EventLog.hpp"

namespace project::session {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

class ChangeExecutors : public ::testing::Test {
protected:
    /// An operation that throws after it has committed a write and raised nameChanged.
    void failAfterAnEvent() {
        executor_.execute([this] {
            raised_.input()->dispatchNameChanged();
            throw std::out_of_range("the second write failed");
        });
    }

    stores::TreeMetadataManager store_{std::make_unique<stores::MemoryBackend>(),
                                       fl::filesystem::Path(u"/engine/.projectdata")};
    EventQueue raised_;
    std::shared_ptr<management::DispatchableProjectEventBroadcaster> const observers_ =
        std::make_shared<management::DispatchableProjectEventBroadcaster>();
    test::EventLog log_{*observers_};
    ChangeExecutor executor_{store_, nullptr, raised_, observers_};
};

TEST_F(ChangeExecutors, dispatchTheEventsOfAnOperationAndThenThrowItsError) {
    EXPECT_THROW(failAfterAnEvent(), std::out_of_range);

    EXPECT_THAT(log_.take(), ElementsAre(u"nameChanged"));
}

TEST_F(ChangeExecutors, doNotDispatchAnEventOfAFailedOperationAgainWithTheNextOne) {
    EXPECT_THROW(failAfterAnEvent(), std::out_of_range);
    log_.take();

    executor_.execute([] {});

    EXPECT_THAT(log_.take(), IsEmpty());
}

TEST_F(ChangeExecutors, throwTheErrorOfTheOperationIfASlotThrowsAsWell) {
    observers_->onNameChanged([] { throw std::logic_error("a slot failed"); });
    EXPECT_THROW(failAfterAnEvent(), std::out_of_range);
}

} // namespace
} // namespace project::session
