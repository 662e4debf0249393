#pragma once

#include <cstddef>
#include <string>
#include <vector>

#include "PlatformExport.hpp"

namespace foundation::core::diag {

/// A record of the call stack at one moment, held inside the object: capturing allocates nothing, so that it
/// works while an error is raised for want of memory. Symbols are looked up only when somebody reads the
/// record. A call stack deeper than the record keeps its innermost frames.
class PROJECT_PLATFORM_EXPORT stacktrace_base {
public:
    /// A code address to return to, as the unwinder gives it.
    using Frame = void const*;

    static constexpr std::size_t maximumFrames = 128;

    stacktrace_base() noexcept;

    /// Copies only the frames in use.
    stacktrace_base(stacktrace_base const& other) noexcept;
    stacktrace_base& operator=(stacktrace_base const& other) noexcept;

    /// Records the calling thread's stack in place of what was recorded before. Allocates nothing.
    /// @param framesToSkip how many of the innermost frames to leave out; 0 begins with the caller.
    void capture(unsigned long framesToSkip) noexcept;

    /// The recorded frames, the innermost first; empty when nothing was captured.
    std::vector<Frame> getFrames() const;

    /// The frames for a log or a debugger, the innermost first, one a line: its number, the function as far
    /// as the dynamic symbols tell it, and the file with the offset that addr2line takes. Looks symbols up
    /// anew at each call: milliseconds.
    std::string toString() const;

private:
    std::size_t capacity_ = maximumFrames;
    Frame* firstFree_;
    Frame frames_[maximumFrames]; // a plain array, since its address is taken before it is filled
};

} // namespace foundation::core::diag
