#include "decorators/EventBroadcastingFileManager.hpp"

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
using Paths = std::vector<Path>;

class EventBroadcastingFileManagerTest : public testing::Test {
protected:
    StrictMock<test::MockFileManager> inner;
    DispatchableProjectEventBroadcaster broadcaster;
    test::EventLog log{broadcaster};
    EventBroadcastingFileManager files{inner, broadcaster};

    Path const path = u"/p/a";
    Paths const given{u"/p/b", u"/p/a"};
    CategoryDefinition const category{u"Kind", u"c"};
    std::vector<Label> const labels{Label(category, LabelDefinition(u"Source", u"l"))};
    std::vector<FileLabel> const fileLabels{FileLabel(category, LabelDefinition(u"Old", u"m"), u"/p/b")};
};

TEST_F(EventBroadcastingFileManagerTest, addingRaisesTheEventWithTheCallersFilesAfterTheChange) {
    EXPECT_CALL(inner, add(Ref(given))).WillOnce(log.noting(u"added"));
    files.add(given);
    EXPECT_THAT(log.take(), ElementsAre(u"added", u"fileListUpdate /p/b /p/a"));
}

TEST_F(EventBroadcastingFileManagerTest, removingRaisesTheEventWithTheCallersFilesAndReturnsTheRemovedOnes) {
    Paths removed{u"/p/a", u"/p/a/x", u"/p/b"};
    EXPECT_CALL(inner, remove(Ref(given))).WillOnce([&](Paths const&) {
        log.note(u"removed");
        return removed;
    });
    EXPECT_EQ(files.remove(given), removed);
    EXPECT_THAT(log.take(), ElementsAre(u"removed", u"fileListUpdate /p/b /p/a"));
}

TEST_F(EventBroadcastingFileManagerTest,
       puttingLabelsOnRaisesTheEventWithTheCallersFilesAndReturnsDisplacedLabels) {
    EXPECT_CALL(inner, addLabels(Ref(given), Ref(labels))).WillOnce([&](Paths const&, auto const&) {
        log.note(u"put on");
        return fileLabels;
    });
    auto const displaced = files.addLabels(given, labels);
    ASSERT_EQ(displaced.size(), 1U);
    EXPECT_EQ(displaced[0].getUUID(), u"m");
    EXPECT_THAT(log.take(), ElementsAre(u"put on", u"fileLabelsChanged /p/b /p/a"));
}

TEST_F(EventBroadcastingFileManagerTest, takingLabelsOffRaisesTheEventWithTheCallersFiles) {
    EXPECT_CALL(inner, removeLabels(Ref(given), Ref(labels))).WillOnce(log.noting(u"taken off"));
    files.removeLabels(given, labels);
    EXPECT_THAT(log.take(), ElementsAre(u"taken off", u"fileLabelsChanged /p/b /p/a"));
}

TEST_F(EventBroadcastingFileManagerTest, takingACategoryOffRaisesNothing) {
    EXPECT_CALL(inner, removeCategory(Ref(given), Ref(category)));
    files.removeCategory(given, category);
    EXPECT_THAT(log.take(), IsEmpty());
}

TEST_F(EventBroadcastingFileManagerTest, queriesRaiseNothing) {
    EXPECT_CALL(inner, getProjectRoot()).WillOnce(Return(u"/p"));
    EXPECT_CALL(inner, getFileMetadataManagerFor).WillOnce(Return(nullptr));
    EXPECT_CALL(inner, isFileInProject(Ref(path))).WillOnce(Return(true));
    EXPECT_CALL(inner, getChildProjectFiles(Ref(path))).WillOnce(Return(given));
    EXPECT_CALL(inner, getProjectFiles()).WillOnce(Return(given));
    EXPECT_CALL(inner, getLabelIDSets(Ref(path))).WillOnce(Return(std::vector<LabelIDSet>{}));
    EXPECT_CALL(inner, getLabels(Ref(path))).WillOnce(Return(fileLabels));
    EXPECT_EQ(files.getProjectRoot(), Path(u"/p"));
    EXPECT_EQ(files.getFileMetadataManagerFor(u"Mine"), nullptr);
    EXPECT_TRUE(files.isFileInProject(path));
    EXPECT_EQ(files.getChildProjectFiles(path), given);
    EXPECT_EQ(files.getProjectFiles(), given);
    EXPECT_THAT(files.getLabelIDSets(path), IsEmpty());
    EXPECT_EQ(files.getLabels(path).size(), 1U);
    EXPECT_THAT(log.take(), IsEmpty());
}

TEST_F(EventBroadcastingFileManagerTest, aChangeThatFailsRaisesNothing) {
    EXPECT_CALL(inner, add).WillOnce(Throw(std::out_of_range("no")));
    EXPECT_CALL(inner, remove).WillOnce(Throw(std::out_of_range("no")));
    EXPECT_CALL(inner, addLabels).WillOnce(Throw(std::out_of_range("no")));
    EXPECT_CALL(inner, removeLabels).WillOnce(Throw(std::out_of_range("no")));
    EXPECT_THROW(files.add(given), std::out_of_range);
    EXPECT_THROW(files.remove(given), std::out_of_range);
    EXPECT_THROW(files.addLabels(given, labels), std::out_of_range);
    EXPECT_THROW(files.removeLabels(given, labels), std::out_of_range);
    EXPECT_THAT(log.take(), IsEmpty());
}

TEST_F(EventBroadcastingFileManagerTest, anExceptionOfASlotPropagatesToTheCallerAfterTheChange) {
    broadcaster.onFileListUpdate([](Paths const&) { throw std::out_of_range("no"); });
    EXPECT_CALL(inner, remove(Ref(given))).WillOnce(Return(given));
    EXPECT_THROW(files.remove(given), std::out_of_range);
}

} // namespace
} // namespace project::management
