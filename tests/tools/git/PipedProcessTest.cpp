#include "git/PipedProcess.hpp"

#include <csignal>
#include <system_error>

#include <gtest/gtest.h>

namespace projectctl {
namespace {

TEST(PipedProcess, returnsOutputErrorsAndExitCode) {
    auto const result = runWithInput({"sh", "-c", "cat; echo bad >&2; exit 3"}, "in");

    EXPECT_EQ(result.output, "in");
    EXPECT_EQ(result.errors, "bad\n");
    EXPECT_EQ(result.exitCode, 3);
}

TEST(PipedProcess, writesAndReadsAtTheSameTime) {
    std::string const much(std::size_t(20) * 1024 * 1024, 'x'); // far more than the pipes hold

    EXPECT_EQ(runWithInput({"cat"}, much).output, much);
}

TEST(PipedProcess, readsErrorsWhileItWrites) {
    std::string const much(std::size_t(2) * 1024 * 1024, 'x');

    auto const result = runWithInput({"sh", "-c", "cat >&2; echo done"}, much);

    EXPECT_EQ(result.errors, much);
    EXPECT_EQ(result.output, "done\n");
}

TEST(PipedProcess, acceptsAProgramThatReadsNothing) {
    std::signal(SIGPIPE, SIG_IGN); // as in the tool
    std::string const much(std::size_t(2) * 1024 * 1024, 'x');

    EXPECT_EQ(runWithInput({"true"}, much).exitCode, 0);
}

TEST(PipedProcess, passesArgumentsWithoutAShell) {
    EXPECT_EQ(runWithInput({"printf", "%s|", "a b", "$HOME", "'"}, "").output, "a b|$HOME|'|");
}

TEST(PipedProcess, startsTheChildWithDefaultSignalHandling) {
    std::signal(SIGPIPE, SIG_IGN);

    EXPECT_EQ(runWithInput({"sh", "-c", "kill -PIPE $$; echo survived"}, "").exitCode, -1);
}

TEST(PipedProcess, reportsAMissingProgram) {
    try {
        runWithInput({"/nonexistent/program"}, "");
        FAIL() << "nothing was thrown";
    } catch (std::system_error const& error) {
        EXPECT_EQ(error.code(), std::errc::no_such_file_or_directory);
    }
}

} // namespace
} // namespace projectctl
