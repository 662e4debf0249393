#include "ChangeExecutor.hpp"

#include <memory>
#include <stdexcept>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "project/metadata/MetadataNodeSpecification.hpp"
#include "project/stores/MemoryBackend.hpp"
#include "project/stores/TreeMetadataManager.hpp"
#include "support/EventLog.hpp"

namespace project::session {
namespace {

using ::testing::IsEmpty;

class ChangeExecutors : public ::testing::Test {
protected:
    /// An operation that throws after it has raised nameChanged.
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
    TransactionFiles files_{nullptr, [](Path const&) { return true; }};
    ChangeExecutor executor_{store_, nullptr, nullptr, files_, raised_, observers_};
};

TEST_F(ChangeExecutors, dropTheEventsOfAnOperationThatThrows) {
    EXPECT_THROW(failAfterAnEvent(), std::out_of_range);
    EXPECT_THAT(log_.take(), IsEmpty());

    executor_.execute([] {});

    EXPECT_THAT(log_.take(), IsEmpty());
}

TEST_F(ChangeExecutors, rollBackTheWritesOfAnOperationThatThrows) {
    auto const address = metadata::MetadataPath::root().child({u"Name", u""});
    EXPECT_THROW(executor_.execute([&] {
        std::map<metadata::MetadataPath, std::shared_ptr<metadata::MetadataNode>> nodes{
            {address, std::make_shared<metadata::MetadataNodeSpecification>(u"Info")}};
        store_.setNodes(nodes);
        throw std::out_of_range("the second write failed");
    }),
                 std::out_of_range);
    EXPECT_FALSE(store_.pathExists(address));
}

} // namespace
} // namespace project::session
