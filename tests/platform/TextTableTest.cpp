#include "fl/i18n/TextTable.hpp"

#include <array>
#include <atomic>
#include <string>
#include <thread>
#include <utility>

#include <gtest/gtest.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include "platform/TestMessage.hpp"
#include "support/GlobalLocale.hpp"

namespace fl::i18n {
namespace {

using project::test::GlobalLocale;
using project::test::TestMessage;

constexpr auto english = std::to_array<TextTable::Text>({
    {"Greeting", "Hello {0}, it''s {1}"},
    {"Braces", "{} {x} {2} {"},
    {"OnlyEnglish", "only English"},
});
constexpr auto german = std::to_array<TextTable::Text>({{"Greeting", "{1}, hallo {0}"}});
constexpr auto austrian = std::to_array<TextTable::Text>({{"Greeting", "{1}, servus {0}"}});
constexpr auto languages =
    std::to_array<TextTable::Language>({{"root", english}, {"de", german}, {"de_AT", austrian}});
constexpr TextTable table{languages};

std::string greetingIn(std::string locale) {
    GlobalLocale const language(std::move(locale));
    return table.get("Greeting", "Ann", "late");
}

TEST(TextTable, insertsArgumentsAtTheirNumbers) {
    EXPECT_EQ(greetingIn("en"), "Hello Ann, it's late");
    EXPECT_EQ(greetingIn("de"), "late, hallo Ann");
}

TEST(TextTable, isEnglishUntilALanguageIsChosen) {
    EXPECT_EQ(table.get("Greeting", "Ann", "late"), "Hello Ann, it's late");
}

TEST(TextTable, insertsTheBytesOfStringsAndWholeNumbers) {
    std::string const odd("{1}'\xff\xc3\0<''", 9);

    EXPECT_EQ(table.get("Greeting", odd, -12), "Hello " + odd + ", it's -12");
    EXPECT_EQ(table.get("Greeting", 1234567, std::size_t{0}), "Hello 1234567, it's 0");
}

TEST(TextTable, keepsBracesWithoutAnArgument) {
    EXPECT_EQ(table.get("Braces", "a", "b"), "{} {x} {2} {");
    EXPECT_EQ(table.get("Greeting"), "Hello {0}, it's {1}");
}

TEST(TextTable, isEnglishWhereALanguageLacksTheText) {
    GlobalLocale const language("de_DE");

    EXPECT_EQ(table.get("OnlyEnglish"), "only English");
}

TEST(TextTable, returnsTheNameOfAnUnknownText) {
    EXPECT_EQ(table.get("Unknown", "argument"), "Unknown");
}

TEST(TextTable, takesTheNearestLanguage) {
    EXPECT_EQ(greetingIn("de_AT"), "late, servus Ann");
    EXPECT_EQ(greetingIn("de-at"), "late, servus Ann");
    EXPECT_EQ(greetingIn("de_AT.UTF-8"), "late, servus Ann");
    EXPECT_EQ(greetingIn("de_CH"), "late, hallo Ann");
    EXPECT_EQ(greetingIn("DE"), "late, hallo Ann");
    EXPECT_EQ(greetingIn("den"), "Hello Ann, it's late");
    EXPECT_EQ(greetingIn("d"), "Hello Ann, it's late");
    EXPECT_EQ(greetingIn("fr"), "Hello Ann, it's late");
    EXPECT_EQ(greetingIn("root"), "Hello Ann, it's late");
    EXPECT_EQ(greetingIn(""), "Hello Ann, it's late");
}

TEST(TextTable, takesTheLanguageOfTheMessageCatalog) {
    TestMessage const message("Greeting", std::string("Ann"), std::string("late"));
    for (auto const* locale : {"en", "de", "de_DE", "de-CH", "DE", "fr", "C", ""}) {
        GlobalLocale const language(locale);

        bool const isGerman = MessageCatalog::get_message(message) == u"late, hallo Ann";
        EXPECT_EQ(table.get("Greeting", "Ann", "late") == "late, hallo Ann", isGerman) << locale;
    }
}

/// No process can open a file while this exists.
class NoDescriptors {
public:
    NoDescriptors() {
        EXPECT_EQ(::getrlimit(RLIMIT_NOFILE, &before_), 0);
        rlimit const none{0, before_.rlim_max};
        EXPECT_EQ(::setrlimit(RLIMIT_NOFILE, &none), 0);
    }

    NoDescriptors(NoDescriptors const&) = delete;
    NoDescriptors& operator=(NoDescriptors const&) = delete;

    ~NoDescriptors() { ::setrlimit(RLIMIT_NOFILE, &before_); }

private:
    rlimit before_{};
};

TEST(TextTable, needsNoDescriptor) {
    GlobalLocale const language("de");
    NoDescriptors const none;

    EXPECT_EQ(table.get("Greeting", "Ann", "late"), "late, hallo Ann");
}

/// Changes the language again and again.
class ChangingLanguage {
public:
    ChangingLanguage() {
        thread_ = std::thread([this] {
            while (!isEnding_) {
                MessageCatalog::setGlobalLocale("de");
            }
        });
    }

    ChangingLanguage(ChangingLanguage const&) = delete;
    ChangingLanguage& operator=(ChangingLanguage const&) = delete;

    ~ChangingLanguage() {
        isEnding_ = true;
        thread_.join();
    }

private:
    GlobalLocale const german_{"de"};
    std::atomic<bool> isEnding_ = false;
    std::thread thread_;
};

TEST(TextTable, neverWaitsForAThreadThatAForkHasLeftBehind) {
    ChangingLanguage const changing;
    for (int child = 0; child < 100; ++child) {
        pid_t const process = ::fork();
        if (process == 0) {
            ::alarm(10);
            ::_exit(table.get("Greeting", "Ann", "late") == "late, hallo Ann" ? 0 : 1);
        }
        int status = -1;
        ASSERT_EQ(::waitpid(process, &status, 0), process);
        ASSERT_EQ(status, 0) << "child " << child;
    }
}

} // namespace
} // namespace fl::i18n
