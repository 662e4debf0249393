#include "tree/Cursors.hpp"

namespace project::stores {

Cursors::Use::Use(Cursors& cursors) : slot_(cursors.slotOfThisThread()) {
    if (slot_.isInUse.exchange(true, std::memory_order_acquire)) {
        own_.emplace();
    }
}

Cursors::Use::~Use() {
    if (!own_) {
        slot_.isInUse.store(false, std::memory_order_release);
    }
}

void Cursors::reset() noexcept {
    for (auto& slot : slots_) {
        slot.cursor.reset();
    }
}

Cursors::Slot& Cursors::slotOfThisThread() noexcept {
    static std::atomic<std::size_t> threads = 0;
    static thread_local std::size_t const number = threads.fetch_add(1, std::memory_order_relaxed);
    return slots_[number % slotCount];
}

} // namespace project::stores
