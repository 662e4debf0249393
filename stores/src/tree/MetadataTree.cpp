#include "tree/MetadataTree.hpp"

#include <algorithm>
#include <set>
#include <utility>

namespace project::stores {

using metadata::PathElement;

namespace {

/// With more differences than this, it costs less to discard the tree than to reload each level concerned.
constexpr std::size_t mostReloaded = 4096;

} // namespace

/// Orders siblings, whose addresses differ in the last step only.
struct MetadataTree::ByElement {
    using is_transparent = void;

    bool operator()(Address const& left, Address const& right) const noexcept {
        return left.leaf() < right.leaf();
    }

    bool operator()(Address const& left, PathElement const& right) const noexcept {
        return left.leaf() < right;
    }

    bool operator()(PathElement const& left, Address const& right) const noexcept {
        return left < right.leaf();
    }
};

/// One address in the tree.
struct MetadataTree::Place {
    Node node;
    bool isCreated = false;
    std::atomic<bool> loaded = false;
    std::unique_ptr<Places> below; ///< null if there is nothing below it, as far as it is loaded

    bool isEmpty() const noexcept { return !below || below->empty(); }

    Places& makeBelow() {
        if (!below) {
            below = std::make_unique<Places>();
        }
        return *below;
    }

    /// Extracts the place at an element; empty if there is none.
    Places::node_type take(PathElement const& element) {
        auto const found = makeBelow().find(element);
        return found == below->end() ? Places::node_type() : below->extract(found);
    }
};

/// One step for each change, to be undone from the last to the first.
struct MetadataTree::UndoSteps {
    struct Step {
        Address address;
        bool isNew;                 ///< the place did not exist before
        Node node;                  ///< the earlier node
        bool isCreated;             ///< the earlier state
        Places::node_type detached; ///< of a removal: the place that was extracted
    };

