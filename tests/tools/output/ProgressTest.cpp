#include "output/Progress.hpp"

#include <array>
#include <csignal>
#include <cstddef>
#include <filesystem>
#include <iterator>

#include <fcntl.h>
#include <poll.h>
#include <pty.h>
#include <unistd.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace projectctl {
namespace {

using std::chrono::milliseconds;
using ::testing::EndsWith;
using ::testing::HasSubstr;

/// A pseudo terminal, and the output that was written to it.
class Terminal {
public:
    Terminal() { EXPECT_EQ(openpty(&shown_, &written_, nullptr, nullptr, nullptr), 0); }

    ~Terminal() {
        close(shown_);
        close(written_);
    }

    Terminal(Terminal const&) = delete;
    Terminal& operator=(Terminal const&) = delete;

    int descriptor() const { return written_; }

    /// The output so far, after it contains the text, or after a pause.
    std::string read(milliseconds patience, std::string const& until = {}) {
        pollfd waiting{shown_, POLLIN, 0};
        while ((until.empty() || all_.find(until) == std::string::npos) &&
               poll(&waiting, 1, static_cast<int>(patience.count())) > 0) {
            std::array<char, 4096> piece{};
            auto const got = ::read(shown_, piece.data(), piece.size());
            all_.append(piece.data(), got > 0 ? static_cast<std::size_t>(got) : 0);
        }
        return all_;
    }

private:
    int shown_ = -1;
    int written_ = -1;
    std::string all_;
};

constexpr Progress::Timing atOnce{milliseconds(0), milliseconds(5)};
constexpr milliseconds longEnough(10'000);

TEST(Progress, showsTheWorkAndItsCountAndIsDeletedAtTheEnd) {
    Terminal terminal;
    {
        Progress progress("Reading folders", terminal.descriptor(), atOnce);
        progress.reach(1'234'567);
        EXPECT_THAT(terminal.read(longEnough, "567"), HasSubstr("Reading folders: 1,234,567"));
    }
    EXPECT_THAT(terminal.read(milliseconds(50)), EndsWith("\r\033[K"));
}

TEST(Progress, showsTheNextTask) {
    Terminal terminal;
    Progress progress("Reading folders", terminal.descriptor(), atOnce);
    progress.reach(3);

    progress.begin(projectctl::Message("ProgressAdd", 3));

    EXPECT_THAT(terminal.read(longEnough, "Adding 3 files and folders ..."),
                EndsWith("Adding 3 files and folders ..."));
}

TEST(Progress, writesNothingForShortWork) {
    Terminal terminal;
    {
        Progress progress("Reading folders", terminal.descriptor(), Progress::Timing());
        progress.reach(5);
    }
    EXPECT_EQ(terminal.read(milliseconds(50)), "");
}

TEST(Progress, waitsASecondByDefault) {
    EXPECT_EQ(Progress::Timing().patience, std::chrono::seconds(1));
}

/// The number of threads of this process.
std::ptrdiff_t threads() {
    return std::distance(std::filesystem::directory_iterator("/proc/self/task"), {});
}

TEST(Progress, writesNothingToAPipe) {
    auto const before = threads();
    std::array<int, 2> ends{};
    ASSERT_EQ(pipe2(ends.data(), O_NONBLOCK), 0);
    {
        Progress progress("Reading folders", ends[1], atOnce);
        progress.reach(5);
        EXPECT_EQ(threads(), before); // there is no thread that could draw later
    }
    char byte = 0;

    EXPECT_EQ(read(ends[0], &byte, 1), -1);

    close(ends[0]);
    close(ends[1]);
}

TEST(Progress, doesNotReceiveSignalsThatTheMainThreadBlocks) {
    Terminal terminal;
    sigset_t interrupt;
    sigemptyset(&interrupt);
    sigaddset(&interrupt, SIGINT);
    pthread_sigmask(SIG_BLOCK, &interrupt, nullptr);
    {
        Progress progress("Reading folders", terminal.descriptor(), atOnce);
        terminal.read(longEnough, "Reading");
        kill(getpid(), SIGINT); // ends the test, if the thread takes it
        sigset_t pending;
        sigpending(&pending);
        EXPECT_EQ(sigismember(&pending, SIGINT), 1);
    }
    timespec const none{0, 0};
    sigtimedwait(&interrupt, nullptr, &none);
    pthread_sigmask(SIG_UNBLOCK, &interrupt, nullptr);
}

} // namespace
} // namespace projectctl
