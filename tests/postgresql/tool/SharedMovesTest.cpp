#include <utility>

#include "postgresql/tool/SharedToolTest.hpp"
#include "support/GitFolder.hpp"

namespace project::test {
namespace {

using ::testing::HasSubstr;

/// Moves and personal labels in a project that a server stores.
class SharedMoves : public SharedToolTest {
protected:
    void SetUp() override {
        SharedToolTest::SetUp();
        if (IsSkipped()) {
            return;
        }
        initShared();
        leadElsewhereTo("anna");
        for (TemporaryFolder const* folder : {&std::as_const(folder_), &elsewhere_}) {
            std::filesystem::create_directories(folder->onDisk() / "src");
            folder->addFile("src/main.cpp", "the pump\n");
            folder->addFile("top", "the top\n");
        }
        auto const result =
            tool({"batch"}, "add -r src top\ncategory create Status\nlabel create Status Done\n"
                            "label put Status Done src/main.cpp\nentry set src/main.cpp --name Main\n"
                            "category create Mine --personal\nlabel create Mine Later --personal\n"
                            "label put Mine Later src/main.cpp --personal\n");
        ASSERT_EQ(result.exitCode, 0) << result.errors;
    }
};

TEST_F(SharedMoves, aMoveChangesTheProjectOfEveryClientAndTheFilesOfThisOne) {
    ASSERT_THAT(tool({"move", "src", "lib"}), SucceedsSilently());

    EXPECT_TRUE(std::filesystem::exists(folder_.onDisk() / "lib/main.cpp"));
    EXPECT_FALSE(std::filesystem::exists(folder_.onDisk() / "src"));
    EXPECT_THAT(tool({"label", "show", "lib/main.cpp"}), Prints("Status: Done\nMine: Later (personal)\n"));
    EXPECT_THAT(elsewhere({"list"}), Prints("lib\nlib/main.cpp\ntop\n"));
    EXPECT_THAT(elsewhere({"label", "find", "Status", "Done"}), Prints("lib/main.cpp\n"));
    EXPECT_THAT(elsewhere({"entry", "list", "--json"}).output, HasSubstr("\"lib/main.cpp\""));
    EXPECT_TRUE(std::filesystem::exists(elsewhere_.onDisk() / "src/main.cpp"))
        << "its files are moved by source control, as everybody's";
}

TEST_F(SharedMoves, aMoveIsOneEntryOfTheLog) {
    auto const before = std::stoi(newestVersion());

    ASSERT_EQ(tool({"move", "src", "top"}).exitCode, 1);
    EXPECT_EQ(std::stoi(newestVersion()), before);
    ASSERT_THAT(tool({"move", "src", "lib"}), SucceedsSilently());

    EXPECT_EQ(std::stoi(newestVersion()), before + 1);
}

TEST_F(SharedMoves, aMoveThatTheServerRefusesLeavesTheFilesWhereTheyAre) {
    leadElsewhereTo("rita");

    EXPECT_EQ(elsewhere({"move", "src", "lib"}).exitCode, 1);

    EXPECT_TRUE(std::filesystem::exists(elsewhere_.onDisk() / "src/main.cpp"));
    EXPECT_FALSE(std::filesystem::exists(elsewhere_.onDisk() / "lib"));
    EXPECT_THAT(tool({"list"}), Prints("src\nsrc/main.cpp\ntop\n"));
}

TEST_F(SharedMoves, anotherProgramsMoveIsAdoptedForAllClients) {
    GitFolder const git(folder_.onDisk());
    git.commitAll();
    std::filesystem::rename(folder_.onDisk() / "src", folder_.onDisk() / "lib");

    EXPECT_THAT(tool({"status", "--renames"}).output, HasSubstr("ren  src/main.cpp -> lib/main.cpp\n"));
    ASSERT_THAT(tool({"adopt"}), SucceedsSilently());

    EXPECT_THAT(elsewhere({"label", "find", "Status", "Done"}), Prints("lib/main.cpp\n"));
    EXPECT_THAT(tool({"label", "show", "lib/main.cpp"}), Prints("Status: Done\nMine: Later (personal)\n"));
}

TEST_F(SharedMoves, personalLabelsBelongToOneFolderOnly) {
    EXPECT_THAT(elsewhere({"label", "show", "src/main.cpp"}), Prints("Status: Done\n"));
    EXPECT_THAT(elsewhere({"category", "list"}), Prints("Status\n"));
}

TEST_F(SharedMoves, aReaderCanHavePersonalLabels) {
    leadElsewhereTo("rita");

    EXPECT_THAT(elsewhere({"category", "create", "Own", "--personal"}).exitCode, 0);
    EXPECT_THAT(elsewhere({"label", "create", "Own", "Read", "--personal"}), SucceedsSilently());
    EXPECT_THAT(elsewhere({"label", "put", "Own", "Read", "top", "--personal"}), SucceedsSilently());

    EXPECT_THAT(elsewhere({"label", "show", "top"}), Prints("Own: Read (personal)\n"));
    EXPECT_THAT(tool({"label", "show", "top"}), SucceedsSilently());
}

TEST_F(SharedMoves, personalLabelsOfAFileThatAnotherClientMovedAreHiddenAndFollowAGivenPair) {
    ASSERT_THAT(elsewhere({"move", "src/main.cpp", "src/pump.cpp"}), SucceedsSilently());
    EXPECT_THAT(tool({"label", "find", "Mine", "Later"}), SucceedsSilently());

    ASSERT_THAT(tool({"adopt", "src/main.cpp", "src/pump.cpp"}), SucceedsSilently());

    EXPECT_THAT(tool({"label", "find", "Mine", "Later"}), Prints("src/pump.cpp\n"));
}

} // namespace
} // namespace project::test
