#pragma once

#include <functional>

namespace project::stores {

/// An open file descriptor that a forked child does not have.
///
/// A lock taken by flock belongs to the open file, which a fork shares: a child that kept the descriptor
/// would hold the lock on for as long as it lives. So a handler, registered once for the process, closes all
/// of these in the child. Descriptors are opened and closed while no fork can run, so that none slips
/// through. One thread at a time, whatever other threads fork.
class ForkSafeDescriptor {
public:
    ForkSafeDescriptor();
    ~ForkSafeDescriptor();
    ForkSafeDescriptor(ForkSafeDescriptor const&) = delete;
    ForkSafeDescriptor& operator=(ForkSafeDescriptor const&) = delete;

    /// Closes what is open and keeps what the call gives.
    /// @param call opens a file close-on-exec: the descriptor, or -1 with errno set.
    /// @return false when the call failed, with errno as it left it.
    bool open(std::function<int()> const& call);

    /// @return 0, or the system's number for what went wrong as the last of the data was handed over.
    int close() noexcept;

    bool isOpen() const noexcept { return descriptor_ >= 0; }

    int get() const noexcept { return descriptor_; }

    /// True in a child that was forked while this object lived: the files of its parent are not the child's.
    bool isInForkedChild() const noexcept { return inForkedChild_; }

private:
    friend class ForkRegistry;

    int descriptor_ = -1;
    bool inForkedChild_ = false;
};

} // namespace project::stores
