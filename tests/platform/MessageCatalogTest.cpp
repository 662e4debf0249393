#include "fl/i18n/MessageCatalog.hpp"

#include <unicode/locid.h>
#include <unicode/uloc.h>

#include "platform/TestMessage.hpp"
#include "support/GlobalLocale.hpp"

namespace fl::i18n {
namespace {

using project::test::GlobalLocale;
using project::test::TestMessage;

TestMessage greeting() {
    return TestMessage("Greeting", std::u16string(u"Ann"), std::u16string(u"late"));
}

/// Sets German as ICU's language of the environment, as on the machine of a German user.
class GermanEnvironment {
public:
    GermanEnvironment() { set(icu::Locale::getGermany()); }

    GermanEnvironment(GermanEnvironment const&) = delete;
    GermanEnvironment& operator=(GermanEnvironment const&) = delete;

    ~GermanEnvironment() { set(before_); }

private:
    static void set(icu::Locale const& locale) {
        UErrorCode status = U_ZERO_ERROR;
        icu::Locale::setDefault(locale, status);
        EXPECT_TRUE(U_SUCCESS(status));
    }

    icu::Locale before_ = icu::Locale::getDefault();
};

TEST(MessageCatalog, insertsArgumentsAtTheirNumbers) {
    EXPECT_EQ(MessageCatalog::get_message(greeting(), "en"), u"Hello Ann, it's late");
    EXPECT_EQ(MessageCatalog::get_message(greeting(), "de"), u"late, hallo Ann");
}

TEST(MessageCatalog, insertsStringsUnchanged) {
    std::u16string const odd = {u'{',  u'1', u'}', u'\'', char16_t{0xD800}, u'x', char16_t{0xDC80},
                                u'\0', u'<'};

    auto const text = MessageCatalog::get_message(TestMessage("Greeting", odd, std::u16string()), "en");

    EXPECT_EQ(text, u"Hello " + odd + u", it's ");
}

TEST(MessageCatalog, readsNarrowStringsAsUtf8) {
    TestMessage const message("Greeting", std::string("J\xc3\xb6rg"), std::string("\xff"));

    EXPECT_EQ(MessageCatalog::get_message(message, "en"), u"Hello J\u00f6rg, it's \ufffd");
}

TEST(MessageCatalog, formatsNumbersForTheLanguage) {
    TestMessage const message("Count", 1234567L);

    EXPECT_EQ(MessageCatalog::get_message(message, "en"), u"1,234,567 files");
    EXPECT_EQ(MessageCatalog::get_message(message, "de"), u"1.234.567 Dateien");
}

TEST(MessageCatalog, anUnsetSlotIsTheNumberZero) {
    TestMessage const named("Count");
    resource_core::BaseMsgID const message(named.getCatalogName(), "Count", 1);

    EXPECT_EQ(MessageCatalog::get_message(message, "en"), u"0 files");
}

TEST(MessageCatalog, usesTheGlobalLocaleByDefault) {
    GlobalLocale const german("de");

    EXPECT_EQ(MessageCatalog::getGlobalLocale(), "de");
    EXPECT_EQ(MessageCatalog::get_message(greeting()), u"late, hallo Ann");
}

TEST(MessageCatalog, isEnglishUntilALocaleIsSetInAnyEnvironment) {
    GermanEnvironment const environment;

    EXPECT_EQ(MessageCatalog::getGlobalLocale(), "en");
    EXPECT_EQ(MessageCatalog::get_message(greeting()), u"Hello Ann, it's late");
}

TEST(MessageCatalog, fallsBackFromARegionToItsLanguage) {
    EXPECT_EQ(MessageCatalog::get_message(greeting(), "de_AT"), u"Servus Ann, late");
    EXPECT_EQ(MessageCatalog::get_message(TestMessage("Count", 1L), "de_AT"), u"1 Dateien");
    EXPECT_EQ(MessageCatalog::get_message(greeting(), "de_CH"), u"late, hallo Ann");
    EXPECT_EQ(MessageCatalog::get_message(greeting(), "de_419"), u"late, hallo Ann") << "a region in digits";
}

TEST(MessageCatalog, understandsEverySpellingOfALocale) {
    for (auto const* locale : {"de-AT", "de_AT", "DE_at", "de_AT.UTF-8", "de_AT@collation=phonebook"}) {
        EXPECT_EQ(MessageCatalog::get_message(greeting(), locale), u"Servus Ann, late") << locale;
    }
}

TEST(MessageCatalog, fallsBackToTheRootForATextThatALanguageLacks) {
    EXPECT_EQ(MessageCatalog::get_message(TestMessage("OnlyInTheRoot"), "de"), u"found in the root");
}

TEST(MessageCatalog, fallsBackToTheRootAndNotToTheLanguageOfTheEnvironment) {
    GermanEnvironment const environment;

    EXPECT_EQ(MessageCatalog::get_message(greeting(), "pt_BR"), u"Hello Ann, it's late");
}

TEST(MessageCatalog, fallsBackToTheRootForAnInvalidLocale) {
    for (auto const& locale : {std::string(), std::string("../de"), std::string("x/../de"), std::string("C"),
                               std::string("d:e"), std::string("d[e"), std::string("d{e"),
                               std::string("\xff"), std::string(1000, 'd'), std::string("root")}) {
        EXPECT_EQ(MessageCatalog::get_message(greeting(), locale), u"Hello Ann, it's late") << locale;
    }
}

TEST(MessageCatalog, fallsBackToTheLanguageOfALocaleOfAnyLength) {
    for (std::size_t length = 1; length <= 2 * ULOC_FULLNAME_CAPACITY; ++length) {
        auto const text = MessageCatalog::get_message(greeting(), "de_AT_" + std::string(length, 'X'));

        bool const isTooLong = length + 6 >= ULOC_FULLNAME_CAPACITY;
        EXPECT_EQ(text, isTooLong ? u"Hello Ann, it's late" : u"Servus Ann, late") << length;
    }
}

TEST(MessageCatalog, returnsTheNameWithItsArgumentsWithoutAText) {
    TestMessage const message("NoSuchMessage", std::u16string(u"one"), std::string("two"), 3L);

    EXPECT_EQ(MessageCatalog::get_message(message, "de"), u"NoSuchMessage: one, two, 3");
    EXPECT_EQ(MessageCatalog::get_message(TestMessage("NoSuchMessage"), "de"), u"NoSuchMessage");
}

TEST(MessageCatalog, returnsTheNameWithItsArgumentsWithoutACatalog) {
    resource_core::BaseMsgID const message("no:such:catalog", "Message", 1);

    EXPECT_EQ(MessageCatalog::get_message(message, "en"), u"Message: 0");
}

TEST(MessageCatalog, returnsTheNameWithItsArgumentsForAnInvalidPattern) {
    EXPECT_EQ(MessageCatalog::get_message(TestMessage("NoPattern", 5L), "en"), u"NoPattern: 5");
}

TEST(MessageCatalog, keepsTheFirstCatalogOfAName) {
    auto const message = greeting();

    MessageCatalog::registerCatalog(message.getCatalogName(), "another_package", "");

    EXPECT_EQ(MessageCatalog::get_message(message, "en"), u"Hello Ann, it's late");
}

TEST(MessageCatalog, rejectsInvalidCatalogs) {
    alignas(16) char const noPackage[64] = "this is not a package";

    MessageCatalog::registerCatalog("test:damaged", "damaged_package", noPackage);

    EXPECT_EQ(MessageCatalog::get_message({"test:damaged", "Message", 0}, "en"), u"Message");
}

} // namespace
} // namespace fl::i18n
