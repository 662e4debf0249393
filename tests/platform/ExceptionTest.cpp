#include "foundation/core/except/Exception.hpp"

#include <bit>
#include <cstdint>
#include <type_traits>

#include "computils/exception/StackTraceRecordingException.hpp"
#include "platform/TestMessage.hpp"
#include "support/GlobalLocale.hpp"

namespace foundation::core::except {
namespace {

using computils::exception::StackTraceRecordingException;
using project::test::GlobalLocale;
using project::test::TestMessage;
using TestError = Exception<TestMessage, StackTraceRecordingException>;

static_assert(!std::is_base_of_v<std::exception, IException>, "catching std::exception would be ambiguous");

TestError makeError() {
    StackTraceRecordingException base(u"text of the base");
    base.getStackTrace().capture(0);
    return {base, TestMessage("Greeting", std::u16string(u"Ann"), std::u16string(u"late"))};
}

TEST(Exception, returnsTheSameTextThroughBothBases) {
    auto const error = makeError();

    EXPECT_STREQ(static_cast<IException const&>(error).what(), "Hello Ann, it's late");
    EXPECT_STREQ(static_cast<std::exception const&>(error).what(), "Hello Ann, it's late");
}

TEST(Exception, keepsTheTextInTheLanguageOfTheThrowAndLooksUpTheCurrentOneOnRequest) {
    auto const error = makeError();
    GlobalLocale const german("de");
    std::u16string text = u"before";
    std::string narrow = "before";

    error.convert_str(text);
    error.convert_str(narrow);

    EXPECT_STREQ(error.what(), "Hello Ann, it's late");
    EXPECT_EQ(error.GetUnicodeMessageTxt(), u"late, hallo Ann");
    EXPECT_EQ(error.ToUstringImpl(), u"late, hallo Ann");
    EXPECT_EQ(text, u"late, hallo Ann");
    EXPECT_EQ(narrow, "late, hallo Ann");
}

TEST(Exception, hasTheCatalogAndTheNameForItsId) {
    EXPECT_EQ(makeError().GetID(), "test:platform:Greeting");
    EXPECT_EQ(IMsgIDException::get_error_id({"ZEPHRA:project:management", "FileNotInProject", 1}),
              "ZEPHRA:project:management:FileNotInProject");
}

TEST(Exception, returnsTheMessageThatItWasConstructedFrom) {
    auto const error = makeError();

    auto const& message = error.GetBaseMsgIDObj();

    EXPECT_EQ(message.getCatalogName(), "test:platform");
    EXPECT_EQ(message.getMessageName(), "Greeting");
    EXPECT_THAT(message.getArguments(),
                testing::ElementsAre(std::u16string(u"Ann"), std::u16string(u"late")));
}

TEST(Exception, clonesWithItsStackItsTextsAndItsMessage) {
    auto const error = makeError();

    std::unique_ptr<IException const> const clone(static_cast<IException const&>(error).clone());

    auto const* same = dynamic_cast<TestError const*>(clone.get());
    ASSERT_NE(same, nullptr);
    EXPECT_NE(same, &error);
    EXPECT_STREQ(same->what(), error.what());
    EXPECT_EQ(same->getText(), u"text of the base");
    EXPECT_FALSE(error.getStackTrace().getFrames().empty());
    EXPECT_EQ(same->getStackTrace().getFrames(), error.getStackTrace().getFrames());
    EXPECT_EQ(same->GetBaseMsgIDObj().getArguments(), error.GetBaseMsgIDObj().getArguments());
}

TEST(Exception, rethrowsACopyOfItself) {
    auto const error = makeError();

    try {
        static_cast<IException const&>(error).rethrow();
        FAIL() << "nothing was thrown";
    } catch (TestError const& thrown) {
        EXPECT_NE(&thrown, &error);
        EXPECT_STREQ(thrown.what(), error.what());
        EXPECT_EQ(thrown.getStackTrace().getFrames(), error.getStackTrace().getFrames());
    }
}

TEST(Exception, clonesANestedOneToThePlainForm) {
    struct Nested : TestError, std::nested_exception {
        using TestError::TestError;
    };

    Nested const error{StackTraceRecordingException(), TestMessage("Greeting")};

    std::unique_ptr<IException const> const clone(error.clone());

    auto const& copy = *clone;
    EXPECT_EQ(typeid(copy), typeid(TestError));
}

TEST(Exception, canBeCaughtThroughEachInterface) {
    EXPECT_THROW(throw makeError(), IException);
    EXPECT_THROW(throw makeError(), IUserException);
    EXPECT_THROW(throw makeError(), IMsgIDException);
    EXPECT_THROW(throw makeError(), StackTraceRecordingException);
    EXPECT_THROW(throw makeError(), std::exception);
}

TEST(Exception, beginsWithTheInterface) {
    auto const error = makeError();

    EXPECT_EQ(static_cast<void const*>(static_cast<IMsgIDException const*>(&error)),
              static_cast<void const*>(&error));
}

/// The slot of a virtual operation, counted from 0, from a pointer to it.
template <class Operation>
std::intptr_t slotOf(Operation operation) {
    struct Parts {
        std::intptr_t offset;
        std::intptr_t adjustment;
    };

    return (std::bit_cast<Parts>(operation).offset - 1) / static_cast<std::intptr_t>(sizeof(void*));
}

TEST(Exception, keepsItsOperationsInTheirSlotsSoThatBuiltApplicationsKeepWorking) {
    using ToWide = void (IUserException::*)(std::u16string&) const;
    using ToNarrow = void (IUserException::*)(std::string&) const;

    EXPECT_EQ(slotOf(&IException::clone), 0);
    EXPECT_EQ(slotOf(&IException::rethrow), 1);
    EXPECT_EQ(slotOf(&IException::what), 4); // after both destructors
    EXPECT_EQ(slotOf(static_cast<ToWide>(&IUserException::convert_str)), 5);
    EXPECT_EQ(slotOf(static_cast<ToNarrow>(&IUserException::convert_str)), 6);
    EXPECT_EQ(slotOf(&IUserException::ToUstringImpl), 7);
    EXPECT_EQ(slotOf(&IMsgIDException::GetID), 8);
    EXPECT_EQ(slotOf(&IMsgIDException::GetUnicodeMessageTxt), 9);
    EXPECT_EQ(slotOf(&IMsgIDException::GetBaseMsgIDObj), 10);
}

TEST(StackTraceRecordingException, hasTheStandardTextOfWhat) {
    StackTraceRecordingException const error(u"a text");

    EXPECT_STREQ(error.what(), std::exception().what());
    EXPECT_EQ(error.getText(), u"a text");
}

TEST(StackTraceRecordingException, recordsNothingByItself) {
    EXPECT_TRUE(StackTraceRecordingException().getStackTrace().getFrames().empty());
}

} // namespace
} // namespace foundation::core::except
