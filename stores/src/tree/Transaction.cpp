#include "project/stores/Transaction.hpp"

#include <stdexcept>
#include <utility>

#include "project/stores/TreeMetadataManager.hpp"
#include "texts/ErrorTexts.hpp"

namespace project::stores {

Transaction::Transaction(TreeMetadataManager& store, cmlink::ReentrantReadWriteLock::LockGuard guard,
                         std::uint64_t number)
    : store_(&store), guard_(std::move(guard)), number_(number) {
}

Transaction::Transaction(Transaction&& other) noexcept
    : store_(std::exchange(other.store_, nullptr)),
      guard_(std::exchange(other.guard_, std::nullopt)),
      number_(other.number_),
      thread_(other.thread_) {
}

Transaction::~Transaction() {
    if (guard_) {
        store_->rollBack(number_);
    }
}

bool Transaction::isOpen() const noexcept {
    return guard_ && store_->isOpen(number_);
}

void Transaction::commit() {
    requireInnermost();
    auto const guard = *std::exchange(guard_, std::nullopt); // released also if the commit fails
    store_->commitInnermost();
}

void Transaction::requireInnermost() const {
    if (thread_ != std::this_thread::get_id()) {
        throw std::logic_error(errorTexts.get("CommitOnOtherThread"));
    }
    if (!guard_ || !store_->isInnermost(number_)) {
        throw std::logic_error(errorTexts.get("CommitOutOfOrder"));
    }
}

} // namespace project::stores
