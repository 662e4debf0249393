#pragma once

#include <new>
#include <stdexcept>

#include <sys/mman.h>

namespace project::test {

/// A value that this process shares with its forked children, initially all zeros. A value that a child has
/// written stays after the child is killed. The type's constructor and destructor must have no effects.
template <typename T>
class SharedMemory {
public:
    SharedMemory()
        : memory_(::mmap(nullptr, sizeof(T), PROT_READ | PROT_WRITE,
                         MAP_SHARED | MAP_ANONYMOUS | MAP_NORESERVE, -1, 0)) {
        if (memory_ == MAP_FAILED) {
            throw std::runtime_error("no memory to be shared with other processes");
        }
    }

    ~SharedMemory() { ::munmap(memory_, sizeof(T)); }

    SharedMemory(SharedMemory const&) = delete;
    SharedMemory& operator=(SharedMemory const&) = delete;

    T& operator*() const { return *static_cast<T*>(memory_); }

    T* operator->() const { return static_cast<T*>(memory_); }

private:
    void* memory_;
};

} // namespace project::test
