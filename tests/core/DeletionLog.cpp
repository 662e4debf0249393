#include "core/DeletionLog.hpp"

#include <algorithm>
#include <cstddef>
#include <cstdlib>
#include <new>
#include <utility>

namespace {

thread_local project::test::DeletionLog* current = nullptr;

void noteAndFree(void* object) noexcept {
    if (current != nullptr) {
        current->note(object);
    }
    std::free(object);
}

} // namespace

void* operator new(std::size_t size) {
    if (void* const result = std::malloc(size == 0 ? 1 : size)) {
        return result;
    }
    throw std::bad_alloc();
}

/// Not left to the library: a sanitizer has its own, whose memory must not be freed like this one's.
void* operator new(std::size_t size, std::nothrow_t const& /*tag*/) noexcept {
    return std::malloc(size == 0 ? 1 : size);
}

void operator delete(void* object) noexcept {
    noteAndFree(object);
}

void operator delete(void* object, std::size_t /*size*/) noexcept {
    noteAndFree(object);
}

namespace project::test {

DeletionLog::DeletionLog(std::vector<void const*> objects) : objects_(std::move(objects)) {
    deleted_.reserve(objects_.size());
    current = this;
}

DeletionLog::~DeletionLog() {
    current = nullptr;
}

void DeletionLog::note(void const* object) noexcept {
    bool const isWatched = std::find(objects_.begin(), objects_.end(), object) != objects_.end();
    bool const isNew = std::find(deleted_.begin(), deleted_.end(), object) == deleted_.end();
    if (isWatched && isNew) { // the address may be used again and freed once more
        deleted_.push_back(object);
    }
}

} // namespace project::test
