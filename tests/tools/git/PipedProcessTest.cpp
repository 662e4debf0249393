#include "git/PipedProcess.hpp"

#include <cerrno>
#include <csignal>
#include <system_error>

#include <sys/resource.h>
#include <sys/time.h>

#include <gtest/gtest.h>

#include "texts/Message.hpp"

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

/// Allows this process to open no further file, as long as it exists.
class NoFurtherFiles {
public:
    NoFurtherFiles() {
        getrlimit(RLIMIT_NOFILE, &before_);
        auto const limited = rlimit{.rlim_cur = 0, .rlim_max = before_.rlim_max};
        setrlimit(RLIMIT_NOFILE, &limited);
    }

    ~NoFurtherFiles() { setrlimit(RLIMIT_NOFILE, &before_); }

    NoFurtherFiles(NoFurtherFiles const&) = delete;
    NoFurtherFiles& operator=(NoFurtherFiles const&) = delete;

private:
    rlimit before_{};
};

TEST(PipedProcess, reportsThatThereAreTooManyOpenFiles) {
    // Clang's sanitizer opens a pipe when it checks a type for the first time, here those of the error and of
    // its text.
    ASSERT_FALSE(std::error_code(EMFILE, std::generic_category()).message().empty());
    ASSERT_FALSE(Message("PipeNotCreated").text().empty());
    std::error_code code;
    try {
        NoFurtherFiles const limit;
        runWithInput({"true"}, "");
    } catch (std::system_error const& error) { // the limit is lifted by now
        code = error.code();
    }

    EXPECT_EQ(code, std::errc::too_many_files_open);
}

/// Interrupts the system calls of this process every few milliseconds.
class Interruptions {
public:
    Interruptions() {
        struct sigaction action {};

        action.sa_handler = [](int) { count = count + 1; }; // without SA_RESTART
        sigaction(SIGALRM, &action, &before_);
        repeat({.tv_sec = 0, .tv_usec = 5'000});
    }

    ~Interruptions() {
        repeat({});
        sigaction(SIGALRM, &before_, nullptr);
    }

    Interruptions(Interruptions const&) = delete;
    Interruptions& operator=(Interruptions const&) = delete;

    static inline volatile std::sig_atomic_t count = 0;

private:
    static void repeat(timeval interval) {
        itimerval const timer{.it_interval = interval, .it_value = interval};
        setitimer(ITIMER_REAL, &timer, nullptr);
    }

    struct sigaction before_ {};
};

TEST(PipedProcess, continuesAfterASignal) {
    ProcessResult result{};
    {
        Interruptions const interruptions;
        result = runWithInput({"sh", "-c", "sleep 0.1; cat; exec >&- 2>&-; sleep 0.1; exit 3"}, "in");
    }

    EXPECT_GT(Interruptions::count, 2);
    EXPECT_EQ(result.output, "in");
    EXPECT_EQ(result.exitCode, 3);
}

} // namespace
} // namespace projectctl
