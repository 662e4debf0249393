#include "project/session/Transaction.hpp"

#include <stdexcept>
#include <utility>

#include "ChangeStep.hpp"
#include "texts/ErrorTexts.hpp"

namespace project::session {

Transaction::Transaction(std::unique_ptr<ChangeStep> step) : step_(std::move(step)) {
}

Transaction::Transaction(Transaction&& other) noexcept = default;

Transaction::~Transaction() = default;

void Transaction::commit() {
    if (!step_) {
        throw std::logic_error(errorTexts.get("TransactionMoved"));
    }
    step_->commit();
}

} // namespace project::session
