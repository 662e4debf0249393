#pragma once

#include <vector>

namespace project::test {

/// Writes down in which order this thread deletes some objects, while it lives. One at a time.
///
/// The program's operator delete is replaced for this, since an object that nobody can subclass tells of its
/// end in no other way.
class DeletionLog {
public:
    /// @param objects the addresses that operator new gave for them.
    explicit DeletionLog(std::vector<void const*> objects);
    ~DeletionLog();
    DeletionLog(DeletionLog const&) = delete;
    DeletionLog& operator=(DeletionLog const&) = delete;

    /// Those that were deleted up to now, the first one first.
    std::vector<void const*> const& deleted() const { return deleted_; }

    /// Called by operator delete; allocates nothing.
    void note(void const* object) noexcept;

private:
    std::vector<void const*> objects_;
    std::vector<void const*> deleted_;
};

} // namespace project::test
