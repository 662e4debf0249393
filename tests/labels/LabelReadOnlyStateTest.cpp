#include "project/labels/LabelReadOnlyState.hpp"

#include <stdexcept>

#include "support/ErrorMatchers.hpp"

namespace project::management {
namespace {

static_assert(static_cast<int>(LabelReadOnlyState::READ_ONLY) == 0);
static_assert(static_cast<int>(LabelReadOnlyState::WRITABLE) == 1);
static_assert(static_cast<int>(LabelReadOnlyState::INHERITED) == 2);

TEST(LabelReadOnlyState, isStoredByItsName) {
    EXPECT_EQ(labelTypeToString(LabelReadOnlyState::READ_ONLY), u"READ_ONLY");
    EXPECT_EQ(labelTypeToString(LabelReadOnlyState::WRITABLE), u"WRITABLE");
    EXPECT_EQ(labelTypeToString(LabelReadOnlyState::INHERITED), u"INHERITED");
}

TEST(LabelReadOnlyState, isReadFromItsText) {
    for (auto const* text : {u"READ_ONLY", u"WRITABLE", u"INHERITED"}) {
        EXPECT_EQ(labelTypeToString(getLabelStateFromName(text)), text);
    }
}

TEST(LabelReadOnlyState, isInheritedWithoutAText) {
    EXPECT_EQ(getLabelStateFromName(u""), LabelReadOnlyState::INHERITED);
}

TEST(LabelReadOnlyState, isNotFoundByItsTextInAnotherCase) {
    EXPECT_RAISES_NESTED(LabelReadOnlyStateUndefined, (u"Inherited"), std::out_of_range,
                         getLabelStateFromName(u"Inherited"));
}

TEST(LabelReadOnlyState, isNotFoundByAnyOtherText) {
    EXPECT_RAISES_NESTED(LabelReadOnlyStateUndefined, (u"1"), std::out_of_range, getLabelStateFromName(u"1"));
}

TEST(LabelReadOnlyState, hasNoTextForAnInvalidValue) {
    EXPECT_THROW(labelTypeToString(static_cast<LabelReadOnlyState>(3)), std::out_of_range);
}

TEST(LabelReadOnlyState, returnsTheSameTextObjectEachTime) {
    EXPECT_EQ(&labelTypeToString(LabelReadOnlyState::WRITABLE),
              &labelTypeToString(LabelReadOnlyState::WRITABLE));
}

} // namespace
} // namespace project::management
