#pragma once

namespace project::test {

/// Counts what this thread allocates by malloc and its kin, operator new included, while it lives. One at a
/// time for each thread. The program must be linked with support/AllocationCount.cpp.
class AllocationCount {
public:
    AllocationCount();
    AllocationCount(AllocationCount const&) = delete;
    AllocationCount& operator=(AllocationCount const&) = delete;

    long get() const;

private:
    long before_;
};

} // namespace project::test
