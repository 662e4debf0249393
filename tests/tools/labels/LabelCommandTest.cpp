#include "tools/labels/LabelToolTest.hpp"

namespace project::test {
namespace {

using ::testing::HasSubstr;

class LabelCommand : public LabelToolTest {
protected:
    void SetUp() override {
        LabelToolTest::SetUp();
        ASSERT_THAT(tool({"category", "create", "Status"}), SucceedsSilently());
    }
};

TEST_F(LabelCommand, listsTheLabelsOfOneCategoryByName) {
    ASSERT_THAT(tool({"label", "create", "Status", "Open"}), SucceedsSilently());
    ASSERT_THAT(tool({"label", "create", "Status", "Done", "--read-only"}), SucceedsSilently());
    ASSERT_THAT(tool({"label", "create", "Status", "Lost", "--writable"}), SucceedsSilently());

    EXPECT_THAT(tool({"label", "list", "Status"}), Prints("Done (read-only)\nLost (writable)\nOpen\n"));
}

TEST_F(LabelCommand, listsTheLabelsOfAllCategories) {
    ASSERT_THAT(tool({"category", "create", "Area"}), SucceedsSilently());
    ASSERT_THAT(tool({"label", "create", "Status", "Open"}), SucceedsSilently());
    ASSERT_THAT(tool({"label", "create", "Area", "North"}), SucceedsSilently());

    EXPECT_THAT(tool({"label", "list"}), Prints("Area: North\nStatus: Open\n"));
}

TEST_F(LabelCommand, listsEveryAttributeAsJson) {
    ASSERT_THAT(tool({"label", "create", "Status", "Open"}), SucceedsSilently());

    EXPECT_THAT(tool({"label", "list", "--json"}),
                Prints(document("label-list", "labels",
                                {"{\"category\": {\"uuid\": \"" + categoryUUID("Status") +
                                 "\", \"name\": \"Status\"}, \"label\": {\"uuid\": \"" + labelUUID("Open") +
                                 "\", \"name\": \"Open\"}, \"readOnly\": false, "
                                 "\"inheritsReadOnly\": true, \"personal\": false}"},
                                2)));
    ASSERT_THAT(tool({"label", "delete", "Status", "Open"}), SucceedsSilently());
    EXPECT_THAT(tool({"label", "list", "--json"}), Prints(document("label-list", "labels", {}, 2)));
}

TEST_F(LabelCommand, showsInJsonWhetherALabelCanBeChanged) {
    ASSERT_THAT(tool({"category", "create", "Fixed", "--read-only"}), SucceedsSilently());
    ASSERT_THAT(tool({"label", "create", "Fixed", "Same"}), SucceedsSilently());
    ASSERT_THAT(tool({"label", "create", "Fixed", "Writable", "--writable"}), SucceedsSilently());
    ASSERT_THAT(tool({"label", "create", "Status", "Kept", "--read-only"}), SucceedsSilently());

    auto const output = tool({"label", "list", "--json"}).output;

    EXPECT_THAT(
        output,
        HasSubstr(
            "\"name\": \"Same\"}, \"readOnly\": true, \"inheritsReadOnly\": true, \"personal\": false}"));
    EXPECT_THAT(output, HasSubstr("\"name\": \"Writable\"}, \"readOnly\": false, \"inheritsReadOnly\": "
                                  "false, \"personal\": false}"));
    EXPECT_THAT(
        output,
        HasSubstr(
            "\"name\": \"Kept\"}, \"readOnly\": true, \"inheritsReadOnly\": false, \"personal\": false}"));
}

TEST_F(LabelCommand, createsLabelsInAReadOnlyCategory) {
    ASSERT_THAT(tool({"category", "create", "Fixed", "--read-only"}), SucceedsSilently());

    EXPECT_THAT(tool({"label", "create", "Fixed", "Done"}), SucceedsSilently());
}

TEST_F(LabelCommand, refusesASecondLabelOfTheSameNameInOneCategory) {
    ASSERT_THAT(tool({"category", "create", "Area"}), SucceedsSilently());
    ASSERT_THAT(tool({"label", "create", "Status", "Open"}), SucceedsSilently());

    EXPECT_THAT(tool({"label", "create", "Status", "Open"}),
                FailsWith(1, "The category \"Status\" has a label with the name \"Open\" already."));
    EXPECT_THAT(tool({"label", "create", "Area", "Open"}), SucceedsSilently());
}

TEST_F(LabelCommand, cannotBothBeReadOnlyAndWritable) {
    EXPECT_THAT(tool({"label", "create", "Status", "Open", "--read-only", "--writable"}),
                FailsWith(2, "'projectctl label create --help' shows the usage"));
}

TEST_F(LabelCommand, deletesALabelFromEveryFile) {
    ASSERT_THAT(tool({"label", "create", "Status", "Open"}), SucceedsSilently());
    ASSERT_THAT(tool({"label", "put", "Status", "Open", "a", "c"}), SucceedsSilently());

    ASSERT_THAT(tool({"label", "delete", "Status", "Open"}), SucceedsSilently());

    EXPECT_THAT(tool({"label", "list"}), SucceedsSilently());
    EXPECT_THAT(tool({"label", "show", "a", "c"}), SucceedsSilently());
}

TEST_F(LabelCommand, deletesWritableLabelsButNotReadOnlyOnes) {
    ASSERT_THAT(tool({"category", "create", "Fixed", "--read-only"}), SucceedsSilently());
    ASSERT_THAT(tool({"label", "create", "Fixed", "Inherits"}), SucceedsSilently());
    ASSERT_THAT(tool({"label", "create", "Fixed", "Writable", "--writable"}), SucceedsSilently());
    ASSERT_THAT(tool({"label", "create", "Status", "ReadOnly", "--read-only"}), SucceedsSilently());

    EXPECT_THAT(tool({"label", "delete", "Fixed", "Writable"}), SucceedsSilently());
    EXPECT_THAT(tool({"label", "delete", "Fixed", "Inherits"}), FailsWith(1, "The label is read-only"));
    EXPECT_THAT(tool({"label", "delete", "Status", "ReadOnly"}), FailsWith(1, "The label is read-only"));
    EXPECT_THAT(tool({"label", "list"}), Prints("Fixed: Inherits\nStatus: ReadOnly (read-only)\n"));
}

TEST_F(LabelCommand, reportsLabelsAndCategoriesThatDoNotExist) {
    EXPECT_THAT(tool({"label", "create", "Area", "Open"}), FailsWith(1, "There is no category \"Area\""));
    EXPECT_THAT(tool({"label", "list", "Area"}), FailsWith(1, "There is no category \"Area\""));
    EXPECT_THAT(tool({"label", "delete", "Status", "Open"}),
                FailsWith(1, "the category \"Status\" has no label \"Open\""));
    EXPECT_THAT(tool({"label", "delete", "Status", "01234567-89ab-4def-8123-456789abcdef"}),
                FailsWith(1, "There is no label with the UUID \"01234567-89ab-4def-8123-456789abcdef\""));
}

TEST_F(LabelCommand, listsTheUUIDsOfANameThatSeveralLabelsHave) {
    ASSERT_THAT(tool({"label", "create", "Status", "Open"}), SucceedsSilently());
    ASSERT_THAT(tool({"label", "create", "Status", "Opem"}), SucceedsSilently());
    auto const first = labelUUID("Open");
    auto const second = labelUUID("Opem");
    replaceInText("Opem", "Open"); // possible after a merge

    auto const ambiguous = tool({"label", "delete", "Status", "Open"});

    EXPECT_THAT(ambiguous, FailsWith(1, "several labels of the category have the name \"Open\""));
    EXPECT_THAT(ambiguous.errors, HasSubstr(first));
    EXPECT_THAT(ambiguous.errors, HasSubstr(second));
    EXPECT_THAT(tool({"label", "delete", "Status", second}), SucceedsSilently());
    EXPECT_EQ(labelUUID("Open"), first);
}

TEST_F(LabelCommand, failsOnAnUnknownReadOnlyState) {
    ASSERT_THAT(tool({"label", "create", "Status", "Open"}), SucceedsSilently());
    replaceInText("INHERITED", "Inherited");

    EXPECT_THAT(tool({"label", "list"}), FailsWith(1, "\"Inherited\" is not a read-only state of a label."));
    EXPECT_THAT(tool({"label", "put", "Status", "Open", "a"}),
                FailsWith(1, "\"Inherited\" is not a read-only state of a label."));
}

} // namespace
} // namespace project::test