    std::vector<Step> steps;
};

MetadataTree::MetadataTree(Loader loader) : loader_(std::move(loader)), root_(std::make_unique<Place>()) {
}

MetadataTree::~MetadataTree() = default;

Node MetadataTree::node(Address const& address) const {
    auto const* place = find(address);
    return place != nullptr ? place->node : nullptr;
}

bool MetadataTree::exists(Address const& address) const {
    auto* place = find(address);
    if (place == nullptr) {
        return false;
    }
    if (place != root_.get()) {
        return true; // a place exists only as long as its address
    }
    load(*place, address);
    return !place->isEmpty();
}

std::vector<Address> MetadataTree::children(Address const& address) const {
    std::vector<Address> result;
    auto* place = find(address);
    if (place == nullptr) {
        return result;
    }
    load(*place, address);
    if (place->below) {
        result.reserve(place->below->size());
        for (auto const& [child, content] : *place->below) {
            result.push_back(child);
        }
    }
    return result;
}

MetadataTree::Place* MetadataTree::find(Address const& address) const {
    auto const top = Address::root();
    auto const* here = &top;
    auto* place = root_.get();
    auto const depth = address.depth();
    for (std::size_t index = 0; index < depth; ++index) {
        load(*place, *here);
        if (!place->below) {
            return nullptr;
        }
        auto const found = place->below->find(address[index]);
        if (found == place->below->end()) {
            return nullptr;
        }
        here = &found->first;
        place = &found->second;
    }
    return place;
}

MetadataTree::Place* MetadataTree::findLoaded(Address const& address) const {
    auto* place = root_.get();
    for (std::size_t index = 0; index < address.depth(); ++index) {
        if (!place->loaded.load(std::memory_order_relaxed) || !place->below) {
            return nullptr;
        }
        auto const found = place->below->find(address[index]);
        if (found == place->below->end()) {
            return nullptr;
        }
        place = &found->second;
    }
    return place->loaded.load(std::memory_order_relaxed) ? place : nullptr;
}

void MetadataTree::load(Place& place, Address const& address) const {
    if (place.loaded.load(std::memory_order_acquire)) {
        return;
    }
    std::lock_guard const guard(loading_);
    if (place.loaded.load(std::memory_order_relaxed)) {
        return;
    }
    auto children = loader_(address);
    if (!children.empty()) {
        auto below = std::make_unique<Places>();
        for (auto& child : children) {
            auto& added = below->try_emplace(below->end(), address.child(std::move(child.element)))->second;
            added.node = std::move(child.node);
            added.isCreated = child.isCreated;
            added.loaded.store(!child.hasChildren, std::memory_order_relaxed);
        }
        place.below = std::move(below);
    }
    place.loaded.store(true, std::memory_order_release);
}

MetadataTree::Undo MetadataTree::apply(Batch const& batch) {
    auto done = std::make_shared<UndoSteps>();
    done->steps.reserve(batch.size());
    try {
        for (auto const& change : batch) {
            if (change.kind == Change::Kind::Remove) {
                remove(change.address, *done);
            } else {
                set(change, *done);
            }
        }
    } catch (...) {
        undo(std::move(done));
        throw;
    }
    return done;
}

void MetadataTree::set(Change const& change, UndoSteps& undo) {
    auto* place = root_.get();
    auto here = Address::root();
    bool isNew = false;
    for (std::size_t index = 0; index < change.address.depth(); ++index) {
        load(*place, here);
        auto const& element = change.address[index];
        auto& below = place->makeBelow();
        auto found = below.lower_bound(element);
        if (found == below.end() || found->first.leaf() != element) {
            found = below.try_emplace(found, here.child(element));
            found->second.loaded.store(true,
                                       std::memory_order_relaxed); // it is new: nothing is stored below it
            if (!isNew) {
                isNew = true;
                undo.steps.push_back({found->first, true, nullptr, false, {}});
            }
        }
        here = found->first;
        place = &found->second;
    }
    if (!isNew) {
        undo.steps.push_back({here, false, place->node, place->isCreated, {}});
    }
    place->node = change.node;
    place->isCreated = change.kind == Change::Kind::Create;
}

void MetadataTree::remove(Address const& address, UndoSteps& undo) {
    if (find(address) == nullptr) {
        return;
    }
    // An address above that has no node, was not created, and has no other children is deleted too.
    auto removed = address;
    auto* above = find(removed.parent());
    while (above != root_.get() && !above->node && !above->isCreated && above->below->size() == 1) {
        removed = removed.parent();
        above = find(removed.parent());
    }
    undo.steps.push_back({removed, false, nullptr, false, {}});
    undo.steps.back().detached = above->take(removed.leaf());
}

void MetadataTree::undo(Undo undo) noexcept {
    if (!undo) {
        return;
    }
    for (auto step = undo->steps.rbegin(); step != undo->steps.rend(); ++step) {
        auto* above = find(step->address.parent());
        if (step->detached) {
            above->makeBelow().insert(std::move(step->detached));
        } else if (step->isNew) {
            above->below->erase(above->below->find(step->address.leaf()));
        } else {
            auto& place = above->below->find(step->address.leaf())->second;
            place.node = std::move(step->node);
            place.isCreated = step->isCreated;
        }
    }
}

void MetadataTree::forget() {
    root_ = std::make_unique<Place>();
}

void MetadataTree::applyChanges(Changes const& changes) {
    if (changes.everything || changes.differences.size() > mostReloaded) {
        forget();
        return;
    }
    // Whether an address exists can depend on the addresses below it. So every level above a change is
    // reloaded, each level once, from the top.
    std::set<Address> levels;
    for (auto const& difference : changes.differences) {
        for (auto level = difference.address; level.depth() > 0;) {
            level = level.parent();
            if (!levels.insert(level).second) {
                break; // the levels above it are in the set already
            }
        }
    }
    for (auto const& level : levels) {
        if (auto* place = findLoaded(level)) {
            reload(*place, level);
        }
    }
}

void MetadataTree::reload(Place& place, Address const& address) {
    auto const children = loader_(address);
    auto below = std::make_unique<Places>();
    for (auto const& child : children) {
        auto handle = place.take(child.element);
        bool const known = !handle.empty();
        auto const position = known ? below->insert(below->end(), std::move(handle))
                                    : below->try_emplace(below->end(), address.child(child.element));
        auto& content = position->second;
        content.node = child.node;
        content.isCreated = child.isCreated;
        if (!child.hasChildren) {
            content.below.reset();
            content.loaded.store(true, std::memory_order_relaxed);
        } else if (!known || content.isEmpty()) {
            content.loaded.store(false, std::memory_order_relaxed);
        }
    }
    place.below = std::move(below);
}

} // namespace project::stores
