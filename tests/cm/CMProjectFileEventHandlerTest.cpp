#include "cm/CMProjectFileEventHandler.hpp"

#include <optional>

#include <gmock/gmock.h>

#include "support/RecordingCMAdapter.hpp"
#include "support/RecordingMetadataManager.hpp"

namespace project::management {
namespace {

using test::AdapterFailure;
using testing::ElementsAre;
using testing::IsEmpty;

class CMProjectFileEventHandlerTest : public testing::Test {
protected:
    CMProjectFileEventHandlerTest() { adapter.setStateOfOthers(0); }

    std::vector<std::u16string> reportAddition(std::vector<Path> const& files) {
        handler->fileAdditionRequested(store, files);
        return adapter.take();
    }

    /// Files that are under source control when they are removed.
    std::vector<std::u16string> reportRemoval(std::vector<Path> const& files) {
        adapter.setStateOfOthers(1);
        handler->fileRemovalRequested(store, u"/p/.projectdata", files);
        adapter.setStateOfOthers(0);
        return adapter.take();
    }

    test::RecordingMetadataManager store;
    test::RecordingCMAdapter adapter;
    std::optional<CMProjectFileEventHandler> handler{std::in_place, adapter, u"/p"};
};

TEST_F(CMProjectFileEventHandlerTest, acceptsReportsWithoutACallOfTheAdapter) {
    EXPECT_TRUE(handler->acceptsFileChangeRequests());
    EXPECT_THAT(adapter.take(), IsEmpty());
}

TEST_F(CMProjectFileEventHandlerTest, notesAloneDoNotCallTheAdapter) {
    handler->noteAddition({u"/p/a"});
    handler->noteRemoval({u"/p/b"});
    EXPECT_THAT(adapter.take(), IsEmpty());
}

TEST_F(CMProjectFileEventHandlerTest, anEmptyReportWithNothingPendingOnlyQueriesTheEmptyList) {
    EXPECT_THAT(reportAddition({}), ElementsAre(u"getFileStates", u"getFileStates"));
    EXPECT_THAT(reportRemoval({}), ElementsAre(u"getFileStates", u"getFileStates"));
}

TEST_F(CMProjectFileEventHandlerTest, aReportOfAdditionsPassesItsFilesAndTheNotedOnesWithTheirFolders) {
    handler->noteAddition({u"/p/x/b", u"/p/x/a"});
    EXPECT_THAT(reportAddition({u"/p/.projectdata/t"}),
                ElementsAre(u"getFileStates /p/.projectdata /p/.projectdata/t /p/x /p/x/a /p/x/b",
                            u"getFileStates /p/.projectdata /p/.projectdata/t /p/x /p/x/a /p/x/b",
                            u"addToSourceControl /p/.projectdata /p/.projectdata/t /p/x /p/x/a /p/x/b"));
}

TEST_F(CMProjectFileEventHandlerTest, aReportOfRemovalsPassesItsFilesAndTheNotedOnesWithoutFolders) {
    handler->noteRemoval({u"/p/x/b", u"/p/x/a"});
    EXPECT_THAT(reportRemoval({u"/p/.projectdata/t"}),
                ElementsAre(u"getFileStates /p/.projectdata/t /p/x/a /p/x/b",
                            u"getFileStates /p/.projectdata/t /p/x/a /p/x/b",
                            u"removeFromSourceControl /p/.projectdata/t /p/x/a /p/x/b"));
}

TEST_F(CMProjectFileEventHandlerTest, notesBetweenReportsArePassedInOneCallOnceEachAndInPathOrder) {
    handler->noteAddition({u"/p/c", u"/p/a"});
    handler->noteAddition({u"/p/b", u"/p/a"});
    EXPECT_EQ(reportAddition({u"/p/c"}).back(), u"addToSourceControl /p/a /p/b /p/c");

    handler->noteRemoval({u"/p/c", u"/p/a"});
    handler->noteRemoval({u"/p/b", u"/p/a"});
    EXPECT_EQ(reportRemoval({u"/p/c"}).back(), u"removeFromSourceControl /p/a /p/b /p/c");
}

TEST_F(CMProjectFileEventHandlerTest, aReportLeavesNothingOfItsKindPending) {
    handler->noteAddition({u"/p/a"});
    handler->noteRemoval({u"/p/b"});
    reportAddition({u"/p/c"});
    reportRemoval({u"/p/d"});
    EXPECT_THAT(reportAddition({}), ElementsAre(u"getFileStates", u"getFileStates"));
    EXPECT_THAT(reportRemoval({}), ElementsAre(u"getFileStates", u"getFileStates"));
}

TEST_F(CMProjectFileEventHandlerTest, aReportKeepsPendingFilesOfTheOtherKind) {
    handler->noteAddition({u"/p/a"});
    EXPECT_EQ(reportRemoval({u"/p/x"}).back(), u"removeFromSourceControl /p/x");
    EXPECT_EQ(reportAddition({}).back(), u"addToSourceControl /p/a");

    handler->noteRemoval({u"/p/b"});
    EXPECT_EQ(reportAddition({u"/p/x"}).back(), u"addToSourceControl /p/x");
    EXPECT_EQ(reportRemoval({}).back(), u"removeFromSourceControl /p/b");
}

TEST_F(CMProjectFileEventHandlerTest, additionsAreDroppedIfTheAdapterThrows) {
    handler->noteAddition({u"/p/a"});
    adapter.failOnce(u"addToSourceControl");
    EXPECT_THROW(reportAddition({u"/p/b"}), AdapterFailure);
    adapter.take();
    EXPECT_THAT(reportAddition({}), ElementsAre(u"getFileStates", u"getFileStates"));
}

TEST_F(CMProjectFileEventHandlerTest, removalsAreDroppedIfTheAdapterThrows) {
    handler->noteRemoval({u"/p/a"});
    adapter.failOnce(u"getFileStates");
    EXPECT_THROW(reportRemoval({u"/p/b"}), AdapterFailure);
    adapter.take();
    EXPECT_THAT(reportRemoval({}), ElementsAre(u"getFileStates", u"getFileStates"));
}

TEST_F(CMProjectFileEventHandlerTest, itsDestructionDropsPendingFilesWithoutACallOfTheAdapter) {
    handler->noteAddition({u"/p/a"});
    handler->noteRemoval({u"/p/b"});
    handler.reset();
    EXPECT_THAT(adapter.take(), IsEmpty());
}

TEST_F(CMProjectFileEventHandlerTest, theRootIsTheOneOfItsConstructor) {
    Path root = u"/p/x";
    CMProjectFileEventHandler other(adapter, root);
    root = u"/p";
    other.fileAdditionRequested(store, {u"/p/x/a/b"});
    EXPECT_EQ(adapter.take().back(), u"addToSourceControl /p/x/a /p/x/a/b");
}

TEST_F(CMProjectFileEventHandlerTest, theStoreIsNotUsed) {
    reportAddition({u"/p/a"});
    reportRemoval({u"/p/a"});
    EXPECT_THAT(store.calls(), IsEmpty());
}

} // namespace
} // namespace project::management
