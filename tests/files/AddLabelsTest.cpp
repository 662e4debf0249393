#include <stdexcept>

#include "files/LabelledFile.hpp"
#include "support/ErrorMatchers.hpp"

namespace project::management {
namespace {

using test::shown;
using test::ShownLabel;
using test::wasHeldThroughout;
using testing::ElementsAre;
using testing::IsEmpty;

using AddLabelsTest = test::LabelledFile;

TEST_F(AddLabelsTest, addsALabelToItsCategoryByUUIDAlone) {
    files.addLabels({a}, {Label(color, red)});

    metadata::MetadataNodeSpecification expected(u"Info");
    append(append(expected, u"Category", {{u"UUID", u"c-color"}}), u"Label", {{u"UUID", u"l-red"}});
    EXPECT_TRUE(isEqual(*stored(at(a)), expected));
}

TEST_F(AddLabelsTest, addsFurtherLabelsToTheStoredCategory) {
    files.addLabels({a}, {Label(tags, urgent)});
    files.addLabels({a}, {Label(tags, later)});
    EXPECT_EQ(labelUUIDs(a), (LabelUUIDs{{u"c-tags", {u"l-urgent", u"l-later"}}}));
}

TEST_F(AddLabelsTest, ignoresANestedNodeOfAnotherTypeThanTheCategory) {
    auto const node = stored(at(a));
    append(*node, u"Other", {{u"UUID", u"c-tags"}});
    replace(at(a), node);

    files.addLabels({a}, {Label(tags, urgent)});

    EXPECT_EQ(labelUUIDs(a), (LabelUUIDs{{u"c-tags", {}}, {u"c-tags", {u"l-urgent"}}}));
}

TEST_F(AddLabelsTest, returnsNothingIfNothingIsReplaced) {
    EXPECT_THAT(files.addLabels({a}, {Label(tags, urgent), Label(color, red)}), IsEmpty());
}

TEST_F(AddLabelsTest, skipsAFileThatIsNotInTheProjectWithoutWriting) {
    EXPECT_THAT(files.addLabels({root / u"unknown"}, {Label(color, red)}), IsEmpty());
    EXPECT_THAT(store->writes(), IsEmpty());
}

TEST_F(AddLabelsTest, writesOnlyTheFilesThatAreInTheProject) {
    files.addLabels({root / u"unknown", a}, {Label(color, red)});
    ASSERT_THAT(store->writes(), ElementsAre("setNodes"));
    EXPECT_THAT(store->calls("setNodes")[0].paths, ElementsAre(at(a)));
}

TEST_F(AddLabelsTest, skipsTheStoresOwnFilesEvenIfTheyAreInTheProject) {
    auto const metadataFile = file(u".projectdata/project.jsonl");
    EXPECT_THAT(files.addLabels({metadataFile}, {Label(color, red)}), IsEmpty());
    EXPECT_THAT(store->writes(), IsEmpty());
}

TEST_F(AddLabelsTest, replacesTheOtherLabelOfASingleValuedCategory) {
    addLabelNodes(a, color, {red});

    auto const displaced = files.addLabels({a}, {Label(color, blue)});

    ASSERT_EQ(displaced.size(), 1U);
    EXPECT_EQ(displaced[0].getFile(), a);
    EXPECT_EQ(displaced[0].getCategory().getUUID(), u"c-color");
    EXPECT_EQ(displaced[0].getLabelIdentifier(), red);
    EXPECT_EQ(labelUUIDs(a), (LabelUUIDs{{u"c-color", {u"l-blue"}}}));
}

TEST_F(AddLabelsTest, returnsAReplacedLabelWithItsValue) {
    addLabelNodes(a, color, {red});
    setLabelValue(a, u"dark");
    EXPECT_THAT(shown(files.addLabels({a}, {Label(color, blue)})),
                ElementsAre(ShownLabel(u"c-color", u"l-red", u"dark")));
}

TEST_F(AddLabelsTest, replacesTheSameLabelOfASingleValuedCategory) {
    addLabelNodes(a, color, {red});
    setLabelValue(a, u"dark");

    auto const displaced = files.addLabels({a}, {Label(color, red)});

    EXPECT_THAT(shown(displaced), ElementsAre(ShownLabel(u"c-color", u"l-red", u"dark")));
    EXPECT_EQ(labelUUIDs(a), (LabelUUIDs{{u"c-color", {u"l-red"}}}));
}

TEST_F(AddLabelsTest, theSecondOfTwoLabelsOfASingleValuedCategoryReplacesTheFirst) {
    auto const displaced = files.addLabels({a}, {Label(color, red), Label(color, blue)});
    EXPECT_THAT(shown(displaced), ElementsAre(ShownLabel(u"c-color", u"l-red", u"")));
    EXPECT_EQ(labelUUIDs(a), (LabelUUIDs{{u"c-color", {u"l-blue"}}}));
}

TEST_F(AddLabelsTest, keepsTheLabelsOfOtherCategories) {
    addLabelNodes(a, tags, {urgent});
    files.addLabels({a}, {Label(color, red)});
    EXPECT_EQ(labelUUIDs(a), (LabelUUIDs{{u"c-tags", {u"l-urgent"}}, {u"c-color", {u"l-red"}}}));
}

TEST_F(AddLabelsTest, asksTheGivenLabelWhetherItsCategoryIsSingleValued) {
    addLabelNodes(a, color, {red});
    CategoryDefinition const multiValued(u"Color", u"c-color"); // stored as single-valued

    EXPECT_THAT(files.addLabels({a}, {Label(multiValued, blue)}), IsEmpty());

    EXPECT_EQ(labelUUIDs(a), (LabelUUIDs{{u"c-color", {u"l-red", u"l-blue"}}}));
}

TEST_F(AddLabelsTest, addsALabelOfAMultiValuedCategoryASecondTime) {
    files.addLabels({a}, {Label(tags, urgent)});

    EXPECT_THAT(files.addLabels({a}, {Label(tags, urgent)}), IsEmpty());

    LabelIDSet const pair(tags, urgent);
    EXPECT_EQ(files.getLabelIDSets(a), (std::vector{pair, pair}));
}

TEST_F(AddLabelsTest, skipsAnExistingLabelOnlyIfItAndItsCategoryHaveTheSameUUID) {
    CategoryDefinition const category(u"Same", u"same");
    LabelDefinition const label(u"Same", u"same");
    define(category, {label});
    files.addLabels({a}, {Label(category, label)});

    files.addLabels({a}, {Label(category, label)});

    EXPECT_EQ(files.getLabelIDSets(a), (std::vector{LabelIDSet(u"same", u"same")}));
}

TEST_F(AddLabelsTest, comparesStoredPairsWithTheLabelsUUIDFirst) {
    class Bearing : public FileManagerBase {
    public:
        using FileManagerBase::FileManagerBase;

        std::vector<LabelIDSet> getLabelIDSets(Path const& /*path*/) override {
            return {LabelIDSet(u"l-urgent", u"c-tags"), LabelIDSet(u"c-tags", u"l-later")};
        }
    } manager(root, store);

    manager.setLabelManager(&labels);

    manager.addLabels({a}, {Label(tags, urgent), Label(tags, later)});

    EXPECT_EQ(labelUUIDs(a), (LabelUUIDs{{u"c-tags", {u"l-later"}}}));
}

TEST_F(AddLabelsTest, replacesEveryNestedNodeOfTheCategoryOfAnyType) {
    addLabelNodes(a, color, {red, blue});
    auto const node = stored(at(a));
    append(*node->getChildren()[0], u"Other", {{u"UUID", u"l-red"}, {u"Value", u"of another type"}});
    append(*node->getChildren()[0], u"Other", {});
    replace(at(a), node);

    auto const displaced = files.addLabels({a}, {Label(color, blue)});

    EXPECT_THAT(shown(displaced),
                ElementsAre(ShownLabel(u"c-color", u"l-red", u""), ShownLabel(u"c-color", u"l-blue", u""),
                            ShownLabel(u"c-color", u"l-red", u"of another type")));
    EXPECT_EQ(labelUUIDs(a), (LabelUUIDs{{u"c-color", {u"l-blue"}}}));
}

TEST_F(AddLabelsTest, removesADeletedLabelWithoutReturningIt) {
    addLabelNodes(a, color, {LabelDefinition(u"Gone", u"l-gone"), red});

    auto const displaced = files.addLabels({a}, {Label(color, blue)});

    EXPECT_THAT(shown(displaced), ElementsAre(ShownLabel(u"c-color", u"l-red", u"")));
    EXPECT_EQ(labelUUIDs(a), (LabelUUIDs{{u"c-color", {u"l-blue"}}}));
}

TEST_F(AddLabelsTest, removesTheLabelsOfADeletedCategoryWithoutReturningThem) {
    addLabelNodes(a, color, {red});
    erase(categoryAt(color));

    EXPECT_THAT(files.addLabels({a}, {Label(color, blue)}), IsEmpty());

    EXPECT_EQ(labelUUIDs(a), (LabelUUIDs{{u"c-color", {u"l-blue"}}}));
}

TEST_F(AddLabelsTest, removesALabelWithAnUnknownStateWithoutReturningIt) {
    addLabelNodes(a, color, {red});
    store->put(labelAt(color, red), {{u"Name", u"Red"}, {u"ReadOnly", u"perhaps"}});

    EXPECT_THAT(files.addLabels({a}, {Label(color, blue)}), IsEmpty());

    EXPECT_EQ(labelUUIDs(a), (LabelUUIDs{{u"c-color", {u"l-blue"}}}));
}

TEST_F(AddLabelsTest, doesNotMistakeAFailureOfTheStoreForADeletedLabel) {
    addLabelNodes(a, color, {red});
    store->failOn("pathExists", [] { throw std::runtime_error("the disk fails"); });
    EXPECT_THROW(files.addLabels({a}, {Label(color, blue)}), std::runtime_error);
    EXPECT_EQ(labelUUIDs(a), (LabelUUIDs{{u"c-color", {u"l-red"}}}));
}

TEST_F(AddLabelsTest, throwsForTheRootThatHasNoNodeAndWritesNothing) {
    EXPECT_RAISES(FileNotInProject, (root), files.addLabels({a, root}, {Label(color, red)}));
    EXPECT_THAT(store->writes(), IsEmpty());
    EXPECT_THAT(labelUUIDs(a), IsEmpty());
}

TEST_F(AddLabelsTest, labelsTheRootIfItHasANode) {
    store->put(at(root), {});
    files.addLabels({root}, {Label(color, red)});
    EXPECT_EQ(labelUUIDs(root), (LabelUUIDs{{u"c-color", {u"l-red"}}}));
}

TEST_F(AddLabelsTest, writesAllFilesInOneBatchUnderOneGuard) {
    auto const b = file(u"b");

    files.addLabels({b, a}, {Label(color, red), Label(tags, urgent)});

    ASSERT_THAT(store->writes(), ElementsAre("setNodes"));
    EXPECT_THAT(store->calls("setNodes")[0].paths, ElementsAre(at(a), at(b)));
    EXPECT_TRUE(wasHeldThroughout(Guard::Write, store->calls()));
}

TEST_F(AddLabelsTest, startsFromTheStoredNodeForAFileThatIsListedTwice) {
    addLabelNodes(a, color, {red});

    auto const displaced = files.addLabels({a, a}, {Label(color, blue), Label(tags, urgent)});

    EXPECT_THAT(shown(displaced),
                ElementsAre(ShownLabel(u"c-color", u"l-red", u""), ShownLabel(u"c-color", u"l-red", u"")));
    EXPECT_EQ(labelUUIDs(a), (LabelUUIDs{{u"c-color", {u"l-blue"}}, {u"c-tags", {u"l-urgent"}}}));
}

TEST_F(AddLabelsTest, doesNotCheckThatLabelAndCategoryExist) {
    CategoryDefinition const unknown(u"Unknown", u"c-unknown");
    store->clear();

    files.addLabels({a}, {Label(unknown, LabelDefinition(u"Unknown", u"l-unknown"))});

    EXPECT_EQ(labelUUIDs(a), (LabelUUIDs{{u"c-unknown", {u"l-unknown"}}}));
    for (auto const& call : store->calls()) {
        for (auto const& path : call.paths) {
            EXPECT_TRUE(path.isWithin(at(root))) << call.operation;
        }
    }
}

TEST_F(AddLabelsTest, addsAndRemovesReadOnlyLabels) {
    auto const category = CategoryDefinition(u"Fixed", u"c-fixed").setIsReadOnly(true);
    auto const label = LabelDefinition(u"Fixed", u"l-fixed").setIsReadOnly(LabelReadOnlyState::READ_ONLY);

    files.addLabels({a}, {Label(category, label)});
    EXPECT_EQ(labelUUIDs(a), (LabelUUIDs{{u"c-fixed", {u"l-fixed"}}}));

    files.removeLabels({a}, {Label(category, label)});
    EXPECT_THAT(labelUUIDs(a), IsEmpty());
}

TEST_F(AddLabelsTest, writesTheNodeAlsoWithoutLabels) {
    files.addLabels({a}, {});
    EXPECT_THAT(store->writes(), ElementsAre("setNodes"));
}

TEST_F(AddLabelsTest, writesNothingWithoutFiles) {
    files.addLabels({}, {Label(color, red)});
    EXPECT_THAT(store->writes(), IsEmpty());
}

TEST_F(AddLabelsTest, readsTheNodeAndThenTheLabelsForEachLabel) {
    files.addLabels({a}, {Label(color, red)});
    EXPECT_THAT(store->operations(), ElementsAre("hasNode", "getMetadataRoot", "hasNode", "getNode",
                                                 "hasNode", "getNode", "setNodes"));
}

using AddAgainTest = test::LabelledFile;

TEST_F(AddAgainTest, addingAFileAgainDropsItsLabels) {
    addLabelNodes(a, color, {red});

    files.add({a});

    EXPECT_TRUE(files.isFileInProject(a));
    EXPECT_THAT(files.getLabelIDSets(a), IsEmpty());
}

TEST_F(AddAgainTest, addingSomethingBelowAFolderDropsTheLabelsOfTheFoldersAboveIt) {
    auto const inner = file(u"folder/inner/file");
    auto const sibling = file(u"folder/sibling");
    for (auto const& path : {root / u"folder", root / u"folder/inner", inner, sibling}) {
        addLabelNodes(path, color, {red});
    }

    files.add({inner});

    EXPECT_THAT(labelUUIDs(root / u"folder"), IsEmpty());
    EXPECT_THAT(labelUUIDs(root / u"folder/inner"), IsEmpty());
    EXPECT_THAT(labelUUIDs(inner), IsEmpty());
    EXPECT_EQ(labelUUIDs(sibling), (LabelUUIDs{{u"c-color", {u"l-red"}}}));
}

} // namespace
} // namespace project::management
