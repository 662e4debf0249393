#include "tools/labels/LabelToolTest.hpp"

namespace project::test {
namespace {

using ::testing::ElementsAre;
using ::testing::HasSubstr;

class FileLabelCommand : public LabelToolTest {
protected:
    void SetUp() override {
        LabelToolTest::SetUp();
        ASSERT_THAT(tool({"category", "create", "Status", "--single-valued"}), SucceedsSilently());
        ASSERT_THAT(tool({"category", "create", "Owner"}), SucceedsSilently());
        ASSERT_THAT(tool({"label", "create", "Status", "Open"}), SucceedsSilently());
        ASSERT_THAT(tool({"label", "create", "Status", "Done"}), SucceedsSilently());
        ASSERT_THAT(tool({"label", "create", "Owner", "Ann"}), SucceedsSilently());
        ASSERT_THAT(tool({"label", "create", "Owner", "Bob"}), SucceedsSilently());
    }

    /// Puts the only label on the file "a" a second time, as after a merge of two branches that
    /// label the same file.
    void doubleTheLabelOnA(std::string const& uuid) const {
        auto const label = R"({"type":"Label","keys":{"UUID":")" + uuid + R"("}})";
        replaceInText(label, label + ',' + label);
    }
};

TEST_F(FileLabelCommand, showsNothingForAFileWithoutLabels) {
    EXPECT_THAT(tool({"label", "show", "a"}), SucceedsSilently());
    EXPECT_THAT(tool({"label", "show", "a", "--json"}), Prints(document("label-show", "labels", {}, 2)));
}

TEST_F(FileLabelCommand, putsALabelOnManyFilesInOneStep) {
    ASSERT_THAT(tool({"label", "put", "Owner", "Ann", "a", "b"}), SucceedsSilently());

    EXPECT_THAT(tool({"label", "show", "a", "b", "c"}), Prints("a: Owner: Ann\nb: Owner: Ann\n"));
}

TEST_F(FileLabelCommand, takesFilesFromStandardInput) {
    EXPECT_THAT(tool({"label", "put", "Owner", "Ann", "-0"}, withZeros({"a", "c"})), SucceedsSilently());
    EXPECT_THAT(tool({"label", "find", "Owner", "Ann"}), Prints("a\nc\n"));

    EXPECT_THAT(tool({"label", "take", "Owner", "Ann", "-"}, "a\nc\n"), SucceedsSilently());
    EXPECT_THAT(tool({"label", "find", "Owner", "Ann"}), SucceedsSilently());
}

TEST_F(FileLabelCommand, takesPathsRelativeToTheCurrentFolder) {
    folder_.file(u"src/pump.cpp");
    ASSERT_THAT(tool({"add", "src/pump.cpp"}), SucceedsSilently());

    EXPECT_THAT(toolFrom("src", {"label", "put", "Owner", "Ann", "pump.cpp"}), SucceedsSilently());
    EXPECT_THAT(tool({"label", "find", "Owner"}), Prints("src/pump.cpp\n"));
}

TEST_F(FileLabelCommand, replacesTheOtherLabelOfASingleValuedCategory) {
    ASSERT_THAT(tool({"label", "put", "Status", "Open", "a"}), SucceedsSilently());
    ASSERT_THAT(tool({"label", "put", "Status", "Done", "a"}), SucceedsSilently());

    EXPECT_THAT(tool({"label", "show", "a"}), Prints("Status: Done\n"));
}

TEST_F(FileLabelCommand, reportsTheChangesOnATerminal) {
    ASSERT_THAT(tool({"label", "put", "Status", "Open", "a"}), SucceedsSilently());
    settings_.onTerminal = true;

    EXPECT_EQ(tool({"label", "put", "Status", "Done", "a", "b"}).output, "put on 2, replacing 1 other\r\n");
    EXPECT_EQ(tool({"label", "take", "Status", "Done", "a", "b", "c"}).output, "removed from 2\r\n");
}

TEST_F(FileLabelCommand, keepsSeveralLabelsOfAnyOtherCategory) {
    ASSERT_THAT(tool({"label", "put", "Owner", "Ann", "a"}), SucceedsSilently());
    ASSERT_THAT(tool({"label", "put", "Owner", "Bob", "a"}), SucceedsSilently());

    EXPECT_THAT(tool({"label", "show", "a"}), Prints("Owner: Ann\nOwner: Bob\n"));
}

TEST_F(FileLabelCommand, doesNotPutALabelOnAFileTwice) {
    ASSERT_THAT(tool({"label", "put", "Owner", "Ann", "a"}), SucceedsSilently());
    auto const before = readText();

    ASSERT_THAT(tool({"label", "put", "Owner", "Ann", "a"}), SucceedsSilently());
    EXPECT_EQ(readText(), before);
    ASSERT_THAT(tool({"label", "put", "Owner", "Ann", "a", "b", "b"}), SucceedsSilently());
    EXPECT_THAT(tool({"label", "take", "Owner", "Ann", "a", "b"}), SucceedsSilently());
    EXPECT_THAT(tool({"label", "show", "a", "b"}), SucceedsSilently());
}

TEST_F(FileLabelCommand, changesNothingWhenOneFileIsNotInTheProject) {
    folder_.file(u"new");
    auto const before = readText();

    EXPECT_THAT(tool({"label", "put", "Owner", "Ann", "a", "new"}),
                FailsWith(1, "/new\" is not in the project."));
    EXPECT_THAT(tool({"label", "take", "Owner", "Ann", "a", "new"}),
                FailsWith(1, "/new\" is not in the project."));
    EXPECT_THAT(tool({"label", "show", "a", "new"}), FailsWith(1, "/new\" is not in the project."));
    EXPECT_EQ(readText(), before);
}

TEST_F(FileLabelCommand, putsNothingOnTheRootWhichCannotHaveLabels) {
    EXPECT_THAT(tool({"label", "put", "Owner", "Ann", "."}), FailsWith(1, "is not in the project."));
    EXPECT_THAT(tool({"label", "show", "."}), SucceedsSilently());
}

TEST_F(FileLabelCommand, removesOneLabelAndLeavesTheOthers) {
    ASSERT_THAT(tool({"label", "put", "Owner", "Ann", "a"}), SucceedsSilently());
    ASSERT_THAT(tool({"label", "put", "Owner", "Bob", "a"}), SucceedsSilently());

    ASSERT_THAT(tool({"label", "take", "Owner", "Ann", "a", "b"}), SucceedsSilently());

    EXPECT_THAT(tool({"label", "show", "a"}), Prints("Owner: Bob\n"));
}

TEST_F(FileLabelCommand, removesALabelThatAFileHasTwice) {
    ASSERT_THAT(tool({"label", "put", "Owner", "Ann", "a"}), SucceedsSilently());
    doubleTheLabelOnA(labelUUID("Ann"));
    ASSERT_THAT(tool({"label", "put", "Owner", "Ann", "b"}), SucceedsSilently());
    ASSERT_THAT(tool({"label", "show", "a"}), Prints("Owner: Ann\n"));

    ASSERT_THAT(tool({"label", "take", "Owner", "Ann", "a", "b"}), SucceedsSilently());

    EXPECT_THAT(tool({"label", "show", "a", "b"}), SucceedsSilently());
    EXPECT_THAT(tool({"check"}), SucceedsSilently());
}

TEST_F(FileLabelCommand, removesADeletedLabelByItsUUIDs) {
    ASSERT_THAT(tool({"label", "put", "Owner", "Ann", "a"}), SucceedsSilently());
    auto const owner = categoryUUID("Owner");
    auto const ann = labelUUID("Ann");
    doubleTheLabelOnA(ann);
    ASSERT_THAT(tool({"label", "delete", "Owner", "Ann"}), SucceedsSilently()); // removes one of the two
    ASSERT_THAT(tool({"label", "show", "a"}), FailsWith(1, "There is no label with the UUID \"" + ann));

    ASSERT_THAT(tool({"label", "take", owner, ann, "a"}), SucceedsSilently());

    EXPECT_THAT(tool({"label", "show", "a"}), SucceedsSilently());
    EXPECT_THAT(tool({"label", "take", "Owner", "Ann", "a"}),
                FailsWith(1, "the category \"Owner\" has no label \"Ann\""));
}

TEST_F(FileLabelCommand, removesALabelOfADeletedCategory) {
    ASSERT_THAT(tool({"label", "put", "Owner", "Ann", "a"}), SucceedsSilently());
    auto const owner = categoryUUID("Owner");
    auto const ann = labelUUID("Ann");
    ASSERT_THAT(tool({"category", "delete", "Owner"}), SucceedsSilently());
    insertLineBefore("\"b\"", R"({"file":"a","children":[{"type":"Category","keys":{"UUID":")" + owner +
                                  R"("},"children":[{"type":"Label","keys":{"UUID":")" + ann + R"("}}]}]})");
    replaceInText("\"a\"\n", "");
    ASSERT_THAT(tool({"label", "show", "a"}), FailsWith(1, "There is no category with the UUID \"" + owner));

    ASSERT_THAT(tool({"label", "take", owner, ann, "a"}), SucceedsSilently());

    EXPECT_THAT(tool({"label", "show", "a"}), SucceedsSilently());
    EXPECT_THAT(tool({"label", "take", owner, "Ann", "a"}),
                FailsWith(1, "There is no category with the UUID \"" + owner));
}

