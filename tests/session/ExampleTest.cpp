#include <gtest/gtest.h>

#include "support/RunningProgram.hpp"
#include "support/TemporaryFolder.hpp"

namespace project::session {
namespace {

TEST(Example, createsAProjectAndReportsItsChanges) {
    test::TemporaryFolder const folder;

    auto const result = test::runProgram({EXAMPLE, folder.onDisk().string()}, {});

    EXPECT_EQ(result.exitCode, 0) << result.errors;
    EXPECT_EQ(result.output, "files changed\nlabels changed\nstarts with \"main.cpp\"\n");
}

} // namespace
} // namespace project::session
