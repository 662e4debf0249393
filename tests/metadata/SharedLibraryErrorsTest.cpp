#include <stdexcept>

#include "foundation/core/except/IMsgIDException.hpp"
#include "metadata/RaisingLibrary.hpp"
#include "project/metadata/Messages.hpp"
#include "project/metadata/ProjectException.hpp"

namespace project::exception {
namespace {

using foundation::core::except::IException;
using ZEPHRA::project::management::FileNotInProject;
using Plain = Raised<FileNotInProject>;

TEST(SharedLibraryErrors, areCaughtByEveryTypeOnTheOtherSide) {
    EXPECT_THROW(test::raisePlain(), Plain);
    EXPECT_THROW(test::raisePlain(), ProjectException);
    EXPECT_THROW(test::raisePlain(), computils::exception::StackTraceRecordingException);
    EXPECT_THROW(test::raisePlain(), IException);
    EXPECT_THROW(test::raisePlain(), std::exception);
    EXPECT_THROW(test::raiseNested(), Plain);
    EXPECT_THROW(test::raiseNested(), std::nested_exception);
}

// A comparison by name would find them equal too; the same address shows that neither is hidden from the
// other.
TEST(SharedLibraryErrors, haveTheirTypeInformationOnceInTheProcess) {
    EXPECT_EQ(&test::plainType(), &typeid(Plain));
    EXPECT_EQ(&test::nestedType(), &typeid(std::_Nested_exception<Plain>));
    EXPECT_EQ(test::plainType().name(), typeid(Plain).name());
}

TEST(SharedLibraryErrors, keepTheirTextAndTheirStackAcrossLibraries) {
    try {
        test::raisePlain();
        FAIL() << "nothing was thrown";
    } catch (ProjectException const& error) {
        EXPECT_THAT(error.what(), testing::HasSubstr("\"/a/file\" is not in the project"));
        EXPECT_THAT(error.getStackTrace().toString(), testing::HasSubstr("project::test::raisePlain()"));
    }
}

TEST(SharedLibraryErrors, nestedCausesCanBeReadOnTheOtherSide) {
    try {
        test::raiseNested();
        FAIL() << "nothing was thrown";
    } catch (ProjectException const& error) {
        EXPECT_THROW(std::rethrow_if_nested(error), std::out_of_range);
    }
}

} // namespace
} // namespace project::exception
