#include <stdexcept>

#include "support/ErrorMatchers.hpp"
#include "support/LabelledProject.hpp"

namespace project::management {
namespace {

using test::wasHeldThroughout;
using testing::ElementsAre;
using testing::IsEmpty;

/// The labels of a project's categories.
class LabelsTest : public test::LabelledProject {
protected:
    using State = LabelReadOnlyState;

    static LabelDefinition label(std::u16string const& name, std::u16string const& uuid, State state) {
        return LabelDefinition(name, uuid).setIsReadOnly(state);
    }

    CategoryDefinition const color{u"Color", u"c-color"};
    CategoryDefinition const tags{u"Tags", u"c-tags"};
    CategoryDefinition const readOnlyColor = CategoryDefinition(u"Color", u"c-color").setIsReadOnly(true);
    LabelDefinition const red{u"Red", u"l-red"};
    LabelDefinition const blue{u"Blue", u"l-blue"};
};

using CreateLabelTest = LabelsTest;

TEST_F(CreateLabelTest, storesNameAndStateUnderTheUUIDBelowTheCategory) {
    define(color, {});
    for (auto const* state : {u"READ_ONLY", u"WRITABLE", u"INHERITED"}) {
        auto const created = label(state, state, getLabelStateFromName(state));

        labels.createLabel(color, created);

        metadata::MetadataNodeSpecification expected(u"Info");
        expected.put(u"Name", state);
        expected.put(u"ReadOnly", state);
        EXPECT_TRUE(isEqual(*stored(labelAt(color, created)), expected));
    }
}

TEST_F(CreateLabelTest, returnsTheStoredLabel) {
    define(color, {});
    auto const created = label(u"Red", u"l-red", State::WRITABLE);
    labels.createLabel(color, created);
    EXPECT_THAT(labels.getLabels(color), ElementsAre(created));
    EXPECT_EQ(labels.getLabelByUUID(color, u"l-red"), created);
}

TEST_F(CreateLabelTest, throwsForAnUnknownCategoryWithTheNameOfTheCallersObject) {
    EXPECT_RAISES(CategoryDoesNotExist, (u"Color"), labels.createLabel(color, red));
    EXPECT_TRUE(store->isEmpty());
}

TEST_F(CreateLabelTest, throwsForAStoredLabelWithAnUnknownStateAndStoresNothing) {
    define(color, {});
    store->put(labelAt(color, blue), {{u"Name", u"Blue"}, {u"ReadOnly", u"maybe"}});
    EXPECT_RAISES_NESTED(LabelReadOnlyStateUndefined, (u"maybe"), std::out_of_range,
                         labels.createLabel(color, red));
    EXPECT_FALSE(store->content().pathExists(labelAt(color, red)));
}

TEST_F(CreateLabelTest, throwsForAnInvalidStateAndStoresNothing) {
    define(color, {});
    EXPECT_THROW(labels.createLabel(color, label(u"Red", u"l-red", static_cast<State>(3))),
                 std::out_of_range);
    EXPECT_FALSE(store->content().pathExists(labelAt(color, red)));
}

TEST_F(CreateLabelTest, acceptsALabelInACategoryThatHasAnAddressButNoNode) {
    createAddress(categoryAt(color));
    labels.createLabel(color, red);
    EXPECT_THAT(labels.getLabels(color), ElementsAre(red));
}

TEST_F(CreateLabelTest, acceptsALabelInAReadOnlyCategory) {
    define(readOnlyColor, {});
    labels.createLabel(readOnlyColor, label(u"Red", u"l-red", State::READ_ONLY));
    EXPECT_EQ(labels.getLabels(color).size(), 1U);
}

TEST_F(CreateLabelTest, refusesANameInUseInTheCategoryAndChangesNothing) {
    define(color, {red});
    CategoryDefinition const stale(u"Farbe", u"c-color");

    EXPECT_RAISES(LabelExistsByName, (u"Farbe", u"Red"),
                  labels.createLabel(stale, LabelDefinition(u"Red", u"l-other")));

    EXPECT_THAT(store->writes(), IsEmpty());
    EXPECT_THAT(labels.getLabels(color), ElementsAre(red));
}

TEST_F(CreateLabelTest, acceptsANameInUseInAnotherCategoryOrInAnotherCase) {
    define(color, {red});
    define(tags, {});
    labels.createLabel(tags, LabelDefinition(u"Red", u"l-other"));
    labels.createLabel(color, LabelDefinition(u"red", u"l-third"));
    EXPECT_EQ(labels.getLabels(tags).size(), 1U);
    EXPECT_EQ(labels.getLabels(color).size(), 2U);
}

TEST_F(CreateLabelTest, replacesTheLabelWithTheSameUUID) {
    define(color, {label(u"Red", u"l-red", State::READ_ONLY)});
    labels.createLabel(color, LabelDefinition(u"Other", u"l-red"));
    EXPECT_THAT(labels.getLabels(color), ElementsAre(LabelDefinition(u"Other", u"l-red")));
}

TEST_F(CreateLabelTest, checksTheNamesAndWritesOnceUnderOneGuard) {
    define(color, {blue});

    labels.createLabel(color, red);

    EXPECT_THAT(store->operations(),
                ElementsAre("pathExists", "getChildNodes", "hasNode", "getNode", "setNodes"));
    EXPECT_THAT(store->calls("setNodes")[0].paths, ElementsAre(labelAt(color, red)));
    EXPECT_TRUE(wasHeldThroughout(Guard::Write, store->calls()));
    EXPECT_THAT(store->calls("acquireReadLock"),
                testing::SizeIs(2)); // for the check, and for the list in it
}

TEST_F(CreateLabelTest, readsTheLabelsThroughTheVirtualOperation) {
    class Listing : public LabelManagerBase {
    public:
        using LabelManagerBase::LabelManagerBase;

        std::vector<LabelIdentifier> getLabels(CategoryIdentifier const& /*category*/) override {
            return {LabelDefinition(u"Taken")};
        }
    } manager(store, &files);

    EXPECT_RAISES(LabelExistsByName, (u"Color", u"Taken"),
                  manager.createLabel(color, LabelDefinition(u"Taken")));
}

using ReadLabelsTest = LabelsTest;

TEST_F(ReadLabelsTest, throwForACategoryWithoutAnAddressWithTheNameOfTheCallersObject) {
    EXPECT_RAISES(CategoryDoesNotExist, (u"Color"), labels.getLabels(color));
    EXPECT_RAISES(CategoryDoesNotExist, (u"Color"), labels.getLabelByUUID(color, u"l-red"));
}

TEST_F(ReadLabelsTest, areEmptyForACategoryWithoutLabels) {
    define(color, {});
    EXPECT_THAT(labels.getLabels(color), IsEmpty());
}

TEST_F(ReadLabelsTest, areEmptyForAnAddressWithoutANode) {
    createAddress(categoryAt(color));
    EXPECT_THAT(labels.getLabels(color), IsEmpty());
    EXPECT_RAISES(LabelDoesNotExistsByUUID, (u"l-red"), labels.getLabelByUUID(color, u"l-red"));
}

TEST_F(ReadLabelsTest, areInTheOrderOfTheStoreAndNotByName) {
    LabelDefinition const first(u"B", u"1");
    LabelDefinition const second(u"A", u"2");
    define(color, {second, first});
    EXPECT_THAT(labels.getLabels(color), ElementsAre(first, second));
}

TEST_F(ReadLabelsTest, skipAddressesOfOtherTypesAndWithoutANode) {
    define(color, {red});
    store->put(categoryAt(color).child({u"Other", u"other"}), {{u"Name", u"Other"}});
    createAddress(categoryAt(color).child({u"Label", u"without a node"}));
    EXPECT_THAT(labels.getLabels(color), ElementsAre(red));
}

TEST_F(ReadLabelsTest, areFoundByUUIDAlsoAtAnAddressWithoutANode) {
    define(color, {});
    createAddress(labelAt(color, red));
    EXPECT_EQ(labels.getLabelByUUID(color, u"l-red"), LabelIdentifier(u"l-red", u"", State::INHERITED));
}

TEST_F(ReadLabelsTest, throwForAnUnknownUUIDAndForOneOfAnotherCategory) {
    define(color, {});
    define(tags, {red});
    EXPECT_RAISES(LabelDoesNotExistsByUUID, (u"unknown"), labels.getLabelByUUID(color, u"unknown"));
    EXPECT_RAISES(LabelDoesNotExistsByUUID, (u"l-red"), labels.getLabelByUUID(color, u"l-red"));
}

TEST_F(ReadLabelsTest, inheritTheirStateIfNoneIsStored) {
    define(color, {});
    store->put(labelAt(color, red), {{u"Name", u"Red"}});
    EXPECT_EQ(labels.getLabelByUUID(color, u"l-red").isReadOnly(), State::INHERITED);
    EXPECT_EQ(labels.getLabels(color).at(0).isReadOnly(), State::INHERITED);
}

TEST_F(ReadLabelsTest, throwForAnUnknownState) {
    define(color, {blue});
    store->put(labelAt(color, red), {{u"Name", u"Red"}, {u"ReadOnly", u"1"}});
    EXPECT_RAISES_NESTED(LabelReadOnlyStateUndefined, (u"1"), std::out_of_range,
                         labels.getLabelByUUID(color, u"l-red"));
    EXPECT_RAISES_NESTED(LabelReadOnlyStateUndefined, (u"1"), std::out_of_range, labels.getLabels(color));
    EXPECT_RAISES_NESTED(LabelReadOnlyStateUndefined, (u"1"), std::out_of_range,
                         labels.createLabel(color, LabelDefinition(u"Third")));
    EXPECT_EQ(labels.getLabelByUUID(color, u"l-blue"), blue);
}

TEST_F(ReadLabelsTest, areReadUnderTheReadGuard) {
    define(color, {red, blue});

    labels.getLabels(color);
    EXPECT_TRUE(wasHeldThroughout(Guard::Read, store->calls()));
    EXPECT_THAT(store->operations(),
                ElementsAre("pathExists", "getChildNodes", "hasNode", "getNode", "hasNode", "getNode"));

    store->clear();
    labels.getLabelByUUID(color, u"l-red");
    EXPECT_TRUE(wasHeldThroughout(Guard::Read, store->calls()));
    EXPECT_THAT(store->operations(), ElementsAre("pathExists", "pathExists", "getNode"));
}

using DeleteLabelTest = LabelsTest;

TEST_F(DeleteLabelTest, dependsOnTheStateOfTheGivenLabelAndForAnInheritedOneOnTheGivenCategory) {
    struct Case {
        CategoryDefinition category;
        State state;
        bool allowed;
    };

    for (auto const& each :
         {Case{color, State::WRITABLE, true}, Case{color, State::INHERITED, true},
          Case{color, State::READ_ONLY, false}, Case{readOnlyColor, State::WRITABLE, true},
          Case{readOnlyColor, State::INHERITED, false}, Case{readOnlyColor, State::READ_ONLY, false}}) {
        auto const given = label(u"Red", u"l-red", each.state);
        define(each.category, {given});
        store->clear();
        if (each.allowed) {
            labels.deleteLabel(each.category, given);
            EXPECT_FALSE(store->content().pathExists(labelAt(color, given)));
        } else {
            EXPECT_RAISES(CanNotModifyReadOnlyLabel, (), labels.deleteLabel(each.category, given));
            EXPECT_THAT(store->operations(), IsEmpty());
        }
    }
}

TEST_F(DeleteLabelTest, dependsOnTheGivenObjectsWhateverIsStored) {
    auto const readOnly = label(u"Red", u"l-red", State::READ_ONLY);
    define(color, {red});
    EXPECT_RAISES(CanNotModifyReadOnlyLabel, (), labels.deleteLabel(color, readOnly));
    EXPECT_RAISES(CanNotModifyReadOnlyLabel, (), labels.deleteLabel(readOnlyColor, red));

    define(readOnlyColor, {readOnly});
    labels.deleteLabel(color, red);
    EXPECT_THAT(labels.getLabels(color), IsEmpty());
}

TEST_F(DeleteLabelTest, removesTheLabelFromAllFilesWithItsDataAndKeepsTheOthers) {
    define(color, {red, blue});
    auto const a = file(u"folder/a");
    addLabelNodes(a, color, {red, blue});
    record(a, red, u"dark");
    record(a, blue, u"bright");
    addLabelNodes(root / u"folder", color, {red});

    labels.deleteLabel(color, red);

    EXPECT_THAT(labels.getLabels(color), ElementsAre(blue));
    EXPECT_EQ(labelUUIDs(a), (LabelUUIDs{{u"c-color", {u"l-blue"}}}));
    EXPECT_THAT(labelUUIDs(root / u"folder"), IsEmpty());
    EXPECT_THAT(records(a), ElementsAre(u"bright"));
}

TEST_F(DeleteLabelTest, keepsTheSecondOfTwoEqualLabelsOfAFile) {
    define(tags, {red});
    auto const a = file(u"a");
    addLabelNodes(a, tags, {red, red});

    labels.deleteLabel(tags, red);

    EXPECT_EQ(labelUUIDs(a), (LabelUUIDs{{u"c-tags", {u"l-red"}}}));
}

TEST_F(DeleteLabelTest, cleansAllFilesBeforeItRemovesTheDefinitionUnderOneGuard) {
    define(color, {red});
    auto const a = file(u"folder/a");
    addLabelNodes(a, color, {red});
    record(a, red, u"dark");

    labels.deleteLabel(color, red);

    ASSERT_THAT(store->writes(), ElementsAre("setNodes", "setNodes", "removeNodes"));
    EXPECT_THAT(store->calls("setNodes")[0].paths, ElementsAre(at(root / u"folder"), at(a)));
    EXPECT_THAT(store->calls("removeNodes")[0].paths, ElementsAre(labelAt(color, red)));
    EXPECT_TRUE(wasHeldThroughout(Guard::Write, store->calls()));
}

TEST_F(DeleteLabelTest, ofAnUnknownLabelOrCategoryRemovesNothingWithoutAnError) {
    define(color, {red});
    labels.deleteLabel(color, blue);
    labels.deleteLabel(tags, red);
    EXPECT_THAT(labels.getLabels(color), ElementsAre(red));
}

TEST_F(DeleteLabelTest, keepsTheFilesCleanedIfTheDefinitionCannotBeRemoved) {
    define(color, {red});
    auto const a = file(u"a");
    addLabelNodes(a, color, {red});
    store->failOn("removeNodes", [] { throw std::runtime_error("the disk fails"); });

    EXPECT_THROW(labels.deleteLabel(color, red), std::runtime_error);

    EXPECT_THAT(labelUUIDs(a), IsEmpty());
    EXPECT_THAT(labels.getLabels(color), ElementsAre(red));
}

} // namespace
} // namespace project::management
