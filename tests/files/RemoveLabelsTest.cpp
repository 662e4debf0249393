#include <stdexcept>

#include "files/LabelledFile.hpp"
#include "support/ErrorMatchers.hpp"

namespace project::management {
namespace {

using test::wasHeldThroughout;
using testing::ElementsAre;
using testing::IsEmpty;

using RemoveLabelsTest = test::LabelledFile;

TEST_F(RemoveLabelsTest, takesTheCategoryAlongWithItsLastLabel) {
    bear(a, color, {red});
    files.removeLabels({a}, {Label(color, red)});
    EXPECT_THAT(borne(a), IsEmpty());
}

TEST_F(RemoveLabelsTest, leavesTheOtherLabelsOfTheCategory) {
    bear(a, tags, {urgent, later});
    bear(a, color, {red});
    files.removeLabels({a}, {Label(tags, urgent)});
    EXPECT_EQ(borne(a), (Borne{{u"c-tags", {u"l-later"}}, {u"c-color", {u"l-red"}}}));
}

TEST_F(RemoveLabelsTest, leavesACategoryThatHoldsAnythingElse) {
    bear(a, color, {red});
    auto const node = stored(at(a));
    append(*node->getChildren()[0], u"Other", {{u"UUID", u"foreign"}});
    replace(at(a), node);

    files.removeLabels({a}, {Label(color, red)});

    EXPECT_EQ(borne(a), (Borne{{u"c-color", {u"foreign"}}}));
}

TEST_F(RemoveLabelsTest, doesNotTakeAChildOfAnotherTypeForTheLabel) {
    auto const node = stored(at(a));
    append(append(*node, u"Category", {{u"UUID", u"c-color"}}), u"Other", {{u"UUID", u"l-red"}});
    replace(at(a), node);

    files.removeLabels({a}, {Label(color, red)});

    EXPECT_EQ(borne(a), (Borne{{u"c-color", {u"l-red"}}}));
}

TEST_F(RemoveLabelsTest, writesTheNodeBackAndNoDataForALabelThatIsNotThere) {
    bear(a, tags, {urgent});
    record(a, red, u"dark");
    record(a, later, u"at six");

    files.removeLabels({a}, {Label(color, red), Label(tags, later)});

    ASSERT_THAT(store->writes(), ElementsAre("setNodes"));
    EXPECT_THAT(store->calls("setNodes")[0].paths, ElementsAre(at(a)));
    EXPECT_EQ(borne(a), (Borne{{u"c-tags", {u"l-urgent"}}}));
    EXPECT_THAT(records(a), ElementsAre(u"dark", u"at six"));
}

TEST_F(RemoveLabelsTest, writesNoDataForALabelWithout) {
    bear(a, color, {red});
    record(a, blue, u"bright");

    files.removeLabels({a}, {Label(color, red)});

    EXPECT_THAT(store->writes(), ElementsAre("setNodes"));
    EXPECT_THAT(records(a), ElementsAre(u"bright"));
}

TEST_F(RemoveLabelsTest, takesAllRecordsOfTheLabelAlong) {
    bear(a, color, {red});
    record(a, red, u"one");
    record(a, red, u"two");
    record(a, blue, u"stays");
    record(a, red, u"three");

    files.removeLabels({a}, {Label(color, red)});

    EXPECT_THAT(records(a), ElementsAre(u"stays"));
}

TEST_F(RemoveLabelsTest, writesTheDataOfAllFilesWhenOneLostSome) {
    auto const b = file(u"b");
    bear(a, color, {red});
    bear(b, color, {red});
    record(b, red, u"dark");
    store->clear();

    files.removeLabels({a, b}, {Label(color, red)});

    ASSERT_THAT(store->writes(), ElementsAre("setNodes", "setNodes"));
    EXPECT_THAT(store->calls("setNodes")[0].paths, ElementsAre(at(a), at(b)));
    EXPECT_THAT(store->calls("setNodes")[1].paths, ElementsAre(dataAt(a), dataAt(b)));
    EXPECT_TRUE(isEqual(*stored(dataAt(a)), metadata::MetadataNodeSpecification(u"Info")));
    EXPECT_TRUE(wasHeldThroughout(Guard::Write, store->calls()));
}

TEST_F(RemoveLabelsTest, takesOneOfTwoThatAreTheSame) {
    bear(a, tags, {urgent, later, urgent});
    files.removeLabels({a}, {Label(tags, urgent)});
    EXPECT_EQ(borne(a), (Borne{{u"c-tags", {u"l-later", u"l-urgent"}}}));
}

TEST_F(RemoveLabelsTest, takesBothOfTwoThatAreTheSameWhenAskedTwice) {
    bear(a, tags, {urgent, urgent});
    files.removeLabels({a}, {Label(tags, urgent), Label(tags, urgent)});
    EXPECT_THAT(borne(a), IsEmpty());
}

TEST_F(RemoveLabelsTest, raisesForAPathThatIsNotInTheProjectAndWritesNothing) {
    bear(a, color, {red});
    auto const unknown = root / u"unknown";
    EXPECT_RAISES(FileNotInProject, (unknown), files.removeLabels({a, unknown}, {Label(color, red)}));
    EXPECT_THAT(store->writes(), IsEmpty());
}

TEST_F(RemoveLabelsTest, treatsTheStoresOwnFilesLikeAnyOther) {
    auto const metadataFile = file(u".projectdata/project.jsonl");
    bear(metadataFile, color, {red});
    files.removeLabels({metadataFile}, {Label(color, red)});
    EXPECT_THAT(borne(metadataFile), IsEmpty());
}

TEST_F(RemoveLabelsTest, writesAnEmptyBatchWithoutFiles) {
    files.removeLabels({}, {Label(color, red)});
    ASSERT_THAT(store->writes(), ElementsAre("setNodes"));
    EXPECT_THAT(store->calls("setNodes")[0].paths, IsEmpty());
}

TEST_F(RemoveLabelsTest, leavesTheFileNodesWrittenWhenTheDataCanNotBe) {
    bear(a, color, {red});
    record(a, red, u"dark");
    int writes = 0;
    store->failOn("setNodes", [&] {
        if (++writes == 2) {
            throw std::runtime_error("the disk fails");
        }
    });

    EXPECT_THROW(files.removeLabels({a}, {Label(color, red)}), std::runtime_error);

    EXPECT_THAT(borne(a), IsEmpty());
    EXPECT_THAT(records(a), ElementsAre(u"dark"));
}

using RemoveCategoryTest = test::LabelledFile;

TEST_F(RemoveCategoryTest, takesAllLabelsOfTheCategoryAndLeavesTheOthers) {
    bear(a, tags, {urgent, later});
    bear(a, color, {red});
    files.removeCategory({a}, tags);
    EXPECT_EQ(borne(a), (Borne{{u"c-color", {u"l-red"}}}));
}

TEST_F(RemoveCategoryTest, leavesTheDataRecordsOfItsLabelsBehind) {
    bear(a, color, {red});
    record(a, red, u"dark");

    files.removeCategory({a}, color);

    EXPECT_THAT(borne(a), IsEmpty());
    EXPECT_THAT(records(a), ElementsAre(u"dark"));
    EXPECT_THAT(store->writes(), ElementsAre("setNodes"));
}

TEST_F(RemoveCategoryTest, writesFilesThatDoNotBearItBackUnchanged) {
    bear(a, color, {red});
    auto const before = stored(at(a));

    files.removeCategory({a}, tags);

    ASSERT_THAT(store->writes(), ElementsAre("setNodes"));
    EXPECT_THAT(store->calls("setNodes")[0].paths, ElementsAre(at(a)));
    EXPECT_TRUE(isEqual(*stored(at(a)), *before));
}

TEST_F(RemoveCategoryTest, writesAllFilesInOneBatchUnderOneGuard) {
    auto const b = file(u"b");
    files.removeCategory({b, a, b}, color);
    ASSERT_THAT(store->writes(), ElementsAre("setNodes"));
    EXPECT_THAT(store->calls("setNodes")[0].paths, ElementsAre(at(a), at(b)));
    EXPECT_TRUE(wasHeldThroughout(Guard::Write, store->calls()));
}

TEST_F(RemoveCategoryTest, writesAnEmptyBatchWithoutFiles) {
    files.removeCategory({}, color);
    ASSERT_THAT(store->writes(), ElementsAre("setNodes"));
    EXPECT_THAT(store->calls("setNodes")[0].paths, IsEmpty());
}

TEST_F(RemoveCategoryTest, raisesForAPathThatIsNotInTheProjectAndWritesNothing) {
    bear(a, color, {red});
    auto const unknown = root / u"unknown";
    EXPECT_RAISES(FileNotInProject, (unknown), files.removeCategory({a, unknown}, color));
    EXPECT_THAT(store->writes(), IsEmpty());
}

} // namespace
} // namespace project::management
