#include "project/labels/Label.hpp"

#include <type_traits>

namespace project::management {
namespace {

static_assert(std::is_convertible_v<Label*, Unique*>, "Unique is a public base");

TEST(Label, takesTheCategoryFirst) {
    Label const label(CategoryDefinition(u"Color", u"c"), LabelDefinition(u"Red", u"r"));
    EXPECT_EQ(label.getCategory().getUUID(), u"c");
    EXPECT_EQ(label.getLabelIdentifier(), LabelDefinition(u"Red", u"r"));
}

TEST(Label, isIdentifiedByTheUUIDOfTheLabelAndNotOfItsCategory) {
    Label const label(CategoryDefinition(u"Color", u"c"), LabelDefinition(u"Red", u"r"));
    EXPECT_EQ(label.getUUID(), u"r");
}

TEST(Label, isAValue) {
    Label label(CategoryDefinition(u"Color", u"c"), LabelDefinition(u"Red", u"r"));
    Label const copy = label;
    label = Label(CategoryDefinition(u"Other", u"o"), LabelDefinition(u"Blue", u"b"));
    EXPECT_EQ(copy.getUUID(), u"r");
    EXPECT_EQ(copy.getCategory().getName(), u"Color");
    EXPECT_EQ(label.getUUID(), u"b");
}

} // namespace
} // namespace project::management
