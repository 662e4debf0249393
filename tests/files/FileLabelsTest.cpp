#include "files/LabelledFile.hpp"
#include "support/ErrorMatchers.hpp"

namespace project::management {
namespace {

using test::shown;
using test::ShownLabel;
using test::wasHeldThroughout;
using testing::ElementsAre;
using testing::IsEmpty;

using GetLabelIDSetsTest = test::LabelledFile;

TEST_F(GetLabelIDSetsTest, returnsThePairsInTheOrderOfTheNode) {
    addLabelNodes(a, tags, {urgent, later, urgent});
    addLabelNodes(a, color, {red});
    EXPECT_EQ(files.getLabelIDSets(a), (std::vector{LabelIDSet(tags, urgent), LabelIDSet(tags, later),
                                                    LabelIDSet(tags, urgent), LabelIDSet(color, red)}));
}

TEST_F(GetLabelIDSetsTest, groupsPairsByCategoryAndNotByTheOrderInWhichLabelsWereAdded) {
    files.addLabels({a}, {Label(tags, urgent)});
    files.addLabels({a}, {Label(color, red)});
    files.addLabels({a}, {Label(tags, later)});
    EXPECT_EQ(files.getLabelIDSets(a),
              (std::vector{LabelIDSet(tags, urgent), LabelIDSet(tags, later), LabelIDSet(color, red)}));
}

TEST_F(GetLabelIDSetsTest, skipsNestedNodesOfOtherTypesAndWithoutUUID) {
    auto const node = stored(at(a));
    append(append(*node, u"Other", {{u"UUID", u"c-color"}}), u"Label", {{u"UUID", u"l-red"}});
    append(append(*node, u"Category", {}), u"Label", {{u"UUID", u"l-red"}});
    auto& category = append(*node, u"Category", {{u"UUID", u"c-color"}});
    append(category, u"Other", {{u"UUID", u"l-red"}});
    append(category, u"Label", {});
    append(category, u"Label", {{u"UUID", u"l-blue"}});
    replace(at(a), node);

    EXPECT_EQ(files.getLabelIDSets(a), (std::vector{LabelIDSet(color, blue)}));
}

TEST_F(GetLabelIDSetsTest, readsTheNodeOnceUnderTheReadGuard) {
    files.getLabelIDSets(a);
    EXPECT_THAT(store->operations(), ElementsAre("hasNode", "getNode"));
    EXPECT_TRUE(wasHeldThroughout(Guard::Read, store->calls()));
    EXPECT_THAT(store->calls("acquireReadLock"),
                testing::SizeIs(2)); // its own guard, and that of the file store
}

TEST_F(GetLabelIDSetsTest, throwsForAPathThatIsNotInTheProject) {
    EXPECT_RAISES(FileNotInProject, (root / u"unknown"), files.getLabelIDSets(root / u"unknown"));
}

using GetLabelsTest = test::LabelledFile;

TEST_F(GetLabelsTest, returnsNothingForAFileWithoutLabels) {
    EXPECT_THAT(files.getLabels(a), IsEmpty());
}

TEST_F(GetLabelsTest, returnsEachLabelWithItsCurrentDefinition) {
    addLabelNodes(a, color, {red});
    labels.renameCategory(color, u"Farbe");

    auto const found = files.getLabels(a);

    ASSERT_EQ(found.size(), 1U);
    EXPECT_EQ(found[0].getFile(), a);
    EXPECT_EQ(found[0].getCategory().getName(), u"Farbe");
    EXPECT_TRUE(found[0].getCategory().isSingleValued());
    EXPECT_EQ(found[0].getLabelIdentifier(), red);
    EXPECT_EQ(found[0].getData(), u"");
}

TEST_F(GetLabelsTest, returnsALabelWithDataTwiceFirstWithTheDataAndThenWithout) {
    addLabelNodes(a, tags, {urgent, later});
    record(a, urgent, u"now");
    EXPECT_THAT(shown(files.getLabels(a)),
                ElementsAre(ShownLabel(u"c-tags", u"l-urgent", u"now"),
                            ShownLabel(u"c-tags", u"l-urgent", u""), ShownLabel(u"c-tags", u"l-later", u"")));
}

TEST_F(GetLabelsTest, returnsTheDataOfTheFirstRecord) {
    addLabelNodes(a, tags, {urgent});
    record(a, later, u"other");
    record(a, urgent, u"first");
    record(a, urgent, u"second");
    EXPECT_THAT(shown(files.getLabels(a)), ElementsAre(ShownLabel(u"c-tags", u"l-urgent", u"first"),
                                                       ShownLabel(u"c-tags", u"l-urgent", u"")));
}

TEST_F(GetLabelsTest, returnsBothEntriesForEachOccurrenceOfALabel) {
    addLabelNodes(a, tags, {urgent, urgent});
    record(a, urgent, u"now");
    ShownLabel const with(u"c-tags", u"l-urgent", u"now");
    ShownLabel const without(u"c-tags", u"l-urgent", u"");
    EXPECT_THAT(shown(files.getLabels(a)), ElementsAre(with, without, with, without));
}

TEST_F(GetLabelsTest, readsDataFromTheRecordsAndNotFromTheLabelsOwnValue) {
    addLabelNodes(a, color, {red});
    setLabelValue(a, u"dark");
    EXPECT_THAT(shown(files.getLabels(a)), ElementsAre(ShownLabel(u"c-color", u"l-red", u"")));
}

TEST_F(GetLabelsTest, acceptsADataAddressWithoutANode) {
    addLabelNodes(a, color, {red});
    createAddress(dataAt(a));
    EXPECT_THAT(shown(files.getLabels(a)), ElementsAre(ShownLabel(u"c-color", u"l-red", u"")));
}

TEST_F(GetLabelsTest, throwsForADeletedCategoryWhosePairsAreStillReturned) {
    addLabelNodes(a, tags, {urgent});
    addLabelNodes(a, color, {red});
    erase(categoryAt(color));

    EXPECT_RAISES(CategoryDoesNotExistsByUUID, (u"c-color"), files.getLabels(a));
    EXPECT_EQ(files.getLabelIDSets(a), (std::vector{LabelIDSet(tags, urgent), LabelIDSet(color, red)}));
}

TEST_F(GetLabelsTest, throwsForADeletedLabelWhosePairIsStillReturned) {
    addLabelNodes(a, color, {red});
    erase(labelAt(color, red));

    EXPECT_RAISES(LabelDoesNotExistsByUUID, (u"l-red"), files.getLabels(a));
    EXPECT_EQ(files.getLabelIDSets(a), (std::vector{LabelIDSet(color, red)}));
}

TEST_F(GetLabelsTest, throwsForALabelWithAnUnknownState) {
    addLabelNodes(a, color, {red});
    store->put(labelAt(color, red), {{u"Name", u"Red"}, {u"ReadOnly", u"maybe"}});
    EXPECT_RAISES_NESTED(LabelReadOnlyStateUndefined, (u"maybe"), std::out_of_range, files.getLabels(a));
}

TEST_F(GetLabelsTest, throwsForAPathThatIsNotInTheProject) {
    EXPECT_RAISES(FileNotInProject, (root / u"unknown"), files.getLabels(root / u"unknown"));
}

TEST_F(GetLabelsTest, readsThePairsThroughTheVirtualOperation) {
    class Bearing : public FileManagerBase {
    public:
        using FileManagerBase::FileManagerBase;

        std::vector<LabelIDSet> getLabelIDSets(Path const& /*path*/) override {
            return {LabelIDSet(u"c-color", u"l-blue")};
        }
    } manager(root, store);

    manager.setLabelManager(&labels);

    EXPECT_THAT(shown(manager.getLabels(a)), ElementsAre(ShownLabel(u"c-color", u"l-blue", u"")));
}

TEST_F(GetLabelsTest, readsTheDataThenThePairsThenEachDefinitionUnderOneReadGuard) {
    addLabelNodes(a, color, {red});

    files.getLabels(a);

    EXPECT_THAT(store->operations(),
                ElementsAre("pathExists",                         // of the data
                            "hasNode", "getNode",                 // the pairs
                            "hasNode", "getNode",                 // the category
                            "pathExists", "pathExists", "getNode" // the label
                            ));
    EXPECT_TRUE(wasHeldThroughout(Guard::Read, store->calls()));
}

} // namespace
} // namespace project::management
