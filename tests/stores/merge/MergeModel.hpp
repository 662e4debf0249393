#pragma once

#include <algorithm>
#include <map>
#include <optional>
#include <set>
#include <string>

#include "project/stores/TextMerge.hpp"
#include "support/ProjectTextSamples.hpp"

namespace project::stores::samples {

/// The nodes by address, in the simplest form: the values of a node, or nothing for an address that was
/// created without one.
using Tree = std::map<Address, std::optional<Keys>>;

/// A slow merge of three trees, in which each question is answered by searching whole maps.
class MergeModel {
public:
    MergeModel(Tree const& base, Tree const& ours, Tree const& theirs)
        : base_(base), ours_(ours), theirs_(theirs) {
        std::set<Address> all;
        for (Tree const* const tree : {&base, &ours, &theirs}) {
            for (auto const& [address, node] : *tree) {
                all.insert(address);
            }
        }
        for (Address const& address : all) {
            if (!isDone(address)) {
                mergeAt(address);
            }
        }
    }

    Tree const& merged() const { return merged_; }

    /// The addresses in conflict.
    std::set<Address> const& conflicts() const { return conflicts_; }

private:
    using Place = std::optional<std::optional<Keys>>;

    bool isDone(Address const& address) const {
        return std::any_of(done_.begin(), done_.end(),
                           [&](Address const& it) { return address.isWithin(it); });
    }

    static Place at(Tree const& tree, Address const& address) {
        auto const found = tree.find(address);
        return found == tree.end() ? std::nullopt : Place(found->second);
    }

    static bool hasAnythingWithin(Tree const& tree, Address const& address) {
        return std::any_of(tree.begin(), tree.end(),
                           [&](auto const& entry) { return entry.first.isWithin(address); });
    }

    bool hasChangedWithin(Tree const& tree, Address const& address) const {
        return std::any_of(tree.begin(), tree.end(), [&](auto const& entry) {
            return entry.first.isWithin(address) && !isReduction(entry.second, at(base_, entry.first));
        });
    }

    static bool isReduction(Place const& place, Place const& from) {
        if (!place || !from) {
            return !place;
        }
        if (!*place || !*from) {
            return !*place;
        }
        return std::includes((*from)->begin(), (*from)->end(), (*place)->begin(), (*place)->end());
    }

    void mergeAt(Address const& address) {
        bool const existed = base_.contains(address);
        bool const oursRemoved = existed && !hasAnythingWithin(ours_, address);
        bool const theirsRemoved = existed && !hasAnythingWithin(theirs_, address);
        if (oursRemoved || theirsRemoved) {
            done_.insert(address);
            bool const changed = hasChangedWithin(oursRemoved ? theirs_ : ours_, address);
            if (changed) {
                conflicts_.insert(address);
            }
        } else {
            mergeNode(address);
        }
    }

    void mergeNode(Address const& address) {
        Place const base = at(base_, address);
        Place const ours = at(ours_, address);
        Place const theirs = at(theirs_, address);
        if (ours == theirs || theirs == base) {
            put(address, ours);
        } else if (ours == base) {
            put(address, theirs);
        } else if (ours && theirs && *ours && *theirs) {
            mergeKeys(address, base && *base ? **base : Keys(), **ours, **theirs);
        } else if (ours && theirs && (!base || !*base)) {
            put(address, *ours ? ours : theirs);
        } else {
            bool const oursLess = !ours || (theirs && !*ours);
            if (isReduction(oursLess ? theirs : ours, base)) {
                put(address, oursLess ? ours : theirs);
            } else {
                conflicts_.insert(address);
            }
        }
    }

    void mergeKeys(Address const& address, Keys const& base, Keys const& ours, Keys const& theirs) {
        Keys merged;
        Keys all = base;
        all.insert(ours.begin(), ours.end());
        all.insert(theirs.begin(), theirs.end());
        for (auto const& [key, value] : all) {
            auto const of = [name = key](Keys const& keys) {
                return keys.contains(name) ? std::optional(keys.at(name)) : std::nullopt;
            };
            bool const oursChanged = of(ours) != of(base);
            if (oursChanged && of(theirs) != of(base) && of(ours) != of(theirs)) {
                conflicts_.insert(address);
            }
            if (auto const kept = of(oursChanged ? ours : theirs)) {
                merged.emplace(key, *kept);
            }
        }
        if (!conflicts_.contains(address)) {
            merged_.emplace(address, merged);
        }
    }

    void put(Address const& address, Place const& place) {
        if (place) {
            merged_.emplace(address, *place);
        }
    }

    Tree const& base_;
    Tree const& ours_;
    Tree const& theirs_;
    Tree merged_;
    std::set<Address> conflicts_;
    std::set<Address> done_; ///< the addresses within these are merged
};

} // namespace project::stores::samples
