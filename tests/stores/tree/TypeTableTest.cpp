#include "tree/TypeTable.hpp"

#include <gtest/gtest.h>

namespace project::stores {
namespace {

TEST(TypeTable, eachTypeHasOneIndexByWhichItIsFound) {
    TypeTable types;
    auto const file = types.index(u"File");
    auto const none = types.index(u"");
    EXPECT_NE(file, none);
    EXPECT_EQ(types.index(u"File"), file);
    EXPECT_EQ(types[file], u"File");
    EXPECT_EQ(types[none], u"");
}

TEST(TypeTable, typesStayWhereTheyAreWhenOthersAreAdded) {
    TypeTable types;
    auto const* const first = &types[types.index(u"first")];
    for (char16_t unit = 0; unit < 1000; ++unit) {
        EXPECT_EQ(types[types.index(std::u16string(3, unit))], std::u16string(3, unit));
    }
    EXPECT_EQ(&types[types.index(u"first")], first);
}

} // namespace
} // namespace project::stores
