#include "tools/ToolTest.hpp"

namespace project::test {
namespace {

using ::testing::HasSubstr;
using ::testing::Not;

class RemoveCommand : public ToolTest {
protected:
    void SetUp() override {
        initProject();
        folder_.file(u"a");
        folder_.file(u"src/io/pump.cpp");
        folder_.file(u"src/main.cpp");
        ASSERT_THAT(tool({"add", "-r", "."}), SucceedsSilently());
    }
};

TEST_F(RemoveCommand, removesAFileFromTheProjectAndLeavesItOnDisk) {
    ASSERT_THAT(tool({"remove", "src/main.cpp"}), SucceedsSilently());

    EXPECT_THAT(tool({"list"}), Prints("a\nsrc\nsrc/io\nsrc/io/pump.cpp\n"));
    EXPECT_TRUE(std::filesystem::exists(inFolder("src/main.cpp")));
    EXPECT_THAT(tool({"status"}), Prints("new  src/main.cpp\n"));
}

TEST_F(RemoveCommand, removesEverythingBelowAFolder) {
    ASSERT_THAT(tool({"category", "create", "Status"}), SucceedsSilently());
    ASSERT_THAT(tool({"label", "create", "Status", "Done"}), SucceedsSilently());
    ASSERT_THAT(tool({"label", "put", "Status", "Done", "src/io", "src/io/pump.cpp", "a"}),
                SucceedsSilently());
    ASSERT_THAT(tool({"entry", "set", "src/io/pump.cpp"}), SucceedsSilently());

    ASSERT_THAT(tool({"remove", "src"}), SucceedsSilently());

    EXPECT_THAT(tool({"list"}), Prints("a\n"));
    EXPECT_THAT(tool({"label", "find", "Status"}), Prints("a\n"));
    EXPECT_THAT(readText(), Not(HasSubstr("pump")));
    EXPECT_THAT(tool({"check"}), SucceedsSilently());
}

TEST_F(RemoveCommand, takesPathsFromStandardInput) {
    EXPECT_THAT(tool({"remove", "-0"}, withZeros({"a", "src/main.cpp"})), SucceedsSilently());

    EXPECT_THAT(tool({"list"}), Prints("src\nsrc/io\nsrc/io/pump.cpp\n"));
}

TEST_F(RemoveCommand, removesFilesThatWereDeletedFromTheDisk) {
    folder_.remove(u"src");

    ASSERT_THAT(tool({"remove", "src/"}), SucceedsSilently());

    EXPECT_THAT(tool({"list"}), Prints("a\n"));
    EXPECT_THAT(tool({"status"}), SucceedsSilently());
}

TEST_F(RemoveCommand, removesNothingWhenOnePathIsNotInTheProject) {
    auto const before = readText();

    EXPECT_THAT(tool({"remove", "a", "no"}), FailsWith(1, "/no\" is not in the project."));
    EXPECT_THAT(tool({"remove", "a", "."}), FailsWith(1, "because it is the project's root folder"));
    EXPECT_EQ(readText(), before);
}

TEST_F(RemoveCommand, reportsTheNumberOnATerminal) {
    settings_.onTerminal = true;

    EXPECT_EQ(tool({"remove", "src"}).output, "4 removed from the project\r\n");
}

TEST_F(RemoveCommand, requiresAPath) {
    EXPECT_THAT(tool({"remove"}), FailsWith(2, "PATH is required"));
}

} // namespace
} // namespace project::test
