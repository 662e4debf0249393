#include "support/ErrorMatchers.hpp"

#include <stdexcept>

namespace project::test {
namespace {

using testing::HasSubstr;
using ZEPHRA::project::management::CanNotModifyReadOnlyLabel;
using ZEPHRA::project::management::FileNotInProject;
using ZEPHRA::project::management::FileNotInProjectRoot;

void raiseOutsideRoot() {
    exception::raise(FileNotInProjectRoot(u"/a", u"/root"));
}

void raiseNested() {
    try {
        throw std::out_of_range("no such key");
    } catch (std::out_of_range const&) {
        exception::raise(FileNotInProject(u"/a"));
    }
}

TEST(ErrorMatchers, acceptTheErrorWithItsArguments) {
    EXPECT_RAISES(FileNotInProjectRoot, (u"/a", std::u16string(u"/root")), raiseOutsideRoot());
    EXPECT_RAISES(FileNotInProjectRoot, (fl::filesystem::Path(u"/a"), u"/root"), raiseOutsideRoot());
    EXPECT_RAISES(CanNotModifyReadOnlyLabel, (), exception::raise(CanNotModifyReadOnlyLabel()));
    EXPECT_RAISES_NESTED(FileNotInProject, (u"/a"), std::out_of_range, raiseNested());
}

TEST(ErrorMatchers, describeACallThatDoesNotThrow) {
    auto const result = raises<FileNotInProject>(texts(u"/a"), [] {});

    EXPECT_FALSE(result);
    EXPECT_THAT(result.message(), HasSubstr("FileNotInProject(u\"/a\")"));
    EXPECT_THAT(result.message(), HasSubstr("nothing was thrown"));
}

TEST(ErrorMatchers, describeOtherArguments) {
    auto const result = raises<FileNotInProjectRoot>(texts(u"/root", u"/a"), raiseOutsideRoot);

    EXPECT_FALSE(result);
    EXPECT_THAT(result.message(), HasSubstr("FileNotInProjectRoot(u\"/root\", u\"/a\"),\nbut "));
    EXPECT_THAT(result.message(), HasSubstr("but FileNotInProjectRoot(u\"/a\", u\"/root\"): "));
}

TEST(ErrorMatchers, describeAnotherErrorWithItsOrigin) {
    auto const result = raises<FileNotInProject>(texts(u"/a"), raiseOutsideRoot);

    EXPECT_FALSE(result);
    EXPECT_THAT(result.message(), HasSubstr("raised at\n#0 "));
}

TEST(ErrorMatchers, describeAnExceptionThatIsNotAnErrorOfTheLibrary) {
    auto const exception = raises<FileNotInProject>(texts(u"/a"), [] { throw std::runtime_error("text"); });
    auto const number = raises<FileNotInProject>(texts(u"/a"), [] { throw 1; });

    EXPECT_FALSE(exception);
    EXPECT_FALSE(number);
    EXPECT_THAT(exception.message(), HasSubstr("a std::runtime_error: text was thrown"));
    EXPECT_THAT(number.message(), HasSubstr("not a std::exception"));
}

TEST(ErrorMatchers, distinguishNestedErrorsFromPlainOnes) {
    auto const plainExpected = raises<FileNotInProject>(texts(u"/a"), raiseNested);
    auto const nestedExpected =
        raisesNested<FileNotInProjectRoot, std::out_of_range>(texts(u"/a", u"/root"), raiseOutsideRoot);
    auto const otherCause = raisesNested<FileNotInProject, std::bad_alloc>(texts(u"/a"), raiseNested);

    EXPECT_FALSE(plainExpected);
    EXPECT_FALSE(nestedExpected);
    EXPECT_FALSE(otherCause);
    EXPECT_THAT(plainExpected.message(), HasSubstr("with a cause nested in it"));
}

} // namespace
} // namespace project::test
