#include "support/Allocations.hpp"

#include <algorithm>

// A sanitizer has its own malloc and reports each call; without one, malloc is replaced.
#if defined(__has_feature)
#if __has_feature(address_sanitizer) || __has_feature(thread_sanitizer)
#define PROJECT_HAS_SANITIZER_MALLOC
#endif
#endif
#if defined(__SANITIZE_ADDRESS__) || defined(__SANITIZE_THREAD__)
#define PROJECT_HAS_SANITIZER_MALLOC
#endif

namespace {

struct Tally {
    std::size_t count;
    std::size_t total;
    std::ptrdiff_t held; ///< negative if more was freed than allocated
    std::ptrdiff_t peak;
};

// Its first use by a thread does not allocate.
[[gnu::tls_model("initial-exec")]] thread_local Tally tally{0, 0, 0, 0};

void noteAllocated(std::size_t size) {
    ++tally.count;
    tally.total += size;
    tally.held += static_cast<std::ptrdiff_t>(size);
    tally.peak = std::max(tally.peak, tally.held);
}

void noteFreed(std::size_t size) {
    tally.held -= static_cast<std::ptrdiff_t>(size);
}

} // namespace

#ifdef PROJECT_HAS_SANITIZER_MALLOC

#include <sanitizer/allocator_interface.h>

namespace {

[[maybe_unused]] int const installed = __sanitizer_install_malloc_and_free_hooks(
    [](void const volatile*, std::size_t size) { noteAllocated(size); },
    [](void const volatile* block) {
        if (block != nullptr) {
            noteFreed(__sanitizer_get_allocated_size(block));
        }
    });

} // namespace

#else

#include <malloc.h>

extern "C" {

void* __libc_malloc(std::size_t size);
void* __libc_calloc(std::size_t count, std::size_t size);
void* __libc_realloc(void* block, std::size_t size);
void __libc_free(void* block);

void* malloc(std::size_t size) {
    void* const block = __libc_malloc(size);
    noteAllocated(malloc_usable_size(block));
    return block;
}

void* calloc(std::size_t count, std::size_t size) {
    void* const block = __libc_calloc(count, size);
    noteAllocated(malloc_usable_size(block));
    return block;
}

void* realloc(void* block, std::size_t size) {
    std::size_t const before = malloc_usable_size(block);
    void* const moved = __libc_realloc(block, size);
    if (moved != nullptr || size == 0) {
        noteFreed(before);
        noteAllocated(malloc_usable_size(moved));
    }
    return moved;
}

void free(void* block) {
    noteFreed(malloc_usable_size(block));
    __libc_free(block);
}
}

#endif

namespace project::test {

Allocations::Allocations() {
    tally = {0, 0, 0, 0};
}

std::size_t Allocations::count() const {
    return tally.count;
}

std::size_t Allocations::total() const {
    return tally.total;
}

std::size_t Allocations::peak() const {
    return static_cast<std::size_t>(tally.peak);
}

} // namespace project::test
