#include "entrypoints/EntryPointGroupBase.hpp"

#include <cstdlib>

#include <gtest/gtest.h>

#include "support/GlobalLocale.hpp"

namespace project::management {
namespace {

TEST(EntryPointGroupBase, hasTheNameAndUUIDOfTheConstructor) {
    EntryPointGroupBase const group(u"Tools", u"u1");
    EXPECT_EQ(group.getName(), u"Tools");
    EXPECT_EQ(group.getUUID(), u"u1");
}

TEST(DefaultGroup, isNamedByTheCatalogAndIdentifiedByAFixedUUID) {
    EXPECT_EQ(getDefaultGroup()->getName(), u"Default");
    EXPECT_EQ(getDefaultGroup()->getUUID(), u"default");
}

TEST(DefaultGroup, isANewObjectAtEachCall) {
    auto const first = getDefaultGroup();
    EXPECT_NE(first.get(), getDefaultGroup().get());
}

TEST(DefaultGroup, keepsItsNameWhenTheGlobalLocaleChanges) {
    ASSERT_EQ(getDefaultGroup()->getName(), u"Default");
    test::GlobalLocale const german("de");
    EXPECT_EQ(getDefaultGroup()->getName(), u"Default");
}

// The name is looked up once in a process, so this test runs in a process of its own.
TEST(DefaultGroupDeathTest, isNamedInTheGlobalLocaleOfTheFirstCall) {
    testing::FLAGS_gtest_death_test_style = "threadsafe";
    EXPECT_EXIT(
        {
            fl::i18n::MessageCatalog::setGlobalLocale("de");
            std::exit(getDefaultGroup()->getName() == u"Standard" ? 0 : 1);
        },
        testing::ExitedWithCode(0), "");
}

} // namespace
} // namespace project::management
