#pragma once

#include <functional>

namespace project::stores {

/// A file descriptor that is closed in the child process after a fork.
///
/// A lock taken with flock belongs to the open file, which a fork shares: a child that kept the descriptor
/// would hold the lock until it ends. A handler, registered once for the process, therefore closes all of
/// these descriptors in the child. No fork can run while a descriptor is opened or closed, so none is missed.
/// One thread at a time; other threads may fork at any time.
class ForkSafeDescriptor {
public:
    ForkSafeDescriptor();
    ~ForkSafeDescriptor();
    ForkSafeDescriptor(ForkSafeDescriptor const&) = delete;
    ForkSafeDescriptor& operator=(ForkSafeDescriptor const&) = delete;

    /// Closes the open file and opens another one.
    /// @param call opens a file close-on-exec and returns the descriptor, or -1 with errno set.
    /// @return false if the call failed, with its errno.
    bool open(std::function<int()> const& call);

    /// @return 0, or the error number of the system if the last data could not be written.
    int close() noexcept;

    bool isOpen() const noexcept { return descriptor_ >= 0; }

    int get() const noexcept { return descriptor_; }

    /// True in a child process that was forked while this object existed.
    bool isInForkedChild() const noexcept { return isInForkedChild_; }

private:
    friend class ForkRegistry;

    int descriptor_ = -1;
    bool isInForkedChild_ = false;
};

} // namespace project::stores
