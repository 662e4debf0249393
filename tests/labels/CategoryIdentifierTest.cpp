#include "project/labels/CategoryIdentifier.hpp"

#include <concepts>
#include <type_traits>

namespace project::management {
namespace {

static_assert(std::is_base_of_v<Unique, CategoryIdentifier>);
static_assert(!std::is_convertible_v<CategoryIdentifier*, Unique*>, "Unique is a private base");
static_assert(!std::equality_comparable<CategoryIdentifier>, "two values for one category may differ");
static_assert(std::is_copy_assignable_v<CategoryIdentifier> &&
              std::is_copy_constructible_v<CategoryDefinition>);

TEST(CategoryIdentifier, returnsTheConstructorsArguments) {
    CategoryIdentifier const category(u"uuid", u"name", true, false, u"Logical");
    EXPECT_EQ(category.getUUID(), u"uuid");
    EXPECT_EQ(category.getName(), u"name");
    EXPECT_TRUE(category.isReadOnly());
    EXPECT_FALSE(category.isSingleValued());
    EXPECT_EQ(category.getDataType(), u"Logical");
}

TEST(CategoryIdentifier, takesTheReadOnlyFlagBeforeTheSingleValuedFlag) {
    CategoryIdentifier const category(u"uuid", u"name", false, true, u"");
    EXPECT_FALSE(category.isReadOnly());
    EXPECT_TRUE(category.isSingleValued());
}

TEST(CategoryIdentifier, returnsNoneForAnEmptyDataType) {
    EXPECT_EQ(CategoryIdentifier(u"uuid", u"name", false, false, u"").getDataType(), u"None");
}

TEST(CategoryIdentifier, acceptsEveryText) {
    CategoryIdentifier const category(u"", u"", false, false, u"no validator's type");
    EXPECT_EQ(category.getUUID(), u"");
    EXPECT_EQ(category.getName(), u"");
    EXPECT_EQ(category.getDataType(), u"no validator's type");
}

TEST(CategoryIdentifier, canBeOverriddenExceptForTheDataType) {
    class Other : public CategoryIdentifier {
    public:
        Other() : CategoryIdentifier(u"uuid", u"name", false, false, u"String") {}

        std::u16string getUUID() const override { return u"other uuid"; }

        std::u16string getName() const override { return u"other name"; }

        bool isReadOnly() const override { return true; }

        bool isSingleValued() const override { return true; }

        std::u16string getDataType() const { return u"Logical"; }
    } const other;

    CategoryIdentifier const& category = other;
    EXPECT_EQ(category.getUUID(), u"other uuid");
    EXPECT_EQ(category.getName(), u"other name");
    EXPECT_TRUE(category.isReadOnly());
    EXPECT_TRUE(category.isSingleValued());
    EXPECT_EQ(category.getDataType(), u"String");
    EXPECT_EQ(other.getDataType(), u"Logical");
}

TEST(CategoryDefinition, isWritableMultiValuedAndWithoutDataAtFirst) {
    for (auto const& category : {CategoryDefinition(u"name"), CategoryDefinition(u"name", u"uuid")}) {
        EXPECT_EQ(category.getName(), u"name");
        EXPECT_FALSE(category.isReadOnly());
        EXPECT_FALSE(category.isSingleValued());
        EXPECT_EQ(category.getDataType(), u"None");
    }
}

TEST(CategoryDefinition, getsANewUUIDUnlessOneIsGiven) {
    CategoryDefinition const one(u"name");
    CategoryDefinition const other(u"name");
    EXPECT_NE(one.getUUID(), other.getUUID());
    EXPECT_FALSE(one.getUUID().empty());
    EXPECT_EQ(CategoryDefinition(u"name", u"any form").getUUID(), u"any form");
}

TEST(CategoryDefinition, setsItsAttributesInAChain) {
    CategoryDefinition category(u"name");
    auto& result = category.setIsReadOnly(true).setIsSingleValued(true).setDataType(u"String");
    EXPECT_EQ(&result, &category);
    EXPECT_TRUE(category.isReadOnly());
    EXPECT_TRUE(category.isSingleValued());
    EXPECT_EQ(category.getDataType(), u"String");
}

TEST(CategoryDefinition, returnsNoneAlsoAfterTheDataTypeWasSetEmpty) {
    EXPECT_EQ(CategoryDefinition(u"name").setDataType(u"String").setDataType(u"").getDataType(), u"None");
}

} // namespace
} // namespace project::management
