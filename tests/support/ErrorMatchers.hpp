#pragma once

#include <exception>
#include <sstream>
#include <string>
#include <type_traits>
#include <variant>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "computils/exception/StackTraceRecordingException.hpp"
#include "fl/filesystem/Path.hpp"
#include "fl/i18n/Utf8.hpp"
#include "foundation/core/except/IMsgIDException.hpp"
#include "project/metadata/Messages.hpp"
#include "project/metadata/ProjectException.hpp"

/// Expects that a call throws an error of the catalog with these arguments, without a nested exception:
///
///     EXPECT_RAISES(FileNotInProjectRoot, (path, root), files.add({path}));
///     EXPECT_RAISES(CanNotModifyReadOnlyLabel, (), labels.deleteLabel(label));
///
/// Arguments are paths or UTF-16 text. A failure shows the actual outcome with its call stack. A further
/// message can be appended with <<.
#define EXPECT_RAISES(Message, arguments, ...)                                                               \
    EXPECT_TRUE(::project::test::raises<::ZEPHRA::project::management::Message>(                             \
        ::project::test::texts arguments, [&] { static_cast<void>(__VA_ARGS__); }))

/// The same for an error with a nested exception, which must be of class Cause:
///
///     EXPECT_RAISES_NESTED(EntryPointTypeUndefined, (u"Other"), std::out_of_range, getFromName(u"Other"));
#define EXPECT_RAISES_NESTED(Message, arguments, Cause, ...)                                                 \
    EXPECT_TRUE((::project::test::raisesNested<::ZEPHRA::project::management::Message, Cause>(               \
        ::project::test::texts arguments, [&] { static_cast<void>(__VA_ARGS__); })))

namespace project::test {

inline std::u16string toText(fl::filesystem::Path const& path) {
    return path.native();
}

inline std::u16string toText(std::u16string const& text) {
    return text;
}

inline std::u16string toText(char16_t const* text) {
    return text;
}

/// The arguments that a test expects.
template <class... Arguments>
std::vector<std::u16string> texts(Arguments const&... arguments) {
    return {toText(arguments)...};
}

/// The form of an argument in a failure: in quotes, and with the name of its type if that is not UTF-16 text,
/// which never equals the expected text.
inline std::string describe(resource_core::BaseMsgID::Argument const& argument) {
    if (auto const* text = std::get_if<std::u16string>(&argument)) {
        return ::testing::PrintToString(*text);
    }
    if (auto const* narrow = std::get_if<std::string>(&argument)) {
        return "narrow string " + ::testing::PrintToString(*narrow);
    }
    return "long " + std::to_string(std::get<long>(argument));
}

inline std::string describe(std::string const& name,
                            std::vector<resource_core::BaseMsgID::Argument> const& arguments) {
    std::string text = name + "(";
    for (auto const& argument : arguments) {
        text += (&argument == arguments.data() ? "" : ", ") + describe(argument);
    }
    return text + ")";
}

inline std::string describe(std::exception const& error) {
    std::ostringstream out;
    if (auto const* message = dynamic_cast<foundation::core::except::IMsgIDException const*>(&error)) {
        auto const& identity = message->GetBaseMsgIDObj();
        out << describe(identity.getMessageName(), identity.getArguments());
    } else {
        out << "a " << ::testing::internal::GetTypeName(typeid(error));
    }
    if (auto const* nested = dynamic_cast<std::nested_exception const*>(&error)) {
        out << (nested->nested_ptr() ? ", with a cause nested in it" : ", nested");
    }
    out << ": " << error.what();
    if (auto const* recorded =
            dynamic_cast<computils::exception::StackTraceRecordingException const*>(&error)) {
        out << "\nraised at\n" << recorded->getStackTrace().toString();
    }
    return out.str();
}

/// The outcome of a call. The error is null if the call returned.
struct Outcome {
    std::exception_ptr error;
    std::string description = "nothing was thrown";
};

template <class Call>
Outcome outcomeOf(Call const& call) {
    try {
        call();
        return {};
    } catch (std::exception const& error) {
        return {std::current_exception(), describe(error) + " was thrown"};
    } catch (...) {
        return {std::current_exception(), "an exception that is not a std::exception was thrown"};
    }
}

/// True if the exception nested in an error is of this class.
template <class Cause>
bool isCausedBy(std::nested_exception const& error) {
    if (!error.nested_ptr()) {
        return false;
    }
    try {
        error.rethrow_nested();
    } catch (Cause const&) {
        return true;
    } catch (...) {
        return false;
    }
}

/// Compares the outcome of a call with the expected error.
/// @param hasRightCause returns whether the exception nested in the error is the expected one.
template <class Message, class CausePredicate>
::testing::AssertionResult judge(Outcome const& outcome, std::vector<std::u16string> const& expected,
                                 std::string const& nesting, CausePredicate const& hasRightCause) {
    std::vector<resource_core::BaseMsgID::Argument> const arguments(expected.begin(), expected.end());
    if (outcome.error) {
        try {
            std::rethrow_exception(outcome.error);
        } catch (exception::Raised<Message> const& error) {
            if (error.GetBaseMsgIDObj().getArguments() == arguments && hasRightCause(error)) {
                return ::testing::AssertionSuccess();
            }
        } catch (...) {
            // described below
        }
    }
    auto const name = ::testing::internal::GetTypeName<Message>();
    return ::testing::AssertionFailure()
           << "expected " << describe(name, arguments) << nesting << ",\nbut " << outcome.description;
}

template <class Message, class Call>
::testing::AssertionResult raises(std::vector<std::u16string> const& arguments, Call const& call) {
    return judge<Message>(outcomeOf(call), arguments, "", [](std::exception const& error) {
        return dynamic_cast<std::nested_exception const*>(&error) == nullptr;
    });
}

template <class Message, class Cause, class Call>
::testing::AssertionResult raisesNested(std::vector<std::u16string> const& arguments, Call const& call) {
    auto const nesting = " with a " + ::testing::internal::GetTypeName<Cause>() + " nested in it";
    return judge<Message>(outcomeOf(call), arguments, nesting, [](std::exception const& error) {
        auto const* nested = dynamic_cast<std::nested_exception const*>(&error);
        return nested != nullptr && isCausedBy<Cause>(*nested);
    });
}

} // namespace project::test
