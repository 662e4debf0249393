#include "text/Overlay.hpp"

#include <iterator>
#include <utility>

namespace project::stores {

void Overlay::apply(Change const& change) {
    if (change.kind == Change::Kind::Remove) {
        remove(change.address);
    } else {
        put(change.address, {change.node, change.kind == Change::Kind::Create});
    }
}

void Overlay::put(Address const& address, AddressState state) {
    bool const isLast = entries_.empty() || entries_.rbegin()->first < address;
    auto const hint = isLast ? entries_.end() : entries_.lower_bound(address);
    entries_.try_emplace(hint, address)->second.state = std::move(state);
}

void Overlay::remove(Address const& address) {
    auto const begin = entries_.lower_bound(address);
    auto const end = entries_.lower_bound(Order::EndOf{address});
    entries_.emplace_hint(entries_.erase(begin, end), address, Entry{{}, true});
    if (!isHidden(address)) {
        auto next = hidden_.emplace_hint(hidden_.lower_bound(address), address);
        for (++next; next != hidden_.end() && next->isWithin(address);) {
            next = hidden_.erase(next);
        }
    }
}

Overlay::Entry const* Overlay::find(Address const& address) const {
    auto const found = entries_.find(address);
    return found == entries_.end() ? nullptr : &found->second;
}

bool Overlay::isHidden(Address const& address) const {
    // None of them lies below another one, so the one above the address comes directly before it.
    auto const next = hidden_.upper_bound(address);
    return next != hidden_.begin() && address.isWithin(*std::prev(next));
}

Overlay::Range Overlay::below(Address const& address) const {
    auto begin = entries_.lower_bound(address);
    if (begin != entries_.end() && begin->first == address) {
        ++begin;
    }
    return {begin, entries_.lower_bound(Order::EndOf{address})};
}

} // namespace project::stores
