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

TEST_F(GetLabelIDSetsTest, givesThePairsInTheOrderOfTheNode) {
    bear(a, tags, {urgent, later, urgent});
    bear(a, color, {red});
    EXPECT_EQ(files.getLabelIDSets(a), (std::vector{LabelIDSet(tags, urgent), LabelIDSet(tags, later),
                                                    LabelIDSet(tags, urgent), LabelIDSet(color, red)}));
}

TEST_F(GetLabelIDSetsTest, passesOverChildrenOfOtherTypesAndThoseWithoutUUID) {
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
    EXPECT_THAT(store->calls("acquireReadLock"), testing::SizeIs(2)); // its own, and the file store's
}

TEST_F(GetLabelIDSetsTest, raisesForAPathThatIsNotInTheProject) {
    EXPECT_RAISES(FileNotInProject, (root / u"unknown"), files.getLabelIDSets(root / u"unknown"));
}

using GetLabelsTest = test::LabelledFile;

TEST_F(GetLabelsTest, givesNothingForAFileWithoutLabels) {
    EXPECT_THAT(files.getLabels(a), IsEmpty());
}

TEST_F(GetLabelsTest, givesEachLabelAsItIsDefinedNow) {
    bear(a, color, {red});
    labels.renameCategory(color, u"Farbe");

    auto const found = files.getLabels(a);

    ASSERT_EQ(found.size(), 1U);
    EXPECT_EQ(found[0].getFile(), a);
    EXPECT_EQ(found[0].getCategory().getName(), u"Farbe");
    EXPECT_TRUE(found[0].getCategory().isSingleValued());
    EXPECT_EQ(found[0].getLabelIdentifier(), red);
    EXPECT_EQ(found[0].getData(), u"");
}

TEST_F(GetLabelsTest, givesALabelWithDataTwiceFirstWithTheDataAndThenWithout) {
    bear(a, tags, {urgent, later});
    record(a, urgent, u"now");
    EXPECT_THAT(shown(files.getLabels(a)),
                ElementsAre(ShownLabel(u"c-tags", u"l-urgent", u"now"),
                            ShownLabel(u"c-tags", u"l-urgent", u""), ShownLabel(u"c-tags", u"l-later", u"")));
}

TEST_F(GetLabelsTest, givesTheDataOfTheFirstRecord) {
    bear(a, tags, {urgent});
    record(a, later, u"other");
    record(a, urgent, u"first");
    record(a, urgent, u"second");
    EXPECT_THAT(shown(files.getLabels(a)), ElementsAre(ShownLabel(u"c-tags", u"l-urgent", u"first"),
                                                       ShownLabel(u"c-tags", u"l-urgent", u"")));
}

TEST_F(GetLabelsTest, givesBothEntriesForEachTimeThatALabelStandsOnTheFile) {
    bear(a, tags, {urgent, urgent});
    record(a, urgent, u"now");
    ShownLabel const with(u"c-tags", u"l-urgent", u"now");
    ShownLabel const without(u"c-tags", u"l-urgent", u"");
    EXPECT_THAT(shown(files.getLabels(a)), ElementsAre(with, without, with, without));
}

TEST_F(GetLabelsTest, takesDataFromTheRecordsAndNotFromTheLabelsOwnValue) {
    bear(a, color, {red});
    giveValue(a, u"dark");
    EXPECT_THAT(shown(files.getLabels(a)), ElementsAre(ShownLabel(u"c-color", u"l-red", u"")));
}

TEST_F(GetLabelsTest, acceptsADataAddressWithoutANode) {
    bear(a, color, {red});
    make(dataAt(a));
    EXPECT_THAT(shown(files.getLabels(a)), ElementsAre(ShownLabel(u"c-color", u"l-red", u"")));
}

TEST_F(GetLabelsTest, raisesWhenTheCategoryIsGoneWhereThePairsAreStillGiven) {
    bear(a, tags, {urgent});
    bear(a, color, {red});
    erase(categoryAt(color));

    EXPECT_RAISES(CategoryDoesNotExistsByUUID, (u"c-color"), files.getLabels(a));
    EXPECT_EQ(files.getLabelIDSets(a), (std::vector{LabelIDSet(tags, urgent), LabelIDSet(color, red)}));
}

TEST_F(GetLabelsTest, raisesWhenTheLabelIsGoneWhereThePairIsStillGiven) {
    bear(a, color, {red});
    erase(labelAt(color, red));

    EXPECT_RAISES(LabelDoesNotExistsByUUID, (u"l-red"), files.getLabels(a));
    EXPECT_EQ(files.getLabelIDSets(a), (std::vector{LabelIDSet(color, red)}));
}

TEST_F(GetLabelsTest, raisesForAPathThatIsNotInTheProject) {
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
    bear(a, color, {red});

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
