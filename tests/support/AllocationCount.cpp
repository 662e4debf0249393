#include "support/AllocationCount.hpp"

#include <cstddef>

// A sanitizer has its own malloc and tells of each call; without one, malloc is taken over.
#if defined(__has_feature)
#if __has_feature(address_sanitizer) || __has_feature(thread_sanitizer)
#define PROJECT_HAS_SANITIZER_MALLOC
#endif
#endif
#if defined(__SANITIZE_ADDRESS__) || defined(__SANITIZE_THREAD__)
#define PROJECT_HAS_SANITIZER_MALLOC
#endif

namespace {

// Of a kind that needs no allocation itself when a thread first touches it.
[[gnu::tls_model("initial-exec")]] thread_local long allocations = 0;

} // namespace

#ifdef PROJECT_HAS_SANITIZER_MALLOC

#include <sanitizer/allocator_interface.h>

namespace {

[[maybe_unused]] int const installed = __sanitizer_install_malloc_and_free_hooks(
    [](void const volatile*, std::size_t) { ++allocations; }, [](void const volatile*) {});

} // namespace

#else

extern "C" {

void* __libc_malloc(std::size_t size);
void* __libc_calloc(std::size_t count, std::size_t size);
void* __libc_realloc(void* block, std::size_t size);

void* malloc(std::size_t size) {
    ++allocations;
    return __libc_malloc(size);
}

void* calloc(std::size_t count, std::size_t size) {
    ++allocations;
    return __libc_calloc(count, size);
}

void* realloc(void* block, std::size_t size) {
    ++allocations;
    return __libc_realloc(block, size);
}
}

#endif

namespace project::test {

AllocationCount::AllocationCount() : before_(allocations) {
}

long AllocationCount::get() const {
    return allocations - before_;
}

} // namespace project::test
