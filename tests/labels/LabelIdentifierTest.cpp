#include "project/labels/LabelIdentifier.hpp"

#include <type_traits>

namespace project::management {
namespace {

using State = LabelReadOnlyState;

static_assert(std::is_base_of_v<Unique, LabelIdentifier>);
static_assert(!std::is_convertible_v<LabelIdentifier*, Unique*>, "Unique is a private base");

TEST(LabelIdentifier, returnsTheConstructorsArguments) {
    LabelIdentifier const label(u"uuid", u"name", State::WRITABLE);
    EXPECT_EQ(label.getUUID(), u"uuid");
    EXPECT_EQ(label.getName(), u"name");
    EXPECT_EQ(label.isReadOnly(), State::WRITABLE);
}

TEST(LabelIdentifier, differsFromAnotherStateOfTheSameLabel) {
    LabelIdentifier const writable(u"uuid", u"name", State::WRITABLE);
    LabelIdentifier const readOnly(u"uuid", u"name", State::READ_ONLY);
    EXPECT_FALSE(writable == readOnly);
    EXPECT_TRUE(writable != readOnly);
}

TEST(LabelIdentifier, differsFromAnotherNameAlsoInCaseOnly) {
    LabelIdentifier const label(u"uuid", u"name", State::WRITABLE);
    LabelIdentifier const other(u"uuid", u"Name", State::WRITABLE);
    EXPECT_FALSE(label == other);
    EXPECT_TRUE(label != other);
}

TEST(LabelIdentifier, differsFromAnotherUUID) {
    LabelIdentifier const label(u"uuid", u"name", State::WRITABLE);
    LabelIdentifier const other(u"other", u"name", State::WRITABLE);
    EXPECT_FALSE(label == other);
    EXPECT_TRUE(label != other);
}

TEST(LabelIdentifier, equalsOneWithTheSameThreeAttributes) {
    LabelIdentifier const label(u"uuid", u"name", State::INHERITED);
    LabelDefinition const same(u"name", u"uuid");
    EXPECT_TRUE(label == same);
    EXPECT_FALSE(label != same);
}

TEST(LabelDefinition, inheritsItsStateAtFirst) {
    EXPECT_EQ(LabelDefinition(u"name").isReadOnly(), State::INHERITED);
    EXPECT_EQ(LabelDefinition(u"name", u"uuid").isReadOnly(), State::INHERITED);
}

TEST(LabelDefinition, getsANewUUIDUnlessOneIsGiven) {
    LabelDefinition const one(u"name");
    LabelDefinition const other(u"name");
    EXPECT_EQ(one.getName(), u"name");
    EXPECT_FALSE(one.getUUID().empty());
    EXPECT_NE(one.getUUID(), other.getUUID());
    EXPECT_EQ(LabelDefinition(u"name", u"any form").getUUID(), u"any form");
}

TEST(LabelDefinition, setsItsStateAndReturnsItself) {
    LabelDefinition label(u"name");
    EXPECT_EQ(&label.setIsReadOnly(State::READ_ONLY), &label);
    EXPECT_EQ(label.isReadOnly(), State::READ_ONLY);
}

} // namespace
} // namespace project::management
