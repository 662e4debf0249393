#pragma once

#include <cstddef>

namespace project::test {

/// Notes what this thread allocates by malloc and its kin, operator new included, while it lives: how often,
/// all of its bytes, and the most that were held at once. One at a time for each thread. The program must be
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
