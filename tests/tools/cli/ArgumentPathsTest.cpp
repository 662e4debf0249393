#include "cli/ArgumentPaths.hpp"

#include <gtest/gtest.h>

#include "output/Failure.hpp"
#include "support/TemporaryFolder.hpp"

namespace projectctl {
namespace {

class ArgumentPathsTest : public ::testing::Test {
protected:
    ArgumentPathsTest() {
        folder_.addFile("real/deep/file");
        folder_.addLink("link", "real");
        folder_.addLink("fileLink", "real/deep/file");
    }

    /// Relative to the current folder if the path is below it.
    std::u16string absolute(std::string const& argument) {
        auto const result = paths_.absolute(argument).native();
        auto const root = folder_.root().native();
        return result.starts_with(root) ? result.substr(root.size()) : result;
    }

    project::test::TemporaryFolder folder_;
    ArgumentPaths paths_{folder_.root()};
};

TEST_F(ArgumentPathsTest, resolvesTheFolderPart) {
    EXPECT_EQ(absolute("real/deep/file"), u"/real/deep/file");
    EXPECT_EQ(absolute("link/deep/file"), u"/real/deep/file");
    EXPECT_EQ(absolute("./real//deep/../deep/./file"), u"/real/deep/file");
    EXPECT_EQ(absolute("link/deep/../other"), u"/real/other"); // from the target of the link upwards
}

TEST_F(ArgumentPathsTest, leavesTheLastElementAlone) {
    EXPECT_EQ(absolute("fileLink"), u"/fileLink");
    EXPECT_EQ(absolute("link"), u"/link");
    EXPECT_EQ(absolute("missing"), u"/missing");
    EXPECT_EQ(absolute("..dots"), u"/..dots");
}

TEST_F(ArgumentPathsTest, resolvesAnArgumentThatNamesAFolder) {
    EXPECT_EQ(absolute("."), u"");
    EXPECT_EQ(absolute("real/.."), u"");
    EXPECT_EQ(absolute("real/deep/.."), u"/real");
    EXPECT_EQ(absolute("link/"), u"/real");
    EXPECT_EQ(absolute("link/."), u"/real");
    EXPECT_EQ(absolute("real//"), u"/real");
    EXPECT_EQ(absolute("/"), u"/");
}

TEST_F(ArgumentPathsTest, acceptsAbsolutePaths) {
    EXPECT_EQ(absolute((folder_.onDisk() / "link/deep").string()), u"/real/deep");
    EXPECT_EQ(absolute("/file"), u"/file");
}

TEST_F(ArgumentPathsTest, acceptsFoldersThatDoNotExist) {
    EXPECT_EQ(absolute("missing/deep/file"), u"/missing/deep/file");
}

TEST_F(ArgumentPathsTest, preservesBytesThatAreNotUtf8) {
    EXPECT_EQ(absolute("a\xFF"), (std::u16string{u'/', u'a', char16_t(0xDCFF)}));
}

TEST_F(ArgumentPathsTest, refusesAnEmptyPath) {
    EXPECT_THROW(paths_.absolute(""), Failure);
}

} // namespace
} // namespace projectctl
