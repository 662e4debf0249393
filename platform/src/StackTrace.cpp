#include "foundation/core/diag/stacktrace_base.hpp"

#include <algorithm>
#include <cstdint>
#include <sstream>

#include <boost/stacktrace/frame.hpp>
#include <dlfcn.h>
#include <unwind.h>

namespace foundation::core::diag {

namespace {

using Frame = stacktrace_base::Frame;

struct Recording {
    unsigned long framesToSkip;
    Frame* firstFree;
    Frame* end;
};

_Unwind_Reason_Code recordFrame(_Unwind_Context* context, void* argument) {
    auto& recording = *static_cast<Recording*>(argument);
    if (recording.framesToSkip > 0) {
        --recording.framesToSkip;
        return _URC_NO_REASON;
    }
    auto const address = static_cast<std::uintptr_t>(_Unwind_GetIP(context));
    if (address == 0 || recording.firstFree == recording.end) {
        return _URC_END_OF_STACK;
    }
    // The unwinder reports addresses as numbers.
    *recording.firstFree++ = reinterpret_cast<Frame>(address); // NOLINT(performance-no-int-to-ptr)
    return _URC_NO_REASON;
}

void describe(std::ostream& out, Frame frame) {
    // A frame is a return address. After a call that never returns, another function may begin there.
    auto const call = static_cast<char const*>(frame) - 1;
    std::string const name = boost::stacktrace::frame(call).name();
    out << (name.empty() ? "?" : name);
    Dl_info image{};
    if (dladdr(call, &image) != 0 && image.dli_fname != nullptr) {
        auto const offset = call - static_cast<char const*>(image.dli_fbase);
        out << " in " << image.dli_fname << "+0x" << std::hex << offset << std::dec;
    } else {
        out << " at " << static_cast<void const*>(call);
    }
}

} // namespace

stacktrace_base::stacktrace_base() noexcept : firstFree_(frames_) {
}

stacktrace_base::stacktrace_base(stacktrace_base const& other) noexcept : stacktrace_base() {
    firstFree_ = std::copy(other.frames_, static_cast<Frame const*>(other.firstFree_), frames_);
}

stacktrace_base& stacktrace_base::operator=(stacktrace_base const& other) noexcept {
    if (this != &other) {
        firstFree_ = std::copy(other.frames_, static_cast<Frame const*>(other.firstFree_), frames_);
    }
    return *this;
}

// Never inlined: the innermost frame that the unwinder sees is this function's own, which is left out.
[[gnu::noinline]] void stacktrace_base::capture(unsigned long framesToSkip) noexcept {
    unsigned long const withThisFrame =
        std::max(framesToSkip, framesToSkip + 1); // the largest number does not overflow
    Recording recording{withThisFrame, frames_, frames_ + capacity_};
    _Unwind_Backtrace(recordFrame, &recording);
    firstFree_ = recording.firstFree;
}

std::vector<Frame> stacktrace_base::getFrames() const {
    return std::vector<Frame>(frames_,
                              static_cast<Frame const*>(firstFree_)); // braces would make a list of two
}

std::string stacktrace_base::toString() const {
    std::ostringstream out;
    std::vector<Frame> const frames = getFrames();
    for (std::size_t i = 0; i < frames.size(); ++i) {
        out << '#' << i << ' ';
        describe(out, frames[i]);
        out << '\n';
    }
    return out.str();
}

} // namespace foundation::core::diag
