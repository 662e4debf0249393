#include <stdexcept>

#include "support/ErrorMatchers.hpp"
#include "support/LabelledProject.hpp"

namespace project::management {
namespace {

using test::wasHeldThroughout;
using testing::ElementsAre;
using testing::IsEmpty;

/// The categories of a project.
class CategoriesTest : public test::LabelledProject {
protected:
    std::vector<std::u16string> categoryNames() {
        std::vector<std::u16string> result;
        for (auto const& category : labels.getAllCategories()) {
            result.push_back(category.getName());
        }
        return result;
    }

    CategoryDefinition const color{u"Color", u"c-color"};
    CategoryDefinition const tags{u"Tags", u"c-tags"};
    CategoryDefinition const readOnlyColor = CategoryDefinition(u"Color", u"c-color").setIsReadOnly(true);
    LabelDefinition const red{u"Red", u"l-red"};
};

using CreateCategoryTest = CategoriesTest;

TEST_F(CreateCategoryTest, constructionDoesNotAccessTheStore) {
    LabelManagerBase const another(store, &files);
    EXPECT_THAT(store->calls(), IsEmpty());
}

TEST_F(CreateCategoryTest, storesTheFourAttributesUnderTheUUID) {
    auto const category =
        CategoryDefinition(u"Color", u"c-color").setIsSingleValued(true).setDataType(u"String");

    labels.createCategory(category);

    metadata::MetadataNodeSpecification expected(u"Info");
    expected.put(u"ReadOnly", u"0");
    expected.put(u"SingleValued", u"1");
    expected.put(u"Name", u"Color");
    expected.put(u"DataType", u"String");
    EXPECT_TRUE(isEqual(*stored(categoryAt(category)), expected));
    EXPECT_FALSE(store->content().hasNode(categoryAt(category).parent()));
}

TEST_F(CreateCategoryTest, storesTheDataTypeNoneForACategoryWithDefaults) {
    labels.createCategory(color);
    EXPECT_EQ(stored(categoryAt(color))->get(u"DataType"), u"None");
    EXPECT_EQ(stored(categoryAt(color))->get(u"ReadOnly"), u"0");
    EXPECT_EQ(stored(categoryAt(color))->get(u"SingleValued"), u"0");
}

TEST_F(CreateCategoryTest, returnsTheCategoryByItsUUID) {
    labels.createCategory(CategoryIdentifier(u"uuid", u"Color", true, true, u"no validator's type"));

    auto const found = labels.getCategoryByUUID(u"uuid");

    EXPECT_EQ(found.getUUID(), u"uuid");
    EXPECT_EQ(found.getName(), u"Color");
    EXPECT_TRUE(found.isReadOnly());
    EXPECT_TRUE(found.isSingleValued());
    EXPECT_EQ(found.getDataType(), u"no validator's type");
}

TEST_F(CreateCategoryTest, keepsTheTwoFlagsApart) {
    labels.createCategory(CategoryIdentifier(u"r", u"r", true, false, u""));
    labels.createCategory(CategoryIdentifier(u"s", u"s", false, true, u""));
    EXPECT_TRUE(labels.getCategoryByUUID(u"r").isReadOnly());
    EXPECT_FALSE(labels.getCategoryByUUID(u"r").isSingleValued());
    EXPECT_FALSE(labels.getCategoryByUUID(u"s").isReadOnly());
    EXPECT_TRUE(labels.getCategoryByUUID(u"s").isSingleValued());
}

TEST_F(CreateCategoryTest, acceptsANameThatDiffersInCaseOnly) {
    labels.createCategory(color);
    labels.createCategory(CategoryDefinition(u"color", u"c-other"));
    EXPECT_THAT(categoryNames(), ElementsAre(u"Color", u"color"));
}

TEST_F(CreateCategoryTest, refusesANameInUseAndChangesNothing) {
    labels.createCategory(color);
    store->clear();

    EXPECT_RAISES(CategoryExistsByName, (u"Color"),
                  labels.createCategory(CategoryDefinition(u"Color", u"c-other")));

    EXPECT_THAT(store->writes(), IsEmpty());
    EXPECT_THAT(categoryNames(), ElementsAre(u"Color"));
}

TEST_F(CreateCategoryTest, refusesTheSameCategoryASecondTime) {
    labels.createCategory(color);
    EXPECT_RAISES(CategoryExistsByName, (u"Color"), labels.createCategory(color));
}

TEST_F(CreateCategoryTest, replacesTheCategoryWithTheSameUUIDAndKeepsItsLabels) {
    define(readOnlyColor, {red});

    labels.createCategory(CategoryDefinition(u"Other", u"c-color"));

    EXPECT_EQ(labels.getCategoryByUUID(u"c-color").getName(), u"Other");
    EXPECT_FALSE(labels.getCategoryByUUID(u"c-color").isReadOnly());
    EXPECT_THAT(labels.getLabels(color), ElementsAre(red));
}

TEST_F(CreateCategoryTest, checksTheNamesAndWritesOnceUnderOneGuard) {
    define(color, {});

    labels.createCategory(tags);

    EXPECT_THAT(store->operations(), ElementsAre("getChildNodes", "hasNode", "getNode", "setNodes"));
    EXPECT_THAT(store->calls("setNodes")[0].paths, ElementsAre(categoryAt(tags)));
    EXPECT_TRUE(wasHeldThroughout(Guard::Write, store->calls()));
    EXPECT_THAT(store->calls("acquireReadLock"),
                testing::SizeIs(2)); // for the check, and for the list in it
}

TEST_F(CreateCategoryTest, readsOneNodeForEachStoredCategory) {
    define(color, {red});
    define(tags, {});
    labels.createCategory(CategoryDefinition(u"Third", u"c-third"));
    EXPECT_THAT(store->calls("getNode"), testing::SizeIs(2));
}

TEST_F(CreateCategoryTest, readsTheCategoriesThroughTheVirtualOperation) {
    class Listing : public LabelManagerBase {
    public:
        using LabelManagerBase::LabelManagerBase;

        std::vector<CategoryIdentifier> getAllCategories() override { return {CategoryDefinition(u"Taken")}; }
    } manager(store, &files);

    EXPECT_RAISES(CategoryExistsByName, (u"Taken"), manager.createCategory(CategoryDefinition(u"Taken")));
}

TEST_F(CreateCategoryTest, releasesTheLockIfItFails) {
    define(color, {});
    EXPECT_RAISES(CategoryExistsByName, (u"Color"), labels.createCategory(color));
    store->clear();
    labels.getAllCategories();
    EXPECT_TRUE(wasHeldThroughout(Guard::Read, store->calls()));
}

TEST_F(CreateCategoryTest, propagatesFailuresOfTheStore) {
    store->failOn("setNodes", [] { throw std::runtime_error("the disk fails"); });
    EXPECT_THROW(labels.createCategory(color), std::runtime_error);
}

using ReadCategoriesTest = CategoriesTest;

TEST_F(ReadCategoriesTest, aFreshProjectHasNone) {
    EXPECT_THAT(labels.getAllCategories(), IsEmpty());
    EXPECT_RAISES(CategoryDoesNotExistsByUUID, (u"any"), labels.getCategoryByUUID(u"any"));
    EXPECT_RAISES(CategoryDoesNotExistsByUUID, (u""), labels.getCategoryByUUID(u""));
}

TEST_F(ReadCategoriesTest, areInTheOrderOfTheStoreAndNotByName) {
    define(CategoryDefinition(u"A", u"3"), {});
    define(CategoryDefinition(u"B", u"2"), {});
    define(CategoryDefinition(u"C", u"1"), {});
    EXPECT_THAT(categoryNames(), ElementsAre(u"C", u"B", u"A"));
}

TEST_F(ReadCategoriesTest, onlyTheTextOneCountsAsATrueFlag) {
    for (auto const* flag : {u"true", u"", u"0", u"2", u"11"}) {
        store->put(categoryAt(color), {{u"ReadOnly", flag}, {u"SingleValued", flag}});
        auto const category = labels.getCategoryByUUID(u"c-color");
        EXPECT_FALSE(category.isReadOnly()) << testing::PrintToString(std::u16string(flag));
        EXPECT_FALSE(category.isSingleValued()) << testing::PrintToString(std::u16string(flag));
    }
}

TEST_F(ReadCategoriesTest, aNodeWithoutKeysReadsAsDefaults) {
    store->put(categoryAt(color), {});
    auto const category = labels.getCategoryByUUID(u"c-color");
    EXPECT_EQ(category.getUUID(), u"c-color");
    EXPECT_EQ(category.getName(), u"");
    EXPECT_FALSE(category.isReadOnly());
    EXPECT_FALSE(category.isSingleValued());
    EXPECT_EQ(category.getDataType(), u"None");
}

TEST_F(ReadCategoriesTest, anAddressOfAnotherTypeIsNotACategory) {
    auto const head = categoryAt(color).parent();
    store->put(head.child({u"Other", u"c-other"}), {{u"Name", u"Other"}});
    EXPECT_THAT(labels.getAllCategories(), IsEmpty());
    EXPECT_RAISES(CategoryDoesNotExistsByUUID, (u"c-other"), labels.getCategoryByUUID(u"c-other"));
}

TEST_F(ReadCategoriesTest, anAddressWithoutANodeIsNotListedAlthoughItsLabelsAreFound) {
    store->put(labelAt(color, red), {{u"Name", u"Red"}});

    EXPECT_THAT(labels.getAllCategories(), IsEmpty());
    EXPECT_RAISES(CategoryDoesNotExistsByUUID, (u"c-color"), labels.getCategoryByUUID(u"c-color"));
    EXPECT_THAT(labels.getLabels(color), ElementsAre(red));
    EXPECT_EQ(labels.getLabelByUUID(color, u"l-red"), red);
}

TEST_F(ReadCategoriesTest, areReadUnderTheReadGuard) {
    define(color, {});
    define(tags, {});

    labels.getAllCategories();
    EXPECT_TRUE(wasHeldThroughout(Guard::Read, store->calls()));
    EXPECT_THAT(store->operations(),
                ElementsAre("getChildNodes", "hasNode", "getNode", "hasNode", "getNode"));

    store->clear();
    labels.getCategoryByUUID(u"c-tags");
    EXPECT_TRUE(wasHeldThroughout(Guard::Read, store->calls()));
    EXPECT_THAT(store->operations(), ElementsAre("hasNode", "getNode"));
}

using RenameCategoryTest = CategoriesTest;

TEST_F(RenameCategoryTest, acceptsTheNameOfAnotherCategory) {
    define(color, {});
    define(tags, {});
    labels.renameCategory(color, u"Tags");
    EXPECT_THAT(categoryNames(), ElementsAre(u"Tags", u"Tags"));
}

TEST_F(RenameCategoryTest, acceptsTheEmptyName) {
    define(color, {});
    labels.renameCategory(color, u"");
    EXPECT_EQ(labels.getCategoryByUUID(u"c-color").getName(), u"");
}

TEST_F(RenameCategoryTest, changesNothingButTheNameOfTheStoredNode) {
    define(CategoryIdentifier(u"c-color", u"Color", true, true, u"String"), {red});
    auto const node = stored(categoryAt(color));
    node->put(u"foreign", u"key");
    append(*node, u"Foreign", {{u"nested", u"child"}});
    replace(categoryAt(color), node);

    labels.renameCategory(color, u"Farbe");

    node->put(u"Name", u"Farbe");
    EXPECT_TRUE(isEqual(*stored(categoryAt(color)), *node));
    EXPECT_THAT(labels.getLabels(color), ElementsAre(red));
}

TEST_F(RenameCategoryTest, leavesAnUnknownCategoryUnknownWithoutAnError) {
    labels.renameCategory(color, u"Farbe");
    EXPECT_THAT(store->writes(), IsEmpty());
}

TEST_F(RenameCategoryTest, doesNotChangeAnAddressWithoutANode) {
    store->put(labelAt(color, red), {});
    labels.renameCategory(color, u"Farbe");
    EXPECT_THAT(store->writes(), IsEmpty());
}

TEST_F(RenameCategoryTest, isRefusedForAReadOnlyObjectWhateverIsStored) {
    define(color, {});
    EXPECT_RAISES(CanNotModifyReadOnlyCategory, (), labels.renameCategory(readOnlyColor, u"Farbe"));
    EXPECT_THAT(store->operations(), IsEmpty());
}

TEST_F(RenameCategoryTest, isAcceptedForAWritableObjectWhateverIsStored) {
    define(readOnlyColor, {});
    labels.renameCategory(color, u"Farbe");
    EXPECT_EQ(labels.getCategoryByUUID(u"c-color").getName(), u"Farbe");
    EXPECT_TRUE(labels.getCategoryByUUID(u"c-color").isReadOnly());
}

TEST_F(RenameCategoryTest, readsAndWritesTheOneNodeUnderOneGuard) {
    define(color, {});

    labels.renameCategory(color, u"Farbe");

    EXPECT_THAT(store->operations(), ElementsAre("getNode", "setNodes"));
    EXPECT_THAT(store->calls("setNodes")[0].paths, ElementsAre(categoryAt(color)));
    EXPECT_TRUE(wasHeldThroughout(Guard::Write, store->calls()));
}

using DeleteCategoryTest = CategoriesTest;

TEST_F(DeleteCategoryTest, removesTheCategoryAndItsLabelsFromTheProjectAndItsFiles) {
    define(color, {red});
    define(tags, {LabelDefinition(u"Urgent", u"l-urgent")});
    auto const a = file(u"folder/a");
    addLabelNodes(a, color, {red});
    addLabelNodes(a, tags, {LabelDefinition(u"Urgent", u"l-urgent")});
    addLabelNodes(root / u"folder", color, {red});

    labels.deleteCategory(color);

    EXPECT_RAISES(CategoryDoesNotExist, (u"Color"), labels.getLabels(color));
    EXPECT_THAT(categoryNames(), ElementsAre(u"Tags"));
    EXPECT_EQ(labelUUIDs(a), (LabelUUIDs{{u"c-tags", {u"l-urgent"}}}));
    EXPECT_THAT(labelUUIDs(root / u"folder"), IsEmpty());
}

TEST_F(DeleteCategoryTest, cleansAllFilesBeforeItRemovesTheDefinitionUnderOneGuard) {
    define(color, {red});
    auto const a = file(u"folder/a");

    labels.deleteCategory(color);

    ASSERT_THAT(store->writes(), ElementsAre("setNodes", "removeNodes"));
    EXPECT_THAT(store->calls("setNodes")[0].paths, ElementsAre(at(root / u"folder"), at(a)));
    EXPECT_THAT(store->calls("removeNodes")[0].paths, ElementsAre(categoryAt(color)));
    EXPECT_TRUE(wasHeldThroughout(Guard::Write, store->calls()));
}

TEST_F(DeleteCategoryTest, ofAnUnknownCategoryRemovesNothingWithoutAnError) {
    define(tags, {});
    labels.deleteCategory(color);
    EXPECT_THAT(categoryNames(), ElementsAre(u"Tags"));
}

TEST_F(DeleteCategoryTest, isRefusedForAReadOnlyObjectWhateverIsStored) {
    define(color, {red});
    addLabelNodes(file(u"a"), color, {red});

    EXPECT_RAISES(CanNotModifyReadOnlyCategory, (), labels.deleteCategory(readOnlyColor));

    EXPECT_THAT(store->operations(), IsEmpty());
    EXPECT_THAT(categoryNames(), ElementsAre(u"Color"));
}

TEST_F(DeleteCategoryTest, isAcceptedForAWritableObjectWhateverIsStored) {
    define(readOnlyColor, {red});
    labels.deleteCategory(color);
    EXPECT_THAT(categoryNames(), IsEmpty());
}

TEST_F(DeleteCategoryTest, keepsTheFilesCleanedIfTheDefinitionCannotBeRemoved) {
    define(color, {red});
    auto const a = file(u"a");
    addLabelNodes(a, color, {red});
    store->failOn("removeNodes", [] { throw std::runtime_error("the disk fails"); });

    EXPECT_THROW(labels.deleteCategory(color), std::runtime_error);

    EXPECT_THAT(labelUUIDs(a), IsEmpty());
    EXPECT_THAT(categoryNames(), ElementsAre(u"Color"));
}

TEST_F(DeleteCategoryTest, keepsTheDefinitionIfTheFilesCannotBeCleaned) {
    define(color, {red});
    store->failOn("setNodes", [] { throw std::runtime_error("the disk fails"); });
    EXPECT_THROW(labels.deleteCategory(color), std::runtime_error);
    EXPECT_THAT(categoryNames(), ElementsAre(u"Color"));
}

} // namespace
} // namespace project::management
