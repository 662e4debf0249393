#pragma once

#include <cstddef>
#include <ctime>
#include <functional>
#include <limits>
#include <map>
#include <optional>
#include <string>
#include <string_view>

namespace project::test {

/// A call to the system, on its way there.
struct SystemCall {
    std::string_view name;
    std::string_view file; ///< the name of the file, where one is given
    int flags = 0;         ///< of open, openat, renameat2

    /// True if it changes the disk, or opens a file for writing.
    bool isChange() const;
};

/// Intercepts the system calls of this program while the object lives. The program must be linked with --wrap
/// for each call; calls of libraries are not intercepted.
class SystemCalls {
public:
    /// @return the error with which a call fails instead of being executed, or 0.
    using Answer = std::function<int(SystemCall const&)>;

    explicit SystemCalls(Answer answer = nullptr);
    ~SystemCalls();
    SystemCalls(SystemCalls const&) = delete;
    SystemCalls& operator=(SystemCalls const&) = delete;

    /// The number of calls of each name, including those that failed.
    std::map<std::string, std::size_t, std::less<>> counts;

    /// The most bytes that one write or read transfers.
    std::size_t mostBytes = std::numeric_limits<std::size_t>::max();

    /// When false, syncs are counted but not executed, to save time.
    bool syncs = false;

    /// When set, all clocks show this time.
    std::optional<timespec> time;

    /// @return true if the call fails, with errno set.
    bool fails(SystemCall const& call);

    /// The current object, or null.
    static SystemCalls* current();

private:
    Answer answer_;
};

} // namespace project::test
