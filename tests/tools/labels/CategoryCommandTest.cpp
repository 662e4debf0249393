#include "tools/labels/LabelToolTest.hpp"

namespace project::test {
namespace {

using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;

using CategoryCommand = LabelToolTest;

TEST_F(CategoryCommand, listsNothingInANewProject) {
    EXPECT_THAT(tool({"category", "list"}), SucceedsSilently());
    EXPECT_THAT(tool({"category", "list", "--json"}), Prints(document("category-list", "categories", {}, 2)));
}

TEST_F(CategoryCommand, listsCategoriesByNameWithTheirAttributes) {
    ASSERT_THAT(tool({"category", "create", "Owner", "--type", "Text", "--read-only"}), SucceedsSilently());
    ASSERT_THAT(tool({"category", "create", "Area"}), SucceedsSilently());
    ASSERT_THAT(tool({"category", "create", "Status", "--single-valued"}), SucceedsSilently());

    EXPECT_THAT(tool({"category", "list"}),
                Prints("Area\nOwner (read-only, type Text)\nStatus (single-valued)\n"));
}

TEST_F(CategoryCommand, listsEveryAttributeAsJson) {
    ASSERT_THAT(tool({"category", "create", "Owner", "--read-only", "--type", "Text"}), SucceedsSilently());

    EXPECT_THAT(tool({"category", "list", "--json"}),
                Prints(document("category-list", "categories",
                                {"{\"name\": \"Owner\", \"uuid\": \"" + categoryUUID("Owner") +
                                 "\", \"readOnly\": true, \"singleValued\": false, \"type\": \"Text\", "
                                 "\"personal\": false}"},
                                2)));
}

TEST_F(CategoryCommand, refusesASecondCategoryOfTheSameName) {
    ASSERT_THAT(tool({"category", "create", "Status"}), SucceedsSilently());
    auto const before = readText();

    EXPECT_THAT(tool({"category", "create", "Status"}),
                FailsWith(1, "A category with the name \"Status\" exists already."));
    EXPECT_EQ(readText(), before);
}

TEST_F(CategoryCommand, distinguishesNamesByCase) {
    ASSERT_THAT(tool({"category", "create", "Status"}), SucceedsSilently());

    EXPECT_THAT(tool({"category", "create", "status"}), SucceedsSilently());
}

TEST_F(CategoryCommand, renamesACategoryAndKeepsItsLabelsOnFiles) {
    createLabelled("Status", "Done", "a");

    ASSERT_THAT(tool({"category", "rename", "Status", "State"}), SucceedsSilently());

    EXPECT_THAT(tool({"category", "list"}), Prints("State\n"));
    EXPECT_THAT(tool({"label", "show", "a"}), Prints("State: Done\n"));
}

TEST_F(CategoryCommand, renamesToANameThatIsTakenWithAWarning) {
    ASSERT_THAT(tool({"category", "create", "Status"}), SucceedsSilently());
    ASSERT_THAT(tool({"category", "create", "State"}), SucceedsSilently());

    auto const renamed = tool({"category", "rename", "State", "Status"});

    EXPECT_EQ(renamed.exitCode, 0);
    EXPECT_THAT(renamed.errors, HasSubstr("warning: 2 categories now have the name \"Status\""));
    EXPECT_THAT(tool({"category", "list"}), Prints("Status\nStatus\n"));
}

TEST_F(CategoryCommand, listsTheUUIDsOfANameThatSeveralHave) {
    ASSERT_THAT(tool({"category", "create", "Status"}), SucceedsSilently());
    ASSERT_THAT(tool({"category", "create", "State"}), SucceedsSilently());
    auto const status = categoryUUID("Status");
    auto const state = categoryUUID("State");
    ASSERT_EQ(tool({"category", "rename", "State", "Status"}).exitCode, 0);

    auto const ambiguous = tool({"category", "delete", "Status"});

    EXPECT_THAT(ambiguous, FailsWith(1, "several categories have the name \"Status\". Give a UUID"));
    EXPECT_THAT(ambiguous.errors, HasSubstr(status));
    EXPECT_THAT(ambiguous.errors, HasSubstr(state));
    EXPECT_THAT(tool({"category", "rename", state, "State"}), SucceedsSilently());
    EXPECT_THAT(tool({"category", "list"}), Prints("State\nStatus\n"));
}

TEST_F(CategoryCommand, deletesACategoryWithItsLabelsOnEveryFile) {
    createLabelled("Status", "Done", "a");

    ASSERT_THAT(tool({"category", "delete", "Status"}), SucceedsSilently());

    EXPECT_THAT(tool({"category", "list"}), SucceedsSilently());
    EXPECT_THAT(tool({"label", "show", "a"}), SucceedsSilently());
    EXPECT_THAT(tool({"check"}), SucceedsSilently());
}

TEST_F(CategoryCommand, neitherRenamesNorDeletesAReadOnlyCategory) {
    ASSERT_THAT(tool({"category", "create", "Status", "--read-only"}), SucceedsSilently());
    auto const before = readText();

    EXPECT_THAT(tool({"category", "rename", "Status", "State"}), FailsWith(1, "The category is read-only"));
    EXPECT_THAT(tool({"category", "delete", "Status"}), FailsWith(1, "The category is read-only"));
    EXPECT_EQ(readText(), before);
}

TEST_F(CategoryCommand, reportsACategoryThatDoesNotExist) {
    EXPECT_THAT(tool({"category", "delete", "Status"}),
                FailsWith(1, "There is no category \"Status\" in the project."));
    EXPECT_THAT(tool({"category", "delete", "01234567-89ab-4def-8123-456789abcdef"}),
                FailsWith(1, "There is no category with the UUID \"01234567-89ab-4def-8123-456789abcdef\""));
}

TEST_F(CategoryCommand, doesNotListAnAddressWithoutACategory) {
    insertLineBefore("\"a\"",
                     R"({"at":["Categories","Root","Category","01234567-89ab-4def-8123-456789abcdef"],)"
                     R"("node":false})");

    EXPECT_THAT(tool({"category", "list"}), SucceedsSilently());
    EXPECT_THAT(tool({"category", "delete", "01234567-89ab-4def-8123-456789abcdef"}),
                FailsWith(1, "There is no category with the UUID"));
}

TEST_F(CategoryCommand, keepsAnyBytesOfAName) {
    std::string const name = "two\nlines \"\xFF\" \xD7\xA2";
    ASSERT_THAT(tool({"category", "create", name}), SucceedsSilently());

    EXPECT_THAT(tool({"category", "list"}), Prints(name + "\n"));
    EXPECT_THAT(tool({"category", "delete", name}), SucceedsSilently());
    EXPECT_THAT(tool({"category", "list"}), SucceedsSilently());
}

TEST_F(CategoryCommand, quotesANameThatCouldControlTheTerminal) {
    ASSERT_THAT(tool({"category", "create", "a\033[2Jb", "--type", "x\ny"}), SucceedsSilently());
    settings_.onTerminal = true;

    EXPECT_EQ(tool({"category", "list"}).output, "\"a\\033[2Jb\" (type x\\ny)\r\n");
}

TEST_F(CategoryCommand, describesItsUse) {
    EXPECT_THAT(tool({"category"}), FailsWith(2, "'projectctl category --help' shows the usage"));
    EXPECT_THAT(tool({"category", "paint"}), FailsWith(2, "unknown command or option \"paint\""));
    EXPECT_THAT(tool({"category", "create"}),
                FailsWith(2, "'projectctl category create --help' shows the usage"));
    EXPECT_THAT(tool({"category", "rename", "--help"}).output,
                HasSubstr("Usage: projectctl category rename [OPTIONS] CATEGORY NAME"));
}

} // namespace
} // namespace project::test
