#pragma once

#include <cstddef>
#include <string>
#include <vector>

#include "PlatformExport.hpp"

namespace foundation::core::diag {

/// A record of the call stack at one moment. The object contains the record, so that capture does not
/// allocate and works when memory is exhausted. Symbols are looked up only when the record is read. If the
/// call stack is deeper than the record, the innermost frames are recorded.
class PROJECT_PLATFORM_EXPORT stacktrace_base {
public:
    /// A return address, as the unwinder reports it.
    using Frame = void const*;

    /// The largest number of frames that are recorded.
    static constexpr std::size_t maximumFrames = 128;

    stacktrace_base() noexcept;

    /// Copies only the recorded frames.
    stacktrace_base(stacktrace_base const& other) noexcept;
    stacktrace_base& operator=(stacktrace_base const& other) noexcept;

    /// Replaces the record by the calling thread's stack. Does not allocate.
    /// @param framesToSkip the number of innermost frames to leave out; 0 begins with the caller.
    void capture(unsigned long framesToSkip) noexcept;

    /// Returns the recorded frames, the innermost first; empty before the first capture.
    std::vector<Frame> getFrames() const;

    /// Returns the frames for a log or a debugger, the innermost first, one in each line: its number, the
    /// function if it has a dynamic symbol, and the file with the offset that addr2line expects. Looks up
    /// symbols at each call, which takes milliseconds.
    std::string toString() const;

private:
    std::size_t capacity_ = maximumFrames;
    Frame* firstFree_;
    Frame frames_[maximumFrames]; // a plain array, because its address is taken before it is filled
};

} // namespace foundation::core::diag
