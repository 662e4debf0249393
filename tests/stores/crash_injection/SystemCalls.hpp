#pragma once

#include <cstddef>
#include <functional>
#include <limits>
#include <map>
#include <string>
#include <string_view>

namespace project::test {

/// A call to the system, on its way there.
struct SystemCall {
    std::string_view name;
    std::string_view file; ///< the name of the file, where one is given
    int flags = 0;         ///< of open, openat, renameat2

    /// True when it changes something on disk, or opens a file to do so.
    bool isChange() const;
};

/// Stands between this program and the system as long as it lives. The program must be linked with --wrap for
/// each of the calls; what libraries call goes past it.
class SystemCalls {
public:
    /// @return the error that a call gets instead of being made, or 0.
    using Answer = std::function<int(SystemCall const&)>;

    explicit SystemCalls(Answer answer = nullptr);
    ~SystemCalls();
    SystemCalls(SystemCalls const&) = delete;
    SystemCalls& operator=(SystemCalls const&) = delete;

    /// How often each call was made, those that got an error included.
    std::map<std::string, std::size_t, std::less<>> counts;

    /// What one write and one read transfer at most.
    std::size_t mostBytes = std::numeric_limits<std::size_t>::max();

    /// When false, syncs are counted and done without: that is what takes the time.
    bool syncs = false;

    /// @return true when the call fails, with errno set.
    bool fails(SystemCall const& call);

    /// The one that lives, or null.
    static SystemCalls* current();

private:
    Answer answer_;
};

} // namespace project::test
