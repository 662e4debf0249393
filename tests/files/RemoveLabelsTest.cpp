#include <stdexcept>

#include "files/LabelledFile.hpp"
#include "support/ErrorMatchers.hpp"

namespace project::management {
namespace {

using test::wasHeldThroughout;
using testing::ElementsAre;
using testing::IsEmpty;

using RemoveLabelsTest = test::LabelledFile;

TEST_F(RemoveLabelsTest, removesTheCategoryWithItsLastLabel) {
    addLabelNodes(a, color, {red});
    files.removeLabels({a}, {Label(color, red)});
    EXPECT_THAT(labelUUIDs(a), IsEmpty());
}

TEST_F(RemoveLabelsTest, keepsTheOtherLabelsOfTheCategory) {
    addLabelNodes(a, tags, {urgent, later});
    addLabelNodes(a, color, {red});
    files.removeLabels({a}, {Label(tags, urgent)});
    EXPECT_EQ(labelUUIDs(a), (LabelUUIDs{{u"c-tags", {u"l-later"}}, {u"c-color", {u"l-red"}}}));
}

TEST_F(RemoveLabelsTest, keepsACategoryWithOtherNestedNodes) {
    addLabelNodes(a, color, {red});
    auto const node = stored(at(a));
    append(*node->getChildren()[0], u"Other", {{u"UUID", u"foreign"}});
    replace(at(a), node);

    files.removeLabels({a}, {Label(color, red)});

    EXPECT_EQ(labelUUIDs(a), (LabelUUIDs{{u"c-color", {u"foreign"}}}));
}

TEST_F(RemoveLabelsTest, ignoresANestedNodeOfAnotherTypeThanTheLabel) {
    auto const node = stored(at(a));
    append(append(*node, u"Category", {{u"UUID", u"c-color"}}), u"Other", {{u"UUID", u"l-red"}});
    replace(at(a), node);

    files.removeLabels({a}, {Label(color, red)});

    EXPECT_EQ(labelUUIDs(a), (LabelUUIDs{{u"c-color", {u"l-red"}}}));
}

TEST_F(RemoveLabelsTest, writesTheNodeAndNoDataForALabelThatTheFileDoesNotHave) {
    addLabelNodes(a, tags, {urgent});
    record(a, red, u"dark");
    record(a, later, u"at six");

    files.removeLabels({a}, {Label(color, red), Label(tags, later)});

    ASSERT_THAT(store->writes(), ElementsAre("setNodes"));
    EXPECT_THAT(store->calls("setNodes")[0].paths, ElementsAre(at(a)));
    EXPECT_EQ(labelUUIDs(a), (LabelUUIDs{{u"c-tags", {u"l-urgent"}}}));
    EXPECT_THAT(records(a), ElementsAre(u"dark", u"at six"));
}

TEST_F(RemoveLabelsTest, writesNoDataForALabelWithoutData) {
    addLabelNodes(a, color, {red});
    record(a, blue, u"bright");

    files.removeLabels({a}, {Label(color, red)});

    EXPECT_THAT(store->writes(), ElementsAre("setNodes"));
    EXPECT_THAT(records(a), ElementsAre(u"bright"));
}

TEST_F(RemoveLabelsTest, removesAllRecordsOfTheLabel) {
    addLabelNodes(a, color, {red});
    record(a, red, u"one");
    record(a, red, u"two");
    record(a, blue, u"stays");
    record(a, red, u"three");

    files.removeLabels({a}, {Label(color, red)});

    EXPECT_THAT(records(a), ElementsAre(u"stays"));
}

TEST_F(RemoveLabelsTest, writesTheDataOfAllFilesIfOneLostSome) {
    auto const b = file(u"b");
    addLabelNodes(a, color, {red});
    addLabelNodes(b, color, {red});
    record(b, red, u"dark");
    store->clear();

    files.removeLabels({a, b}, {Label(color, red)});

    ASSERT_THAT(store->writes(), ElementsAre("setNodes", "setNodes"));
    EXPECT_THAT(store->calls("setNodes")[0].paths, ElementsAre(at(a), at(b)));
    EXPECT_THAT(store->calls("setNodes")[1].paths, ElementsAre(dataAt(a), dataAt(b)));
    EXPECT_TRUE(isEqual(*stored(dataAt(a)), metadata::MetadataNodeSpecification(u"Info")));
    EXPECT_TRUE(wasHeldThroughout(Guard::Write, store->calls()));
}

TEST_F(RemoveLabelsTest, removesOneOfTwoEqualLabels) {
    addLabelNodes(a, tags, {urgent, later, urgent});
    files.removeLabels({a}, {Label(tags, urgent)});
    EXPECT_EQ(labelUUIDs(a), (LabelUUIDs{{u"c-tags", {u"l-later", u"l-urgent"}}}));
}

TEST_F(RemoveLabelsTest, removesBothOfTwoEqualLabelsIfListedTwice) {
    addLabelNodes(a, tags, {urgent, urgent});
    files.removeLabels({a}, {Label(tags, urgent), Label(tags, urgent)});
    EXPECT_THAT(labelUUIDs(a), IsEmpty());
}

TEST_F(RemoveLabelsTest, throwsForAPathThatIsNotInTheProjectAndWritesNothing) {
    addLabelNodes(a, color, {red});
    auto const unknown = root / u"unknown";
    EXPECT_RAISES(FileNotInProject, (unknown), files.removeLabels({a, unknown}, {Label(color, red)}));
    EXPECT_THAT(store->writes(), IsEmpty());
}

TEST_F(RemoveLabelsTest, treatsTheStoresOwnFilesLikeAnyOther) {
    auto const metadataFile = file(u".projectdata/project.jsonl");
    addLabelNodes(metadataFile, color, {red});
    files.removeLabels({metadataFile}, {Label(color, red)});
    EXPECT_THAT(labelUUIDs(metadataFile), IsEmpty());
}

TEST_F(RemoveLabelsTest, writesAnEmptyBatchWithoutFiles) {
    files.removeLabels({}, {Label(color, red)});
    ASSERT_THAT(store->writes(), ElementsAre("setNodes"));
    EXPECT_THAT(store->calls("setNodes")[0].paths, IsEmpty());
}

TEST_F(RemoveLabelsTest, keepsTheWrittenFileNodesIfTheDataCannotBeWritten) {
    addLabelNodes(a, color, {red});
    record(a, red, u"dark");
    int writes = 0;
    store->failOn("setNodes", [&] {
        if (++writes == 2) {
            throw std::runtime_error("the disk fails");
        }
    });

    EXPECT_THROW(files.removeLabels({a}, {Label(color, red)}), std::runtime_error);

    EXPECT_THAT(labelUUIDs(a), IsEmpty());
    EXPECT_THAT(records(a), ElementsAre(u"dark"));
}

using RemoveCategoryTest = test::LabelledFile;

TEST_F(RemoveCategoryTest, removesAllLabelsOfTheCategoryAndKeepsTheOthers) {
    addLabelNodes(a, tags, {urgent, later});
    addLabelNodes(a, color, {red});
    files.removeCategory({a}, tags);
    EXPECT_EQ(labelUUIDs(a), (LabelUUIDs{{u"c-color", {u"l-red"}}}));
}

TEST_F(RemoveCategoryTest, keepsTheDataRecordsOfItsLabels) {
    addLabelNodes(a, color, {red});
    record(a, red, u"dark");

    files.removeCategory({a}, color);

    EXPECT_THAT(labelUUIDs(a), IsEmpty());
    EXPECT_THAT(records(a), ElementsAre(u"dark"));
    EXPECT_THAT(store->writes(), ElementsAre("setNodes"));
}

TEST_F(RemoveCategoryTest, writesFilesWithoutTheCategoryUnchanged) {
    addLabelNodes(a, color, {red});
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

TEST_F(RemoveCategoryTest, throwsForAPathThatIsNotInTheProjectAndWritesNothing) {
    addLabelNodes(a, color, {red});
    auto const unknown = root / u"unknown";
    EXPECT_RAISES(FileNotInProject, (unknown), files.removeCategory({a, unknown}, color));
    EXPECT_THAT(store->writes(), IsEmpty());
}

} // namespace
} // namespace project::management
