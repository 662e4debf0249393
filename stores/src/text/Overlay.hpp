#pragma once

#include <map>
#include <set>

#include "line/AddressState.hpp"
#include "project/stores/Change.hpp"

namespace project::stores {

/// Changes over a body: the states that replace those of the body, and the parts of the body that are hidden.
class Overlay {
public:
    struct Entry {
        AddressState state;
        /// The body's lines at and below the address are ignored. True for every entry without a state.
        bool isHiding = false;
    };

    /// Orders by address. Also finds the end of the addresses within an address.
    struct Order {
        struct EndOf {
            Address const& address;
        };

        using is_transparent = void;

        bool operator()(Address const& left, Address const& right) const noexcept { return left < right; }

        bool operator()(Address const& left, EndOf right) const noexcept {
            return left < right.address || left.isWithin(right.address);
        }
    };

    using Entries = std::map<Address, Entry, Order>;

    /// Consecutive entries.
    struct Range {
        Entries::const_iterator first;
        Entries::const_iterator last;

        Entries::const_iterator begin() const noexcept { return first; }

        Entries::const_iterator end() const noexcept { return last; }

        bool empty() const noexcept { return first == last; }
    };

    /// Applies one change of a batch.
    void apply(Change const& change);

    /// Sets the state of an address. Needs no search if the address comes after the last entry.
    void put(Address const& address, AddressState state);

    /// Removes an address and everything below it.
    void remove(Address const& address);

    /// The entry of exactly this address, or null.
    Entry const* find(Address const& address) const;

    /// True if an entry at or above this address hides the body's line. One search, whatever the depth of the
    /// address.
    bool isHidden(Address const& address) const;

    /// The entries strictly below an address.
    Range below(Address const& address) const;

    Entries const& entries() const noexcept { return entries_; }

    bool empty() const noexcept { return entries_.empty(); }

private:
    Entries entries_;
    std::set<Address> hidden_; ///< the addresses of hiding entries, without those below another one
};

} // namespace project::stores
