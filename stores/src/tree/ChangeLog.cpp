#include "tree/ChangeLog.hpp"

#include <utility>

namespace project::stores {

namespace {

bool isSame(Node const& left, Node const& right) {
    return left == right || (left && right && isEqual(*left, *right));
}

} // namespace

void ChangeLog::add(Changes const& changes) {
    if (!std::exchange(hasBegun_, true)) {
        return;
    }
    everything_ = everything_ || changes.everything;
    for (auto const& [address, before, after] : changes.differences) {
        // They are usually sorted, and behind the ones that are already there.
        differences_.try_emplace(differences_.end(), address, Ends{before, nullptr})->second.after = after;
    }
}

Changes ChangeLog::take() {
    std::lock_guard const guard(taking_);
    Changes result{std::exchange(everything_, false), {}};
    for (auto& [address, ends] : std::exchange(differences_, {})) {
        if (!isSame(ends.before, ends.after)) {
            result.differences.push_back({address, std::move(ends.before), std::move(ends.after)});
        }
    }
    return result;
}

} // namespace project::stores
