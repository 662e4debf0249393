#include "foundation/core/diag/stacktrace_base.hpp"

#include <algorithm>
#include <cstdint>
#include <optional>
#include <sstream>
#include <type_traits>

#include <dlfcn.h>

#include "support/Allocations.hpp"

namespace foundation::core::diag {
namespace {

using Frame = stacktrace_base::Frame;

static_assert(sizeof(stacktrace_base) >= stacktrace_base::maximumFrames * sizeof(Frame),
              "the frames are held inside the object");
static_assert(std::is_nothrow_copy_constructible_v<stacktrace_base>, "copying a record cannot fail");

// An operation after a call keeps the caller's frame on the stack: without it the call would be a jump.
void keepFrame() {
    asm volatile("" ::: "memory");
}

[[gnu::noinline]] void captureHere(stacktrace_base& trace, unsigned long framesToSkip) {
    trace.capture(framesToSkip);
    keepFrame();
}

[[gnu::noinline]] void captureBelow(stacktrace_base& trace, unsigned long framesToSkip, int depth) {
    if (depth > 0) {
        captureBelow(trace, framesToSkip, depth - 1);
    } else {
        captureHere(trace, framesToSkip);
    }
    keepFrame();
}

stacktrace_base captured(unsigned long framesToSkip = 0, int depth = 0) {
    stacktrace_base trace;
    captureBelow(trace, framesToSkip, depth);
    return trace;
}

/// True if the frame is in a function as short as those above.
template <class Function>
bool isIn(Frame frame, Function* function) {
    auto const begin = reinterpret_cast<std::uintptr_t>(function);
    auto const address = reinterpret_cast<std::uintptr_t>(frame);
    return address > begin && address < begin + 400;
}

TEST(StackTrace, isEmptyBeforeACapture) {
    stacktrace_base const trace;

    EXPECT_TRUE(trace.getFrames().empty());
    EXPECT_EQ(trace.toString(), "");
}

TEST(StackTrace, beginsWithTheCallerOfCapture) {
    auto const frames = captured().getFrames();

    ASSERT_GE(frames.size(), 4u);
    EXPECT_TRUE(isIn(frames[0], captureHere));
    EXPECT_TRUE(isIn(frames[1], captureBelow));
}

TEST(StackTrace, leavesOutTheFramesToSkip) {
    std::vector<std::vector<Frame>> traces;

    for (unsigned long framesToSkip = 0; framesToSkip < 2; ++framesToSkip) {
        traces.push_back(captured(framesToSkip, 5).getFrames()); // one place, so that the frames are equal
    }

    EXPECT_EQ(traces[1], std::vector<Frame>(traces[0].begin() + 1, traces[0].end()));
    EXPECT_TRUE(captured(10000).getFrames().empty());
    EXPECT_TRUE(captured(~0UL).getFrames().empty());
}

TEST(StackTrace, keepsTheInnermostFramesOfADeepStack) {
    auto const frames = captured(0, 300).getFrames();

    ASSERT_EQ(frames.size(), stacktrace_base::maximumFrames);
    EXPECT_TRUE(isIn(frames.front(), captureHere));
    EXPECT_EQ(frames.back(), frames[2]) << "all but the first two are the recursion";
}

TEST(StackTrace, aSecondCaptureReplacesTheFirst) {
    auto trace = captured(0, 50);
    auto const before = trace.getFrames().size();

    captureHere(trace, 0);

    EXPECT_LT(trace.getFrames().size(), before);
}

TEST(StackTrace, aCopyKeepsTheFramesAfterTheOriginalIsDestroyed) {
    auto original = std::make_optional(captured());
    auto const frames = original->getFrames();

    stacktrace_base const copy(*original);
    stacktrace_base assigned = captured(0, 100);
    assigned = *original;
    original.reset();

    EXPECT_EQ(copy.getFrames(), frames);
    EXPECT_EQ(assigned.getFrames(), frames);
}

TEST(StackTrace, assigningItToItselfKeepsTheFrames) {
    auto trace = captured();
    auto const frames = trace.getFrames();

    auto const& same = trace;
    trace = same;

    EXPECT_EQ(trace.getFrames(), frames);
}

TEST(StackTrace, captureAllocatesNothing) {
    stacktrace_base trace;
    project::test::Allocations const allocations;

    captureBelow(trace, 0, 10);

    EXPECT_EQ(allocations.count(), 0U);
    EXPECT_FALSE(trace.getFrames().empty());
    EXPECT_GT(allocations.count(), 0U) << "the list of frames must have been counted";
}

TEST(StackTrace, namesFunctionsThatHaveADynamicSymbol) {
    EXPECT_THAT(captured().toString(), testing::HasSubstr("__libc_start_main in /"));
}

TEST(StackTrace, showsTheFileAndTheOffsetOfACallWithoutADynamicSymbol) {
    Dl_info program{};
    ASSERT_NE(dladdr(reinterpret_cast<void*>(&captureHere), &program), 0);

    std::istringstream text(captured().toString());
    std::string number;
    std::string name;
    std::string in;
    std::string place;
    text >> number >> name >> in >> place;

    auto const separator = place.rfind("+0x");
    ASSERT_NE(separator, std::string::npos) << text.str();
    EXPECT_EQ(number, "#0");
    EXPECT_EQ(place.substr(0, separator), program.dli_fname);
    auto const offset = std::stoul(place.substr(separator + 1), nullptr, 16);
    EXPECT_TRUE(isIn(static_cast<char const*>(program.dli_fbase) + offset, captureHere)) << text.str();
}

TEST(StackTrace, writesOneLineForEachFrame) {
    auto const trace = captured(0, 20);

    auto const text = trace.toString();

    EXPECT_EQ(static_cast<std::size_t>(std::count(text.begin(), text.end(), '\n')), trace.getFrames().size());
}

} // namespace
} // namespace foundation::core::diag
