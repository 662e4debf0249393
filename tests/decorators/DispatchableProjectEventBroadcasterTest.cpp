#include "project/decorators/DispatchableProjectEventBroadcaster.hpp"

#include <functional>
#include <stdexcept>
#include <thread>
#include <utility>

#include <gmock/gmock.h>

#include "support/EventLog.hpp"

namespace project::management {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using Paths = std::vector<Path>;
using Lines = std::vector<std::u16string>;

class BroadcasterTest : public testing::Test {
protected:
    /// One call of each dispatching operation.
    void dispatchAll() {
        broadcaster.dispatchOnFileListUpdate(files);
        broadcaster.dispatchMetadataChange();
        broadcaster.dispatchLabelModified(label);
        broadcaster.dispatchCategoryDeleted(category);
        broadcaster.dispatchCategoryAdded(category);
        broadcaster.dispatchCategoryRenamed(category);
        broadcaster.dispatchFileLabelsChanged(files);
        broadcaster.dispatchEntryPointsChanged();
        broadcaster.dispatchNameChanged();
        broadcaster.dispatchPathChanged();
        broadcaster.dispatchReferencesChanged();
    }

    /// Notes a text when it is called.
    std::function<void()> noting(std::u16string text) {
        return [this, text = std::move(text)] { noted.push_back(text); };
    }

