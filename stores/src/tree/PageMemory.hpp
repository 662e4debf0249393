#pragma once

#include <cstddef>
#include <memory_resource>

namespace project::stores {

/// Memory in whole pages from the system, for a pool that divides it.
class PageMemory : public std::pmr::memory_resource {
private:
    void* do_allocate(std::size_t bytes, std::size_t alignment) override;
    void do_deallocate(void* memory, std::size_t bytes, std::size_t alignment) override;
    bool do_is_equal(std::pmr::memory_resource const& other) const noexcept override;
};

} // namespace project::stores
