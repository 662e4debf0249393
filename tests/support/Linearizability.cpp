#include "support/Linearizability.hpp"

#include <algorithm>
#include <utility>

namespace project::test {

namespace {

constexpr std::uint32_t bitOf(std::size_t index) {
    return std::uint32_t{1} << index;
}

} // namespace

bool Slots::exists(std::size_t slot) const {
    auto const from = values.begin() + static_cast<std::ptrdiff_t>(slot);
    auto const to = from + (slot % inGroup == 0 ? inGroup : 1);
    return std::any_of(from, to, [](std::uint32_t value) { return value != nothing; });
}

Slots Slots::seen() const {
    Slots result = *this;
    for (std::size_t slot = 0; slot < count; ++slot) {
        if (values[slot] == nothing && exists(slot)) {
            result.values[slot] = created;
        }
    }
    return result;
}

std::optional<Slots> Operation::applyTo(Slots const& before) const {
    if (hasSeen && before.seen() != seen) {
        return std::nullopt;
    }
    Slots after = before;
    for (std::size_t slot = 0; slot < Slots::count; ++slot) {
        if (kind == Kind::Read || (mask & bitOf(slot)) == 0) {
            continue;
        }
        if (kind == Kind::Set) {
            after.values[slot] = value;
        } else if (kind == Kind::Remove) {
            auto const from = after.values.begin() + static_cast<std::ptrdiff_t>(slot);
            std::fill_n(from, slot % Slots::inGroup == 0 ? Slots::inGroup : 1, Slots::nothing);
        } else if (!before.exists(slot)) {
            after.values[slot] = Slots::created;
        }
    }
    return after;
}

void Linearizability::begin(std::size_t lane, Operation const& operation) {
    pending_[lane] = operation;
    Set next;
    for (auto const& possible : possible_) {
        next.insert(withReads(possible));
    }
    possible_ = std::move(next);
}

bool Linearizability::end(std::size_t lane) {
    possible_ = doneIn(lane);
    pending_[lane].reset();
    return !possible_.empty();
}

void Linearizability::die(std::size_t lane) {
    auto next = doneIn(lane);
    for (auto possible : possible_) {
        possible.done &= ~bitOf(lane);
        next.insert(possible);
    }
    pending_[lane].reset();
    possible_ = std::move(next);
}

Linearizability::Set Linearizability::doneIn(std::size_t lane) const {
    Set done;
    Set met = possible_;
    std::vector<Possible> open(possible_.begin(), possible_.end());
    while (!open.empty()) {
        auto const possible = open.back();
        open.pop_back();
        if ((possible.done & bitOf(lane)) != 0) {
            done.insert({possible.slots, possible.done & ~bitOf(lane)});
            continue;
        }
        for (std::size_t other = 0; other < lanes; ++other) {
            bool const isOpen = pending_[other] && (possible.done & bitOf(other)) == 0;
            auto const after = isOpen ? pending_[other]->applyTo(possible.slots) : std::nullopt;
            if (after) {
                auto const next = withReads({*after, possible.done | bitOf(other)});
                if (met.insert(next).second) {
                    open.push_back(next);
                }
            }
        }
    }
    return done;
}

/// A read changes nothing, so it can take effect as early as possible: every continuation stays possible.
Linearizability::Possible Linearizability::withReads(Possible possible) const {
    for (std::size_t lane = 0; lane < lanes; ++lane) {
        if (pending_[lane] && pending_[lane]->kind == Operation::Kind::Read &&
            pending_[lane]->applyTo(possible.slots)) {
            possible.done |= bitOf(lane);
        }
    }
    return possible;
}

std::size_t Linearizability::Hash::operator()(Possible const& possible) const noexcept {
    std::size_t hash = possible.done;
    for (auto const value : possible.slots.values) {
        hash = (hash ^ value) * 0x9E3779B97F4A7C15U;
        hash ^= hash >> 29U;
    }
    return hash;
}

} // namespace project::test
