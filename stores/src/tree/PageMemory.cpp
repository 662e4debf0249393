#include "tree/PageMemory.hpp"

#include <new>

#include <sys/mman.h>

namespace project::stores {

void* PageMemory::do_allocate(std::size_t bytes, std::size_t /*alignment*/) {
    void* const memory = ::mmap(nullptr, bytes, PROT_READ | PROT_WRITE, MAP_PRIVATE | MAP_ANONYMOUS, -1, 0);
    if (memory == MAP_FAILED) {
        throw std::bad_alloc();
    }
    return memory;
}

void PageMemory::do_deallocate(void* memory, std::size_t bytes, std::size_t /*alignment*/) {
    ::munmap(memory, bytes);
}

bool PageMemory::do_is_equal(std::pmr::memory_resource const& other) const noexcept {
    return dynamic_cast<PageMemory const*>(&other) != nullptr;
}

} // namespace project::stores
