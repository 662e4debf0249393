#pragma once

#include <cstddef>

namespace project::test {

/// Counts the allocations of this thread, by malloc and operator new, as long as it exists: their number, all
/// their bytes, and the most bytes at one time. A thread may have one object at a time. The program must be
/// linked with support/Allocations.cpp.
class Allocations {
public:
    Allocations();
    Allocations(Allocations const&) = delete;
    Allocations& operator=(Allocations const&) = delete;

    std::size_t count() const;
    std::size_t total() const; ///< in bytes
    std::size_t peak() const;  ///< in bytes
};

} // namespace project::test
