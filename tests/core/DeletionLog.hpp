#pragma once

#include <vector>

namespace project::test {

/// Records the order in which this thread deletes some objects, as long as the log exists. Only one log may
/// exist.
///
/// It replaces the program's operator delete, because the end of an object of a class that cannot be derived
/// from is not visible otherwise.
class DeletionLog {
public:
    /// @param objects their addresses, as operator new returned them.
    explicit DeletionLog(std::vector<void const*> objects);
    ~DeletionLog();
    DeletionLog(DeletionLog const&) = delete;
    DeletionLog& operator=(DeletionLog const&) = delete;

    /// Returns the objects that were deleted so far, in order.
    std::vector<void const*> const& deleted() const { return deleted_; }

    /// Called by operator delete. Does not allocate.
    void note(void const* object) noexcept;

private:
    std::vector<void const*> objects_;
    std::vector<void const*> deleted_;
};

} // namespace project::test
