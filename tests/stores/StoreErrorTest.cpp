#include "project/stores/StoreError.hpp"

#include <cerrno>
#include <type_traits>

#include "disk/SystemError.hpp"
#include "project/metadata/ProjectException.hpp"
#include "support/GlobalLocale.hpp"
#include "text/ProjectText.hpp"

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

/// The error of a full disk.
std::string fullDisk() {
    try {
        throwSystemError("/p/project.jsonl", "CannotWrite", ENOSPC);
    } catch (StoreError const& error) {
        return error.what();
    }
}

TEST(StoreError, isEnglishUntilALanguageIsChosen) {
    EXPECT_EQ(fullDisk(), "/p/project.jsonl: cannot be written: No space left on device. "
                          "Make room on the disk and try again.");
}

TEST(StoreError, isInTheLanguageOfTheProcess) {
    test::GlobalLocale const language("de_DE");

    EXPECT_EQ(fullDisk(), "/p/project.jsonl: kann nicht geschrieben werden: No space left on device. "
                          "Schaffen Sie Platz auf der Festplatte, und versuchen Sie es noch einmal.");
}

TEST(Fault, isInTheLanguageOfTheProcess) {
    std::string text = ProjectText::empty().body();
    text.insert(text.find('\n') + 1, "nonsense\n");
    test::GlobalLocale const language("de_DE");

    auto const read = ProjectText::read(text, "project.jsonl");

    ASSERT_TRUE(read);
    ASSERT_EQ(read->faults().size(), 1u);
    EXPECT_EQ(read->faults()[0].problem, "die Zeile ist kein gültiges JSON");
}

} // namespace
} // namespace project::stores
