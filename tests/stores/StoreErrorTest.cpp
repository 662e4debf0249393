#include "project/stores/StoreError.hpp"

#include <type_traits>

#include "project/metadata/ProjectException.hpp"

namespace project::stores {
namespace {

// Managers drop some of the library's own errors as stale data; a failing disk must never be treated as that.
static_assert(!std::is_base_of_v<exception::ProjectException, StoreError>);

TEST(StoreError, namesTheFileTheLineTheProblemAndTheRemedy) {
    StoreError const error(StoreError::Kind::DiskFailed, "/p/project.jsonl", 12, "the line is damaged",
                           "Restore it from source control.");

    EXPECT_STREQ(error.what(), "/p/project.jsonl:12: the line is damaged. Restore it from source control.");
    EXPECT_EQ(error.kind(), StoreError::Kind::DiskFailed);
    EXPECT_EQ(error.file(), "/p/project.jsonl");
    EXPECT_EQ(error.line(), 12u);
    EXPECT_EQ(error.problem(), "the line is damaged");
    EXPECT_EQ(error.remedy(), "Restore it from source control.");
}

TEST(StoreError, omitsMissingParts) {
    EXPECT_STREQ(StoreError(StoreError::Kind::DiskFailed, "/p", 0, "no permission", "Ask the owner.").what(),
                 "/p: no permission. Ask the owner.");
    EXPECT_STREQ(StoreError(StoreError::Kind::DiskFailed, "", 0, "the disk is full", "").what(),
                 "the disk is full.");
    EXPECT_STREQ(StoreError(StoreError::Kind::DiskFailed, "", 5, "the disk is full", "").what(),
                 "the disk is full.");
}

TEST(StoreError, recordsItsOriginAndACopyKeepsIt) {
    StoreError const error(StoreError::Kind::DiskFailed, "/p", 0, "no permission", "");
    StoreError const copy(error);

    EXPECT_FALSE(error.getStackTrace().getFrames().empty());
    EXPECT_EQ(copy.getStackTrace().getFrames(), error.getStackTrace().getFrames());
    EXPECT_STREQ(copy.what(), error.what());
}

TEST(StoreError, isCaughtAsAStandardExceptionButNotAsAnErrorOfTheProject) {
    EXPECT_THROW(throw StoreError(StoreError::Kind::DiskFailed, "", 0, "x", ""), std::exception);
    EXPECT_THROW(
        {
            try {
                throw StoreError(StoreError::Kind::DiskFailed, "", 0, "x", "");
            } catch (exception::ProjectException const&) {
                FAIL() << "it was treated as stale data";
            }
        },
        StoreError);
}

} // namespace
} // namespace project::stores
