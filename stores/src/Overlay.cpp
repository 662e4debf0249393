#include "Overlay.hpp"

#include <algorithm>
#include <utility>

namespace project::stores {

void Overlay::apply(Change const& change) {
    if (change.kind == Change::Kind::Remove) {
        remove(change.address);
    } else {
        put(change.address, {change.node, change.kind == Change::Kind::Make});
    }
}

void Overlay::put(Address const& address, Standing standing) {
    bool const last = entries_.empty() || entries_.rbegin()->first < address;
    auto const hint = last ? entries_.end() : entries_.lower_bound(address);
    entries_.try_emplace(hint, address)->second.standing = std::move(standing);
}

void Overlay::remove(Address const& address) {
    auto const begin = entries_.lower_bound(address);
    auto const end = entries_.lower_bound(Order::EndOf{address});
    hiding_ -= static_cast<std::size_t>(
        std::count_if(begin, end, [](auto const& entry) { return entry.second.hides; }));
    entries_.emplace_hint(entries_.erase(begin, end), address, Entry{{}, true});
    ++hiding_;
}

Overlay::Entry const* Overlay::find(Address const& address) const {
    auto const found = entries_.find(address);
    return found == entries_.end() ? nullptr : &found->second;
}

bool Overlay::isHidden(Address const& address) const {
    if (hiding_ == 0) {
        return false;
    }
    for (Address above = address; above.depth() > 0; above = above.parent()) {
        Entry const* const entry = find(above);
        if (entry != nullptr && entry->hides) {
            return true;
        }
    }
    return false;
}

Overlay::Range Overlay::below(Address const& address) const {
    auto begin = entries_.lower_bound(address);
    if (begin != entries_.end() && begin->first == address) {
        ++begin;
    }
    return {begin, entries_.lower_bound(Order::EndOf{address})};
}

} // namespace project::stores
