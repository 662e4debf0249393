#pragma once

#include <cstddef>

namespace project::test {

/// Sums up what this thread allocates by malloc and its kin, operator new included, while it lives: all of
/// it, and the most that was held at once. One at a time for each thread. The program must be linked with
/// support/AllocatedBytes.cpp.
class AllocatedBytes {
public:
    AllocatedBytes();
    AllocatedBytes(AllocatedBytes const&) = delete;
    AllocatedBytes& operator=(AllocatedBytes const&) = delete;

    std::size_t total() const;
    std::size_t peak() const;
};

} // namespace project::test