TEST_F(FileLabelCommand, showsALabelThatHasDataOnceWithItsData) {
    ASSERT_THAT(tool({"label", "put", "Owner", "Ann", "a"}), SucceedsSilently());
    ASSERT_THAT(tool({"label", "put", "Owner", "Bob", "a"}), SucceedsSilently());
    insertLineBefore("\"b\"", R"({"at":["Files","Root","File","a","LabelData","Data"],)"
                              R"("children":[{"type":"Record","keys":{"UUID":")" +
                                  labelUUID("Ann") + R"(","Value":"since May"}}]})");

    EXPECT_THAT(tool({"label", "show", "a"}), Prints("Owner: Ann = since May\nOwner: Bob\n"));
    EXPECT_THAT(tool({"label", "show", "a", "--json"}).output,
                HasSubstr("\"label\": {\"uuid\": \"" + labelUUID("Ann") +
                          "\", \"name\": \"Ann\"}, \"data\": \"since May\", \"personal\": false},\n"));
}

TEST_F(FileLabelCommand, findsTheFilesWithALabelOrAnyLabelOfACategory) {
    folder_.file(u"src/pump.cpp");
    ASSERT_THAT(tool({"add", "src/pump.cpp"}), SucceedsSilently());
    ASSERT_THAT(tool({"label", "put", "Owner", "Ann", "src", "b"}), SucceedsSilently());
    ASSERT_THAT(tool({"label", "put", "Owner", "Bob", "src/pump.cpp"}), SucceedsSilently());
    ASSERT_THAT(tool({"label", "put", "Status", "Done", "c"}), SucceedsSilently());

    EXPECT_THAT(tool({"label", "find", "Owner", "Ann"}), Prints("b\nsrc\n"));
    EXPECT_THAT(tool({"label", "find", "Owner"}), Prints("b\nsrc\nsrc/pump.cpp\n"));
    EXPECT_THAT(tool({"label", "find", "Owner", "-0"}), Prints(withZeros({"b", "src", "src/pump.cpp"})));
    EXPECT_THAT(tool({"label", "find", "Owner", "Ann", "--json"}),
                Prints(document(
                    "list", "files",
                    {"{\"path\": \"b\", \"kind\": \"file\"}", "{\"path\": \"src\", \"kind\": \"folder\"}"})));
    EXPECT_THAT(tool({"label", "find", "Status", "Open", "--json"}), Prints(document("list", "files", {})));
}

