#include "files/PathSets.hpp"

#include <set>

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

namespace project::management {
namespace {

using Paths = std::vector<Path>;

TEST(PathSets, aFolderIsWithinItself) {
    EXPECT_TRUE(isWithinFolder(u"/p", u"/p"));
}

TEST(PathSets, aPathBelowAFolderIsWithinIt) {
    EXPECT_TRUE(isWithinFolder(u"/p", u"/p/a/b"));
    EXPECT_FALSE(isWithinFolder(u"/p", u"/pa"));
    EXPECT_FALSE(isWithinFolder(u"/p/a", u"/p"));
}

TEST(PathSets, aNameThatBeginsWithTwoDotsCountsAsOutsideItsFolder) {
    EXPECT_FALSE(isWithinFolder(u"/p", u"/p/..hidden"));
    EXPECT_TRUE(isWithinFolder(u"/p", u"/p/a/..hidden"));
}

TEST(PathSets, parentFoldersAreAddedUpToTheRootButWithoutIt) {
    EXPECT_EQ(withParentFolders({u"/p/a/b/c.txt"}, u"/p"), (Paths{u"/p/a", u"/p/a/b", u"/p/a/b/c.txt"}));
}

TEST(PathSets, sharedParentFoldersAreListedOnceAndInPathOrder) {
    EXPECT_EQ(withParentFolders({u"/p/b/y", u"/p/b/x", u"/p/a.txt", u"/p/a/z"}, u"/p"),
              (Paths{u"/p/a", u"/p/a/z", u"/p/a.txt", u"/p/b", u"/p/b/x", u"/p/b/y"}));
}

RC_GTEST_PROP(PathSets, filesInAnyOrderAreListedOnceAndInPathOrder, ()) {
    auto const numbers = *rc::gen::container<std::vector<int>>(rc::gen::inRange(0, 40));
    Paths files;
    for (int const number : numbers) {
        auto const digits = std::to_string(number);
        files.emplace_back(u"/p/" + std::u16string(digits.begin(), digits.end()));
    }
    std::set<Path> const expected(files.begin(), files.end());

    RC_ASSERT(withParentFolders(files, u"/p") == Paths(expected.begin(), expected.end()));
}

TEST(PathSets, theRootContributesNothing) {
    EXPECT_TRUE(withParentFolders({u"/p"}, u"/p").empty());
}

TEST(PathSets, aPathOutsideTheRootIsListedAlone) {
    EXPECT_EQ(withParentFolders({u"/q/a/b"}, u"/p"), (Paths{u"/q/a/b"}));
}

TEST(PathSets, descendantsAreFoundAtAnyDepthAndTheGivenPathsStay) {
    auto const children = [](Path const& path) -> Paths {
        if (path == Path(u"/p/a")) {
            return {u"/p/a/y", u"/p/a/x"};
        }
        return path == Path(u"/p/a/x") ? Paths{u"/p/a/x/1"} : Paths{};
    };
    EXPECT_EQ(withDescendants({u"/p/z", u"/p/a"}, children),
              (Paths{u"/p/a", u"/p/a/x", u"/p/a/x/1", u"/p/a/y", u"/p/z"}));
}

} // namespace
} // namespace project::management