    DispatchableProjectEventBroadcaster broadcaster;
    Paths const files{u"/p/b", u"/p/a"};
    CategoryDefinition const category{u"Kind", u"c"};
    Label const label{category, LabelDefinition(u"Source", u"l")};
    Lines noted;
};

TEST_F(BroadcasterTest, anEventWithoutSlotsDoesNothing) {
    EXPECT_NO_THROW(dispatchAll());
}

TEST_F(BroadcasterTest, eachEventReachesItsOwnSlotsAndNoOthers) {
    test::EventLog log(broadcaster);
    broadcaster.dispatchOnFileListUpdate(files);
    EXPECT_THAT(log.take(), ElementsAre(u"fileListUpdate /p/b /p/a"));
    broadcaster.dispatchMetadataChange();
    EXPECT_THAT(log.take(), ElementsAre(u"metadataChange"));
    broadcaster.dispatchLabelModified(label);
    EXPECT_THAT(log.take(), ElementsAre(u"labelModified c l"));
    broadcaster.dispatchCategoryDeleted(category);
    EXPECT_THAT(log.take(), ElementsAre(u"categoryDeleted c Kind"));
    broadcaster.dispatchCategoryAdded(category);
    EXPECT_THAT(log.take(), ElementsAre(u"categoryAdded c Kind"));
    broadcaster.dispatchCategoryRenamed(category);
    EXPECT_THAT(log.take(), ElementsAre(u"categoryRenamed c Kind"));
    broadcaster.dispatchFileLabelsChanged(files);
    EXPECT_THAT(log.take(), ElementsAre(u"fileLabelsChanged /p/b /p/a"));
    broadcaster.dispatchEntryPointsChanged();
    EXPECT_THAT(log.take(), ElementsAre(u"entryPointsChanged"));
    broadcaster.dispatchNameChanged();
    EXPECT_THAT(log.take(), ElementsAre(u"nameChanged"));
    broadcaster.dispatchPathChanged();
    EXPECT_THAT(log.take(), ElementsAre(u"pathChanged"));
    broadcaster.dispatchReferencesChanged();
    EXPECT_THAT(log.take(), ElementsAre(u"referencesChanged"));
}

TEST_F(BroadcasterTest, slotsGetTheSameObjectsThatWereDispatched) {
    std::vector<void const*> received;
    auto const receive = [&](auto const& object) { received.push_back(&object); };
    broadcaster.onFileListUpdate(receive);
    broadcaster.onFileLabelsChanged(receive);
    broadcaster.onLabelModified(receive);
    broadcaster.onCategoryAdded(receive);
    broadcaster.onCategoryDeleted(receive);
    broadcaster.onCategoryRenamed(receive);
    dispatchAll();
    // In the order of dispatchAll. A category is the first base of its definition.
    CategoryIdentifier const* const identifier = &category;
    EXPECT_THAT(received, ElementsAre(&files, &label, identifier, identifier, identifier, &files));
}

TEST_F(BroadcasterTest, slotsRunInTheOrderOfConnectionBeforeTheDispatchReturns) {
    broadcaster.onNameChanged(noting(u"first"));
    broadcaster.onNameChanged(noting(u"second"));
    broadcaster.onNameChanged(noting(u"third"));
    broadcaster.dispatchNameChanged();
    EXPECT_THAT(noted, ElementsAre(u"first", u"second", u"third"));
}

TEST_F(BroadcasterTest, slotsRunOnTheThreadThatDispatches) {
    std::thread::id ran;
    broadcaster.onPathChanged([&] { ran = std::this_thread::get_id(); });
    std::thread::id dispatched;
    std::thread([&] {
        dispatched = std::this_thread::get_id();
        broadcaster.dispatchPathChanged();
    }).join();
    EXPECT_EQ(ran, dispatched);
    EXPECT_NE(ran, std::this_thread::get_id());
}

TEST_F(BroadcasterTest, aDisconnectedSlotIsNotCalled) {
    auto const connection = broadcaster.onNameChanged(noting(u"gone"));
    broadcaster.onNameChanged(noting(u"there"));
    EXPECT_TRUE(connection.connected());
    connection.disconnect();
    broadcaster.dispatchNameChanged();
    EXPECT_THAT(noted, ElementsAre(u"there"));
}

TEST_F(BroadcasterTest, aSlotThatDisconnectsItselfIsNotCalledAgainAndTheOthersRun) {
    ProjectEventBroadcaster::Connection connection;
    broadcaster.onNameChanged(noting(u"before"));
    connection = broadcaster.onNameChanged([&] {
        noted.emplace_back(u"once");
        connection.disconnect();
    });
    broadcaster.onNameChanged(noting(u"behind"));
    broadcaster.dispatchNameChanged();
    EXPECT_THAT(noted, ElementsAre(u"before", u"once", u"behind"));
    noted.clear();
    broadcaster.dispatchNameChanged();
    EXPECT_THAT(noted, ElementsAre(u"before", u"behind"));
}

TEST_F(BroadcasterTest, anExceptionOfASlotPropagatesAndTheRemainingSlotsAreNotCalled) {
    broadcaster.onNameChanged(noting(u"before"));
    broadcaster.onNameChanged([] { throw std::out_of_range("no"); });
    broadcaster.onNameChanged(noting(u"behind"));
    EXPECT_THROW(broadcaster.dispatchNameChanged(), std::out_of_range);
    EXPECT_THAT(noted, ElementsAre(u"before"));
}

TEST_F(BroadcasterTest, aSlotMayConnectAndDispatchTheSameEvent) {
    bool isNested = false;
    broadcaster.onNameChanged([&] {
        if (!std::exchange(isNested, true)) {
            broadcaster.onNameChanged(noting(u"new"));
            broadcaster.dispatchNameChanged();
            noted.emplace_back(u"nested dispatch returned");
        }
    });
    broadcaster.dispatchNameChanged();
    EXPECT_THAT(Lines(noted.begin(), noted.begin() + 2), ElementsAre(u"new", u"nested dispatch returned"));
}

TEST(DispatchableProjectEventBroadcaster, itsDestructionDisconnectsAllSlots) {
    auto owned = std::make_unique<DispatchableProjectEventBroadcaster>();
    auto const name = owned->onNameChanged([] {});
    auto const files = owned->onFileListUpdate([](Paths const&) {});
    EXPECT_TRUE(name.connected());
    EXPECT_TRUE(files.connected());
    owned.reset();
    EXPECT_FALSE(name.connected());
    EXPECT_FALSE(files.connected());
}

/// Notes its name when the last copy of a slot that holds it is destroyed.
std::shared_ptr<int> endMark(std::u16string const& name, Lines& ends) {
    return {new int(0), [name, &ends](int const* mark) {
                ends.push_back(name);
                delete mark;
            }};
}

TEST(DispatchableProjectEventBroadcaster, theEventsAreDestroyedInReverseOrder) {
    Lines ends;
    auto owned = std::make_unique<DispatchableProjectEventBroadcaster>();
    auto const slot = [&ends](std::u16string const& name) {
        return [mark = endMark(name, ends)](auto const&...) {};
    };
    owned->onReferencesChanged(slot(u"references"));
    owned->onEntryPointsChanged(slot(u"entry points"));
    owned->onFileListUpdate(slot(u"file list"));
    owned->onCategoryRenamed(slot(u"renamed"));
    owned->onLabelModified(slot(u"label"));
    owned->onMetadataChange(slot(u"metadata"));
    owned->onCategoryDeleted(slot(u"deleted"));
    owned->onFileLabelsChanged(slot(u"file labels"));
    owned->onNameChanged(slot(u"name"));
    owned->onCategoryAdded(slot(u"added"));
    owned->onPathChanged(slot(u"path"));
    ASSERT_THAT(ends, IsEmpty());
    owned.reset();
    EXPECT_THAT(ends, ElementsAre(u"references", u"path", u"name", u"entry points", u"file labels",
                                  u"renamed", u"added", u"deleted", u"label", u"metadata", u"file list"));
}

TEST(DispatchableProjectEventBroadcaster, keepsRoomForAnUnusedEvent) {
    // Eleven kinds of event can be observed.
    EXPECT_EQ(sizeof(DispatchableProjectEventBroadcaster),
              sizeof(ProjectEventBroadcaster) + 12 * sizeof(boost::signals2::signal<void()>));
}

} // namespace
} // namespace project::management
