#include "tree/WriteLog.hpp"

#include <algorithm>
#include <iterator>
#include <utility>

namespace project::stores {

void WriteLog::apply(Batch batch, ListenerList::Always always) {
    auto& write = writes_.emplace_back(Write{std::move(batch), always, nullptr});
    try {
        write.undo = tree_.apply(write.batch);
    } catch (...) {
        writes_.pop_back();
        throw;
    }
}

std::uint64_t WriteLog::begin() {
    open_.push_back({lastNumber_ + 1, writes_.size()});
    return ++lastNumber_;
}

bool WriteLog::isOpen(std::uint64_t transaction) const noexcept {
    return std::ranges::find(open_, transaction, &OpenTransaction::number) != open_.end();
}

bool WriteLog::isInnermost(std::uint64_t transaction) const noexcept {
    return isInTransaction() && open_.back().number == transaction;
}

void WriteLog::end() noexcept {
    open_.pop_back();
}

void WriteLog::rollBack(std::uint64_t transaction) noexcept {
    auto const found = std::ranges::find(open_, transaction, &OpenTransaction::number);
    if (found != open_.end()) {
        undoFrom(found->firstWrite);
        open_.erase(found, open_.end());
    }
}

ListenerList::Always WriteLog::always() const noexcept {
    ListenerList::Always result;
    for (auto const& write : writes_) {
        result.addition = result.addition || write.always.addition;
        result.removal = result.removal || write.always.removal;
    }
    return result;
}

Batch WriteLog::takeBatch() {
    if (writes_.size() == 1) {
        return std::move(writes_.front().batch);
    }
    Batch result;
    for (auto& write : writes_) {
        std::move(write.batch.begin(), write.batch.end(), std::back_inserter(result));
    }
    return result;
}

void WriteLog::undoFrom(std::size_t firstWrite) noexcept {
    while (writes_.size() > firstWrite) {
        tree_.undo(std::move(writes_.back().undo));
        writes_.pop_back();
    }
}

} // namespace project::stores
