#pragma once

#include <map>
#include <set>

#include "node/Standing.hpp"
#include "project/stores/Change.hpp"

namespace project::stores {

/// Changes that are laid over a body: what stands at an address instead of what the body has there, and
/// which parts of the body are hidden.
class Overlay {
public:
    struct Entry {
        Standing standing;
        /// The body counts neither here nor below. An entry in which nothing stands always hides.
        bool hides = false;
    };

    /// Orders by address; finds the end of what lies within an address too.
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

    /// Entries one behind the other.
    struct Range {
        Entries::const_iterator first;
        Entries::const_iterator last;

        Entries::const_iterator begin() const noexcept { return first; }

        Entries::const_iterator end() const noexcept { return last; }

        bool empty() const noexcept { return first == last; }
    };

    /// Takes one step of a batch.
    void apply(Change const& change);

    /// Lets something stand at an address. Costs no search behind the last entry.
    void put(Address const& address, Standing standing);

    /// Removes an address with all below it.
    void remove(Address const& address);

    /// The entry of exactly this address, or null.
    Entry const* find(Address const& address) const;

    /// True when what the body has at this address does not count: here or above something hides it. One
    /// search, however deep the address is.
    bool isHidden(Address const& address) const;

    /// The entries strictly below an address.
    Range below(Address const& address) const;

    Entries const& entries() const noexcept { return entries_; }

    bool empty() const noexcept { return entries_.empty(); }

private:
    Entries entries_;
    std::set<Address> hidden_; ///< the addresses of entries that hide; of those below each other the topmost
};

} // namespace project::stores
