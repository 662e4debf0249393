#include "project/files/LabelIDSet.hpp"

#include <type_traits>

#include "project/labels/CategoryIdentifier.hpp"
#include "project/labels/LabelIdentifier.hpp"

namespace project::management {
namespace {

static_assert(!std::is_polymorphic_v<LabelIDSet>);

TEST(LabelIDSet, takesTheCategoryFirst) {
    LabelIDSet const pair(u"category", u"label");
    EXPECT_EQ(pair.getCategoryUUID(), u"category");
    EXPECT_EQ(pair.getLabelUUID(), u"label");
}

TEST(LabelIDSet, takesTheUUIDsOfIdentifiers) {
    LabelIDSet const pair(CategoryDefinition(u"Color", u"c"), LabelDefinition(u"Red", u"r"));
    EXPECT_EQ(pair, LabelIDSet(u"c", u"r"));
}

TEST(LabelIDSet, differsFromTheOneWithTheUUIDsSwapped) {
    EXPECT_FALSE(LabelIDSet(u"a", u"b") == LabelIDSet(u"b", u"a"));
}

TEST(LabelIDSet, differsIfEitherUUIDDiffersAlsoInCase) {
    LabelIDSet const pair(u"a", u"b");
    EXPECT_FALSE(pair == LabelIDSet(u"A", u"b"));
    EXPECT_FALSE(pair == LabelIDSet(u"a", u"B"));
    EXPECT_TRUE(pair == LabelIDSet(u"a", u"b"));
}

} // namespace
} // namespace project::management
