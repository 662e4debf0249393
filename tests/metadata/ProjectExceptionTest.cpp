#include "project/metadata/ProjectException.hpp"

#include <stdexcept>
#include <thread>

#include "fl/i18n/MessageCatalog.hpp"
#include "fl/i18n/Utf8.hpp"
#include "foundation/core/except/IMsgIDException.hpp"
#include "project/metadata/Messages.hpp"

namespace project::exception {
namespace {

using foundation::core::except::IException;
using foundation::core::except::IMsgIDException;
using ZEPHRA::project::management::CanNotModifyReadOnlyLabel;
using ZEPHRA::project::management::EntryPointTypeUndefined;
using ZEPHRA::project::management::FileNotInProject;
using ZEPHRA::project::management::LabelExistsByName;
using NestedTypeError = std::_Nested_exception<Raised<EntryPointTypeUndefined>>;

void raisePlain() {
    raise(FileNotInProject(u"/a/file"));
}

/// Raises an error of the catalog after a failed lookup.
void raiseNested() {
    try {
        throw std::out_of_range("no such key");
    } catch (std::out_of_range const&) {
        raise(EntryPointTypeUndefined(u"Unknown"));
    }
}

TEST(ProjectException, catchesEveryErrorPlainAndNested) {
    EXPECT_THROW(raisePlain(), ProjectException);
    EXPECT_THROW(raiseNested(), ProjectException);
    EXPECT_THROW(raisePlain(), std::exception);
    EXPECT_THROW(raiseNested(), std::exception);
    EXPECT_THROW(raisePlain(), IException);
    EXPECT_THROW(raiseNested(), IException);
}

TEST(ProjectException, addsNothingToItsBase) {
    EXPECT_EQ(sizeof(ProjectException), sizeof(computils::exception::StackTraceRecordingException));
}

TEST(Raise, throwsThePlainErrorOutsideACatchBlock) {
    try {
        raisePlain();
        FAIL() << "nothing was thrown";
    } catch (ProjectException const& error) {
        EXPECT_EQ(typeid(error), typeid(Raised<FileNotInProject>));
        EXPECT_EQ(error.getText(), u"");
    }
}

TEST(Raise, nestsTheCurrentException) {
    try {
        raiseNested();
        FAIL() << "nothing was thrown";
    } catch (Raised<EntryPointTypeUndefined> const& error) {
        EXPECT_EQ(typeid(error), typeid(NestedTypeError));
        EXPECT_THROW(std::rethrow_if_nested(error), std::out_of_range);
    }
}

/// Raises an error in a catch block for another error of the library.
void raiseWithinHandler() {
    try {
        raisePlain();
    } catch (ProjectException const&) {
        raise(CanNotModifyReadOnlyLabel());
    }
}

TEST(Raise, nestsOneErrorOfTheLibraryInAnother) {
    try {
        raiseWithinHandler();
        FAIL() << "nothing was thrown";
    } catch (Raised<CanNotModifyReadOnlyLabel> const& error) {
        EXPECT_THROW(std::rethrow_if_nested(error), Raised<FileNotInProject>);
    }
}

TEST(Raise, isPlainAgainAfterTheCatchBlock) {
    EXPECT_THROW(raiseNested(), NestedTypeError);

    EXPECT_THROW(
        {
            try {
                raisePlain();
            } catch (std::nested_exception const&) {
                FAIL() << "the handler was left before";
            }
        },
        Raised<FileNotInProject>);
}

TEST(Raise, isPlainOnAThreadOtherThanThatOfTheCatchBlock) {
    std::exception_ptr raised;
    try {
        throw std::out_of_range("on this thread");
    } catch (std::out_of_range const&) {
        std::thread([&raised] {
            try {
                raisePlain();
            } catch (...) {
                raised = std::current_exception();
            }
        }).join();
    }

    ASSERT_TRUE(raised);
    try {
        std::rethrow_exception(raised);
    } catch (ProjectException const& error) {
        EXPECT_EQ(dynamic_cast<std::nested_exception const*>(&error), nullptr);
    }
}

TEST(Raise, returnsTheMessagesTextThroughEveryBase) {
    auto const text = fl::i18n::MessageCatalog::get_message(FileNotInProject(u"/a/file"));
    auto const utf8 = fl::i18n::toUtf8(text);
    ASSERT_THAT(utf8, testing::HasSubstr("/a/file"));

    try {
        raisePlain();
        FAIL() << "nothing was thrown";
    } catch (Raised<FileNotInProject> const& error) {
        EXPECT_EQ(error.GetUnicodeMessageTxt(), text);
        EXPECT_EQ(static_cast<std::exception const&>(error).what(), utf8);
        EXPECT_EQ(static_cast<IException const&>(error).what(), utf8);
    }
}

TEST(Raise, whatOfANestedErrorIsTheMessagesTextToo) {
    try {
        raiseNested();
        FAIL() << "nothing was thrown";
    } catch (std::exception const& error) {
        EXPECT_THAT(error.what(), testing::HasSubstr("\"Unknown\""));
    }
}

TEST(Raise, hasTheMessageAndItsId) {
    try {
        raise(LabelExistsByName(u"a category", u"a label"));
        FAIL() << "nothing was thrown";
    } catch (IMsgIDException const& error) {
        EXPECT_EQ(error.GetID(), "ZEPHRA:project:management:LabelExistsByName");
        EXPECT_THAT(error.GetBaseMsgIDObj().getArguments(),
                    testing::ElementsAre(std::u16string(u"a category"), std::u16string(u"a label")));
    }
}

TEST(Raise, recordsTheStackOfTheThrow) {
    std::vector<void const*> first;
    std::vector<void const*> second;
    try {
        raisePlain();
        FAIL() << "nothing was thrown";
    } catch (ProjectException const& error) {
        first = error.getStackTrace().getFrames();
    }
    try {
        raisePlain();
        FAIL() << "nothing was thrown";
    } catch (ProjectException const& error) {
        second = error.getStackTrace().getFrames();
    }

    ASSERT_GT(first.size(), 2u);
    EXPECT_EQ(first.size(), second.size());
    EXPECT_NE(first, second) << "two lines of this test raised it";
}

TEST(Raise, aCloneKeepsTheStackAndTheArguments) {
    try {
        raisePlain();
        FAIL() << "nothing was thrown";
    } catch (Raised<FileNotInProject> const& error) {
        std::unique_ptr<Raised<FileNotInProject>> const clone(error.clone());

        EXPECT_FALSE(error.getStackTrace().getFrames().empty());
        EXPECT_EQ(clone->getStackTrace().getFrames(), error.getStackTrace().getFrames());
        EXPECT_EQ(clone->GetBaseMsgIDObj().getArguments(), error.GetBaseMsgIDObj().getArguments());
    }
}

TEST(Raise, aCloneOfANestedErrorIsThePlainFormWithTheSameStack) {
    try {
        raiseNested();
        FAIL() << "nothing was thrown";
    } catch (Raised<EntryPointTypeUndefined> const& error) {
        std::unique_ptr<Raised<EntryPointTypeUndefined>> const clone(error.clone());

        auto const& copy = *clone;
        EXPECT_EQ(typeid(copy), typeid(Raised<EntryPointTypeUndefined>));
        EXPECT_EQ(copy.getStackTrace().getFrames(), error.getStackTrace().getFrames());
        EXPECT_STREQ(copy.what(), error.what());
    }
}

TEST(Raise, rethrowingAnErrorKeepsTheStackOfTheFirstThrow) {
    std::vector<void const*> first;
    std::unique_ptr<IException const> kept;
    try {
        raiseNested();
        FAIL() << "nothing was thrown";
    } catch (Raised<EntryPointTypeUndefined> const& error) {
        first = error.getStackTrace().getFrames();
        kept.reset(error.clone());
    }
    ASSERT_NE(kept, nullptr);

    try {
        kept->rethrow();
        FAIL() << "nothing was thrown";
    } catch (Raised<EntryPointTypeUndefined> const& error) {
        EXPECT_EQ(error.getStackTrace().getFrames(), first);
        EXPECT_EQ(dynamic_cast<std::nested_exception const*>(&error), nullptr);
    }
}

} // namespace
} // namespace project::exception
