#include "ChangeStep.hpp"

#include <exception>
#include <optional>
#include <vector>

#include "project/stores/StoreError.hpp"

namespace project::session {

namespace {

/// Runs an action. @return its exception; null if it returned.
template <typename Action>
std::exception_ptr errorOf(Action const& action) {
    try {
        action();
        return nullptr;
    } catch (...) {
        return std::current_exception();
    }
}

} // namespace

ChangeStep::ChangeStep(ChangeExecutor& executor, Kind kind)
    : executor_(executor),
      kind_(kind),
      writes_(executor.store_.transaction()),
      depth_(executor.openSteps_ + 1),
      earlierEvents_(executor.raised_.size()),
      earlierFiles_(executor.files_.mark()),
      earlierMoves_(executor.moves_ != nullptr ? executor.moves_->size() : 0) {
    if (isOutermost()) {
        executor_.recoverMoves();
    }
    if (isOutermost() && kind_ == Kind::Transaction) {
        executor_.files_.beginTransaction();
    }
    executor_.openSteps_ = depth_;
}

ChangeStep::~ChangeStep() {
    if (writes_.isOpen()) {
        end();
        drop();
    }
}

void ChangeStep::commit() {
    if (isOutermost()) {
        commitOutermost();
    } else {
        commitWrites();
    }
}

void ChangeStep::commitOutermost() {
    std::vector<Event> events;
    std::vector<Event> personalEvents;
    std::exception_ptr personalError;
    std::exception_ptr stagingError;
    {
        auto const guard = executor_.store_.acquireWriteLock(); // until the text is staged
        std::optional<git::GitAdapter::Batch> batch;
        if (executor_.adapter_ != nullptr) {
            batch.emplace(*executor_.adapter_);
        }
        executor_.stageMoves();
        commitWrites();
        executor_.commitMoves();
        events = executor_.raised_.take();
        if (executor_.personal_ != nullptr) {
            personalError = errorOf([&] { executor_.personal_->commit(depth_); });
            personalEvents = executor_.personal_->raised().take();
        }
        stagingError = errorOf([&] { executor_.stage(batch ? &*batch : nullptr); });
    }
    // The step is committed, so observers are called even if it could not be staged.
    auto const slotError = errorOf([&] {
        dispatch(events, *executor_.observers_);
        if (!personalEvents.empty()) {
            dispatch(personalEvents, *executor_.personalObservers_);
        }
    });
    for (auto const& error : {personalError, stagingError, slotError}) {
        if (error) {
            std::rethrow_exception(error);
        }
    }
}

void ChangeStep::commitWrites() {
    try {
        if (isOutermost() && kind_ == Kind::Transaction) {
            executor_.files_.passToSourceControl();
        }
        writes_.commit();
        if (!isOutermost() && executor_.personal_ != nullptr) {
            executor_.personal_->commit(depth_);
        }
    } catch (stores::StoreError const& error) {
        if (executor_.moves_ != nullptr && error.kind() == stores::StoreError::Kind::OutcomeUnknown) {
            executor_.moves_->leave();
        }
        abandon();
        throw;
    } catch (...) {
        abandon();
        throw;
    }
    end();
}

/// Drops everything, unless the transaction is still open.
void ChangeStep::abandon() noexcept {
    if (!writes_.isOpen()) {
        end();
        drop();
    }
}

void ChangeStep::end() noexcept {
    executor_.openSteps_ = depth_ - 1;
}

void ChangeStep::drop() noexcept {
    executor_.raised_.dropBehind(earlierEvents_);
    if (executor_.personal_ != nullptr) {
        executor_.personal_->rollBack(depth_);
    }
    executor_.files_.dropSince(earlierFiles_);
    if (executor_.moves_ != nullptr) {
        executor_.moves_->undoBehind(earlierMoves_);
    }
    if (isOutermost()) {
        if (kind_ == Kind::Transaction) {
            executor_.files_.restoreEarlier();
        }
        executor_.files_.clear();
    }
}

} // namespace project::session
