#include "project/stores/MemoryBackend.hpp"

namespace project::stores {

Changes MemoryBackend::enter(Access /*access*/) {
    return {};
}

void MemoryBackend::leave() noexcept {
}

void MemoryBackend::load(Address const& /*parent*/, ChildSink& /*children*/) {
}

FileChanges MemoryBackend::write(Batch const& /*batch*/) {
    return {};
}

void MemoryBackend::keep() {
}

void MemoryBackend::discard() noexcept {
}

} // namespace project::stores