TEST_F(FileLabelCommand, reportsALabelToFindThatDoesNotExist) {
    EXPECT_THAT(tool({"label", "find", "Area"}), FailsWith(1, "There is no category \"Area\""));
    EXPECT_THAT(tool({"label", "find", "Owner", "Eve"}),
                FailsWith(1, "the category \"Owner\" has no label \"Eve\""));
    EXPECT_THAT(tool({"label", "find", "Owner", "--json", "-0"}), FailsInJsonWith(2, "excludes"));
}

TEST_F(FileLabelCommand, losesTheLabelsOfAFileThatIsAddedAnew) {
    ASSERT_THAT(tool({"label", "put", "Owner", "Ann", "a", "b"}), SucceedsSilently());

    ASSERT_THAT(tool({"add", "--anew", "a"}), SucceedsSilently());

    EXPECT_THAT(tool({"label", "find", "Owner", "Ann"}), Prints("b\n"));
}

TEST_F(FileLabelCommand, isReportedByStatusAndCheckWhenTheLabelDoesNotExist) {
    ASSERT_THAT(tool({"label", "put", "Owner", "Ann", "a"}), SucceedsSilently());
    auto const ann = labelUUID("Ann");
    replaceInText(R"("Label",")" + ann, R"("Label","another)");

    auto const text =
        "the file \"a\" has the label \"" + ann + "\" of the category \"Owner\", which does not exist";
    EXPECT_THAT(tool({"status"}), Prints("bad  " + text + "\n"));
    EXPECT_THAT(
        tool({"status", "--json"}).output,
        AllOf(HasSubstr("\"findings\": [\n{\"code\": \"label-missing\", \"fault\": true, \"path\": \"a\", "
                        "\"line\": "),
              HasSubstr("\"text\": \"the file \\\"a\\\" has the label ")));
    EXPECT_EQ(tool({"check"}).exitCode, 3);
    EXPECT_THAT(tool({"check"}).output, HasSubstr(": " + text + "\n"));
}

