#include "cm/CMActionManager.hpp"

#include <gmock/gmock.h>

#include "support/RecordingCMAdapter.hpp"

namespace project::management {
namespace {

using test::AdapterFailure;
using test::line;
using testing::ElementsAre;
using Paths = std::vector<Path>;
using Lines = std::vector<std::u16string>;

class CMActionManagerTest : public testing::Test {
protected:
    Lines add(Paths const& files) {
        manager.add(files, root);
        return adapter.take();
    }

    Lines remove(Paths const& files) {
        manager.remove(files);
        return adapter.take();
    }

    /// The calls of an operation that does not act on any file.
    static Lines queries(Paths const& files) {
        return {line(u"getFileStates", files), line(u"getFileStates", files)};
    }

    /// The calls of an operation that queries some files and acts on some of them.
    static Lines queriesAnd(std::u16string const& action, Paths const& queried, Paths const& acted) {
        auto result = queries(queried);
        result.push_back(line(action, acted));
        return result;
    }

    static Lines added(Paths const& queried, Paths const& acted) {
        return queriesAnd(u"addToSourceControl", queried, acted);
    }

    static Lines removed(Paths const& queried, Paths const& acted) {
        return queriesAnd(u"removeFromSourceControl", queried, acted);
    }

    test::RecordingCMAdapter adapter;
    CMActionManager manager{adapter};
    Path root = u"/p";
};

TEST_F(CMActionManagerTest, aFileIsAddedWithItsFoldersButWithoutTheRootAfterTwoQueries) {
    adapter.setStateOfOthers(0);
    Paths const expected{u"/p/a", u"/p/a/b", u"/p/a/b/c"};
    EXPECT_EQ(add({u"/p/a/b/c"}), added(expected, expected));
    EXPECT_EQ(root, Path(u"/p"));
}

TEST_F(CMActionManagerTest, aFolderOfSeveralFilesIsAddedOnceAndInPathOrder) {
    adapter.setStateOfOthers(0);
    Paths const expected{u"/p/a", u"/p/a/x", u"/p/a/y", u"/p/a.txt"};
    EXPECT_EQ(add({u"/p/a.txt", u"/p/a/y", u"/p/a/x", u"/p/a/y"}), added(expected, expected));
}

TEST_F(CMActionManagerTest, aFileOutsideTheRootIsAddedWithoutItsFolders) {
    adapter.setStateOfOthers(0);
    EXPECT_EQ(add({u"/q/a/b"}), added({u"/q/a/b"}, {u"/q/a/b"}));
}

TEST_F(CMActionManagerTest, aNameThatBeginsWithTwoDotsRightBelowTheRootCountsAsOutside) {
    adapter.setStateOfOthers(0);
    EXPECT_EQ(add({u"/p/..a/b"}), added({u"/p/..a/b"}, {u"/p/..a/b"}));
    Paths const deeper{u"/p/a", u"/p/a/..b", u"/p/a/..b/c"};
    EXPECT_EQ(add({u"/p/a/..b/c"}), added(deeper, deeper));
}

TEST_F(CMActionManagerTest, theRootItselfIsNotAdded) {
    adapter.setStateOfOthers(0);
    EXPECT_EQ(add({u"/p"}), queries({}));
}

TEST_F(CMActionManagerTest, anEmptyListIsQueriedTwiceAndNotActedOn) {
    adapter.setStateOfOthers(0);
    EXPECT_EQ(add({}), queries({}));
    adapter.setStateOfOthers(5);
    EXPECT_EQ(remove({}), queries({}));
}

TEST_F(CMActionManagerTest, aFileWithoutAStateIsSkipped) {
    adapter.setStateOfOthers(0);
    adapter.setState(u"/p/b", std::nullopt);
    EXPECT_EQ(add({u"/p/a", u"/p/b", u"/p/c"}), added({u"/p/a", u"/p/b", u"/p/c"}, {u"/p/a", u"/p/c"}));
    adapter.setStateOfOthers(1);
    EXPECT_EQ(remove({u"/p/a", u"/p/b", u"/p/c"}), removed({u"/p/a", u"/p/b", u"/p/c"}, {u"/p/a", u"/p/c"}));
}

TEST_F(CMActionManagerTest, anAdapterThatKnowsNoFileIsOnlyQueried) {
    EXPECT_EQ(add({u"/p/a"}), queries({u"/p/a"}));
    EXPECT_EQ(remove({u"/p/a"}), queries({u"/p/a"}));
}

TEST_F(CMActionManagerTest, aFolderUnderSourceControlIsNotAddedWithItsFile) {
    adapter.setStateOfOthers(0);
    adapter.setState(u"/p/a", 1);
    EXPECT_EQ(add({u"/p/a/x"}), added({u"/p/a", u"/p/a/x"}, {u"/p/a/x"}));
}

TEST_F(CMActionManagerTest, onlyFilesOfStateZeroAreAdded) {
    for (int state = -1; state <= 11; ++state) {
        SCOPED_TRACE(state);
        adapter.setStateOfOthers(state);
        EXPECT_EQ(add({u"/p/a"}), state == 0 ? added({u"/p/a"}, {u"/p/a"}) : queries({u"/p/a"}));
    }
}

TEST_F(CMActionManagerTest, filesOfEveryStateBut0And2And6And8And9AreRemoved) {
    for (int const state : {-1, 1, 3, 4, 5, 7, 10, 11}) {
        SCOPED_TRACE(state);
        adapter.setStateOfOthers(state);
        EXPECT_EQ(remove({u"/p/a"}), removed({u"/p/a"}, {u"/p/a"}));
    }
    for (int const state : {0, 2, 6, 8, 9}) {
        SCOPED_TRACE(state);
        adapter.setStateOfOthers(state);
        EXPECT_EQ(remove({u"/p/a"}), queries({u"/p/a"}));
    }
}

TEST_F(CMActionManagerTest, filesAreRemovedInTheOrderGivenWithoutTheirFolders) {
    adapter.setStateOfOthers(1);
    Paths const files{u"/p/b/y", u"/p/a", u"/q/z", u"/p/a"};
    EXPECT_EQ(remove(files), removed(files, files));
}

TEST_F(CMActionManagerTest, theSecondQueryDecides) {
    int query = 0;
    adapter.onCall = [&](std::u16string const& operation) {
        if (operation == u"getFileStates") {
            ++query;
            adapter.setState(u"/p/a", query % 2 == 1 ? 0 : 1);
            adapter.setState(u"/p/b", query % 2 == 1 ? 1 : 0);
        }
    };
    EXPECT_EQ(add({u"/p/a", u"/p/b"}), added({u"/p/a", u"/p/b"}, {u"/p/b"}));
    EXPECT_EQ(remove({u"/p/a", u"/p/b"}), removed({u"/p/a", u"/p/b"}, {u"/p/a"}));
}

TEST_F(CMActionManagerTest, aQueryThatFailsEndsTheOperation) {
    adapter.setStateOfOthers(0);
    adapter.failOnce(u"getFileStates");
    EXPECT_THROW(manager.add({u"/p/a"}, root), AdapterFailure);
    EXPECT_THAT(adapter.take(), ElementsAre(u"getFileStates /p/a"));

    adapter.setStateOfOthers(5);
    adapter.failOnce(u"getFileStates");
    EXPECT_THROW(manager.remove({u"/p/a"}), AdapterFailure);
    EXPECT_THAT(adapter.take(), ElementsAre(u"getFileStates /p/a"));
}

TEST_F(CMActionManagerTest, aSecondQueryThatFailsPreventsTheAction) {
    adapter.setStateOfOthers(0);
    int query = 0;
    adapter.onCall = [&](auto const&) {
        if (++query == 2) {
            throw AdapterFailure();
        }
    };
    EXPECT_THROW(manager.add({u"/p/a"}, root), AdapterFailure);
    EXPECT_EQ(adapter.take(), queries({u"/p/a"}));
}

TEST_F(CMActionManagerTest, anErrorOfTheActionPropagatesToTheCaller) {
    adapter.setStateOfOthers(0);
    adapter.failOnce(u"addToSourceControl");
    EXPECT_THROW(manager.add({u"/p/a"}, root), AdapterFailure);
    adapter.setStateOfOthers(5);
    adapter.failOnce(u"removeFromSourceControl");
    EXPECT_THROW(manager.remove({u"/p/a"}), AdapterFailure);
}

} // namespace
} // namespace project::management
