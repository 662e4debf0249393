#include "project/entrypoints/EntryPointType.hpp"

#include <stdexcept>

#include "support/ErrorMatchers.hpp"

namespace project::management {
namespace {

TEST(EntryPointType, eachTypeIsStoredUnderOneName) {
    EXPECT_EQ(toString(EntryPointType::Basic), u"Basic");
    EXPECT_EQ(toString(EntryPointType::Startup), u"Startup");
    EXPECT_EQ(toString(EntryPointType::Shutdown), u"Shutdown");
    EXPECT_EQ(toString(EntryPointType::BatchJob), u"Batch_Job");
}

TEST(EntryPointType, theNumbersOfTheTypesAreFixed) {
    static_assert(std::is_same_v<std::underlying_type_t<EntryPointType>, std::int32_t>);
    EXPECT_EQ(static_cast<int>(EntryPointType::Basic), 0);
    EXPECT_EQ(static_cast<int>(EntryPointType::Startup), 1);
    EXPECT_EQ(static_cast<int>(EntryPointType::Shutdown), 2);
    EXPECT_EQ(static_cast<int>(EntryPointType::BatchJob), 3);
}

TEST(EntryPointType, everyStoredNameIsRead) {
    EXPECT_EQ(getFromName(u"Basic"), EntryPointType::Basic);
    EXPECT_EQ(getFromName(u"Startup"), EntryPointType::Startup);
    EXPECT_EQ(getFromName(u"Shutdown"), EntryPointType::Shutdown);
    EXPECT_EQ(getFromName(u"Batch_Job"), EntryPointType::BatchJob);
}

TEST(EntryPointType, twoOtherSpellingsAreReadToo) {
    EXPECT_EQ(getFromName(u"StartUp"), EntryPointType::Startup);
    EXPECT_EQ(getFromName(u"Batch Job"), EntryPointType::BatchJob);
}

TEST(EntryPointType, namesInAnotherLetterCaseAreUnknown) {
    EXPECT_RAISES_NESTED(EntryPointTypeUndefined, (u"basic"), std::out_of_range, getFromName(u"basic"));
    EXPECT_RAISES_NESTED(EntryPointTypeUndefined, (u"ShutDown"), std::out_of_range, getFromName(u"ShutDown"));
}

TEST(EntryPointType, theEmptyNameIsUnknown) {
    EXPECT_RAISES_NESTED(EntryPointTypeUndefined, (u""), std::out_of_range, getFromName(u""));
}

TEST(EntryPointType, aNameIsComparedAsAWhole) {
    EXPECT_RAISES_NESTED(EntryPointTypeUndefined, (u"Basic "), std::out_of_range, getFromName(u"Basic "));
}

TEST(EntryPointType, anInvalidValueHasTheEmptyNameAndIsNotAnError) {
    EXPECT_EQ(toString(static_cast<EntryPointType>(4)), u"");
    EXPECT_EQ(toString(static_cast<EntryPointType>(-1)), u"");
    EXPECT_EQ(toString(static_cast<EntryPointType>(4)), u"");
}

TEST(EntryPointType, theNameOfAnInvalidValueDoesNotBecomeKnown) {
    ASSERT_EQ(toString(static_cast<EntryPointType>(5)), u"");
    EXPECT_RAISES_NESTED(EntryPointTypeUndefined, (u""), std::out_of_range, getFromName(u""));
}

} // namespace
} // namespace project::management