TEST_F(FileLabelCommand, isReportedByStatusAndCheckWhenItsCategoryDoesNotExist) {
    ASSERT_THAT(tool({"label", "put", "Owner", "Ann", "a"}), SucceedsSilently());
    auto const owner = categoryUUID("Owner");
    replaceInText(R"("Category",")" + owner, R"("Category","another)");

    auto const text = "the file \"a\" has a label of the category \"" + owner + "\", which does not exist\n";
    EXPECT_THAT(tool({"status"}), Prints("bad  " + text));
    EXPECT_THAT(tool({"check"}).output, HasSubstr(": " + text));
}

TEST_F(FileLabelCommand, isReportedByStatusAndCheckWhenAFileHasTwoLabelsOfASingleValuedCategory) {
    ASSERT_THAT(tool({"label", "put", "Status", "Open", "a"}), SucceedsSilently());
    auto const label = [](std::string const& uuid) {
        return R"({"type":"Label","keys":{"UUID":")" + uuid + R"("}})";
    };
    replaceInText(label(labelUUID("Open")), label(labelUUID("Open")) + ',' + label(labelUUID("Done")));

    auto const text =
        std::string("the file \"a\" has 2 labels of the category \"Status\", which allows one\n");
    EXPECT_THAT(tool({"status"}), Prints("bad  " + text));
    EXPECT_THAT(tool({"check"}).output, HasSubstr(": " + text));
    EXPECT_EQ(tool({"check"}).exitCode, 3);
    ASSERT_THAT(tool({"label", "take", "Status", "Open", "a"}), SucceedsSilently());
    EXPECT_THAT(tool({"status"}), SucceedsSilently());
}

TEST_F(FileLabelCommand, isNotedByStatusAndCheckWhenAFileHasItTwice) {
    ASSERT_THAT(tool({"label", "put", "Owner", "Ann", "a"}), SucceedsSilently());
    doubleTheLabelOnA(labelUUID("Ann"));

    auto const text = std::string("the file \"a\" has the label \"Ann\" of the category \"Owner\" 2 times\n");
    EXPECT_THAT(tool({"status"}), Prints("note " + text));
    EXPECT_EQ(tool({"check"}).exitCode, 0);
    EXPECT_THAT(tool({"check"}).output, HasSubstr(": note: " + text));
}

} // namespace
} // namespace project::test
