#include "project/stores/MemoryBackend.hpp"

namespace project::stores {

Changes MemoryBackend::enter(Access /*access*/) {
    return {};
}

void MemoryBackend::leave() noexcept {
}

Children MemoryBackend::load(Address const& /*parent*/) {
    return {};
}

FileChanges MemoryBackend::write(Batch const& /*batch*/) {
    return {};
}

void MemoryBackend::keep() {
}

void MemoryBackend::discard() noexcept {
}

} // namespace project::stores
