#include "cm/CMAwareFileManager.hpp"

#include <stdexcept>

#include <gmock/gmock.h>

#include "support/ManagerMocks.hpp"
#include "support/RecordingCMAdapter.hpp"
#include "support/RecordingMetadataManager.hpp"

namespace project::management {
namespace {

using testing::IsEmpty;
using testing::Ref;
using testing::Return;
using testing::StrictMock;
using testing::Throw;
using Paths = std::vector<Path>;

class CMAwareFileManagerTest : public testing::Test {
protected:
    CMAwareFileManagerTest() { adapter.setStateOfOthers(0); }

    /// The store notifies its listener of a file of its own, as it does when a manager adds files.
    std::u16string reportAddition() {
        handler.fileAdditionRequested(store, {u"/p/.t"});
        return adapter.take().back();
    }

    std::u16string reportRemoval() {
        adapter.setStateOfOthers(1);
        handler.fileRemovalRequested(store, u"/p", {u"/p/.t"});
        return adapter.take().back();
    }

    StrictMock<test::MockFileManager> inner;
    test::RecordingMetadataManager store;
    test::RecordingCMAdapter adapter;
    CMProjectFileEventHandler handler{adapter, u"/p"};
    CMAwareFileManager files{inner, handler};
    Paths const given{u"/p/b", u"/p/a"};
};

TEST_F(CMAwareFileManagerTest, addedFilesAreNotedBeforeTheInnerManagerIsCalledAndPassedWithTheStoresReport) {
    std::u16string action;
    EXPECT_CALL(inner, add(Ref(given))).WillOnce([&](Paths const&) {
        EXPECT_THAT(adapter.take(), IsEmpty());
        action = reportAddition();
    });
    files.add(given);
    EXPECT_EQ(action, u"addToSourceControl /p/.t /p/a /p/b");
    EXPECT_THAT(adapter.take(), IsEmpty());
}

TEST_F(CMAwareFileManagerTest,
       removedFilesAreNotedBeforeTheInnerManagerIsCalledAndPassedWithTheStoresReport) {
    std::u16string action;
    Paths removed{u"/p/a", u"/p/a/x", u"/p/b"};
    EXPECT_CALL(inner, remove(Ref(given))).WillOnce([&](Paths const&) {
        EXPECT_THAT(adapter.take(), IsEmpty());
        action = reportRemoval();
        return removed;
    });
    EXPECT_EQ(files.remove(given), removed);
    EXPECT_EQ(action, u"removeFromSourceControl /p/.t /p/a /p/b");
    EXPECT_THAT(adapter.take(), IsEmpty());
}

TEST_F(CMAwareFileManagerTest, filesOfTwoChangesWithoutAReportArePassedWithTheNextOne) {
    EXPECT_CALL(inner, add).Times(2);
    files.add({u"/p/c"});
    files.add(given);
    EXPECT_THAT(adapter.take(), IsEmpty());
    EXPECT_EQ(reportAddition(), u"addToSourceControl /p/.t /p/a /p/b /p/c");
}

TEST_F(CMAwareFileManagerTest, filesThatTheInnerManagerRefusesArePassedWithTheNextReport) {
    EXPECT_CALL(inner, add).WillOnce(Throw(std::out_of_range("no")));
    EXPECT_CALL(inner, remove).WillOnce(Throw(std::out_of_range("no")));
    EXPECT_THROW(files.add(given), std::out_of_range);
    EXPECT_THROW(files.remove(given), std::out_of_range);
    EXPECT_THAT(adapter.take(), IsEmpty());
    EXPECT_EQ(reportAddition(), u"addToSourceControl /p/.t /p/a /p/b");
    EXPECT_EQ(reportRemoval(), u"removeFromSourceControl /p/.t /p/a /p/b");
}

TEST_F(CMAwareFileManagerTest, allOtherOperationsAreForwardedAndNoteNothing) {
    CategoryDefinition const category(u"Kind", u"c");
    std::vector<Label> const labels{Label(category, LabelDefinition(u"Source", u"l"))};
    EXPECT_CALL(inner, getProjectRoot()).WillOnce(Return(u"/p"));
    EXPECT_CALL(inner, getFileMetadataManagerFor).WillOnce(Return(nullptr));
    EXPECT_CALL(inner, isFileInProject(Ref(given[0]))).WillOnce(Return(true));
    EXPECT_CALL(inner, getChildProjectFiles(Ref(given[0]))).WillOnce(Return(given));
    EXPECT_CALL(inner, getProjectFiles()).WillOnce(Return(given));
    EXPECT_CALL(inner, addLabels(Ref(given), Ref(labels))).WillOnce(Return(std::vector<FileLabel>{}));
    EXPECT_CALL(inner, removeLabels(Ref(given), Ref(labels)));
    EXPECT_CALL(inner, getLabelIDSets(Ref(given[0]))).WillOnce(Return(std::vector<LabelIDSet>{}));
    EXPECT_CALL(inner, getLabels(Ref(given[0]))).WillOnce(Return(std::vector<FileLabel>{}));
    EXPECT_CALL(inner, removeCategory(Ref(given), Ref(category)));

    EXPECT_EQ(files.getProjectRoot(), Path(u"/p"));
    EXPECT_EQ(files.getFileMetadataManagerFor(u"Mine"), nullptr);
    EXPECT_TRUE(files.isFileInProject(given[0]));
    EXPECT_EQ(files.getChildProjectFiles(given[0]), given);
    EXPECT_EQ(files.getProjectFiles(), given);
    EXPECT_THAT(files.addLabels(given, labels), IsEmpty());
    files.removeLabels(given, labels);
    EXPECT_THAT(files.getLabelIDSets(given[0]), IsEmpty());
    EXPECT_THAT(files.getLabels(given[0]), IsEmpty());
    files.removeCategory(given, category);

    EXPECT_EQ(reportAddition(), u"addToSourceControl /p/.t");
    EXPECT_EQ(reportRemoval(), u"removeFromSourceControl /p/.t");
}

} // namespace
} // namespace project::management
