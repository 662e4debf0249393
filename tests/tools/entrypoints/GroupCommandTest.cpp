#include "tools/ToolTest.hpp"

namespace project::test {
namespace {

using ::testing::HasSubstr;

class GroupCommand : public ToolTest {
protected:
    void SetUp() override {
        initProject();
        folder_.file(u"a");
        ASSERT_THAT(tool({"add", "a"}), SucceedsSilently());
    }
};

TEST_F(GroupCommand, listsTheDefaultGroupFirst) {
    EXPECT_THAT(tool({"group", "list"}), Prints("Default\n"));

    ASSERT_THAT(tool({"group", "create", "Add-ons"}), SucceedsSilently());

    EXPECT_THAT(tool({"group", "list"}), Prints("Default\nAdd-ons\n"));
    EXPECT_THAT(
        tool({"group", "list", "--json"}).output,
        HasSubstr("{\"name\": \"Default\", \"uuid\": \"default\"},\n{\"name\": \"Add-ons\", \"uuid\": \""));
}

TEST_F(GroupCommand, refusesANameThatIsTaken) {
    ASSERT_THAT(tool({"group", "create", "Nightly"}), SucceedsSilently());
    ASSERT_THAT(tool({"group", "create", "Weekly"}), SucceedsSilently());

    EXPECT_THAT(tool({"group", "create", "Nightly"}),
                FailsWith(1, "An entry point group with the name \"Nightly\" exists already."));
    EXPECT_THAT(tool({"group", "create", "Default"}),
                FailsWith(1, "An entry point group with the name \"Default\" exists already."));
    EXPECT_THAT(tool({"group", "rename", "Weekly", "Nightly"}),
                FailsWith(1, "An entry point group with the name \"Nightly\" exists already."));
    EXPECT_THAT(tool({"group", "rename", "Weekly", "Weekly"}), SucceedsSilently());
}

TEST_F(GroupCommand, renamesAGroupAndKeepsItsEntryPoints) {
    ASSERT_THAT(tool({"group", "create", "Nightly"}), SucceedsSilently());
    ASSERT_THAT(tool({"entry", "set", "a", "--group", "Nightly"}), SucceedsSilently());

    ASSERT_THAT(tool({"group", "rename", "Nightly", "Weekly"}), SucceedsSilently());

    EXPECT_THAT(tool({"entry", "show", "a"}).output, HasSubstr("group: Weekly\n"));
}

TEST_F(GroupCommand, listsARenamedDefaultGroupUnderBothNames) {
    ASSERT_THAT(tool({"entry", "set", "a"}), SucceedsSilently());
    ASSERT_THAT(tool({"group", "rename", "Default", "Main"}), SucceedsSilently());

    EXPECT_THAT(tool({"group", "list"}), Prints("Default\nMain\n"));
    EXPECT_THAT(tool({"entry", "show", "a"}).output, HasSubstr("group: Main\n"));

    ASSERT_THAT(tool({"group", "delete", "Main"}), SucceedsSilently());
    EXPECT_THAT(tool({"group", "list"}), Prints("Default\n"));
    EXPECT_THAT(tool({"entry", "show", "a"}).output, HasSubstr("group: Default\n"));
}

TEST_F(GroupCommand, doesNotDeleteTheDefaultGroup) {
    ASSERT_THAT(tool({"group", "rename", "Default", "Main"}), SucceedsSilently());

    EXPECT_THAT(tool({"group", "delete", "Default"}), FailsWith(1, "cannot be deleted"));
    EXPECT_THAT(tool({"group", "list"}), Prints("Default\nMain\n"));
}

TEST_F(GroupCommand, keepsTheEntryPointsOfADeletedGroup) {
    ASSERT_THAT(tool({"group", "create", "Nightly"}), SucceedsSilently());
    ASSERT_THAT(tool({"entry", "set", "a", "--group", "Nightly"}), SucceedsSilently());

    ASSERT_THAT(tool({"group", "delete", "Nightly"}), SucceedsSilently());

    EXPECT_THAT(tool({"group", "list"}), Prints("Default\n"));
    EXPECT_THAT(tool({"entry", "list"}), Prints("a: Basic, a\n"));
}

TEST_F(GroupCommand, reportsAGroupThatDoesNotExist) {
    EXPECT_THAT(tool({"group", "rename", "Nightly", "x"}),
                FailsWith(1, "there is no entry point group \"Nightly\""));
    EXPECT_THAT(tool({"group", "delete", "Nightly"}),
                FailsWith(1, "there is no entry point group \"Nightly\""));
    EXPECT_THAT(tool({"group", "list"}), Prints("Default\n"));
}

TEST_F(GroupCommand, listsTheUUIDsOfANameThatSeveralHave) {
    for (auto const* uuid : {"g1", "g2"}) {
        insertLineBefore("\"a\"", std::string(R"({"at":["EntryPointGroups","Root","EntryPointGroup",")") +
                                      uuid + R"("],"keys":{"Name":"Nightly"}})");
    }

    EXPECT_THAT(
        tool({"group", "delete", "Nightly"}),
        FailsWith(1, "several entry point groups have the name \"Nightly\". Give a UUID instead: g1, g2"));
    EXPECT_THAT(tool({"group", "delete", "g2"}), SucceedsSilently());
    EXPECT_THAT(tool({"group", "delete", "Nightly"}), SucceedsSilently());
}

} // namespace
} // namespace project::test
