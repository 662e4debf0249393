#include "tree/MetadataTree.hpp"

#include <algorithm>
#include <optional>
#include <set>
#include <utility>

namespace project::stores {

namespace {

/// With more differences than this, it costs less to discard the tree than to reload each level concerned.
constexpr std::size_t mostReloaded = 4096;

/// The address with the first steps of another one.
Address firstSteps(Address address, std::size_t depth) {
    while (address.depth() > depth) {
        address = address.parent();
    }
    return address;
}

} // namespace

/// At most one step for each change, to be undone from the last to the first.
struct MetadataTree::UndoSteps {
    enum class Kind {
        Added,    ///< the address did not exist before
        Replaced, ///< the address had another state
        Removed,  ///< the address was removed with everything below it
    };

    struct Step {
        Kind kind;
        Address address;
        Place place; ///< of Replaced, the earlier state; of Removed, the place that was extracted
    };

    std::vector<Step> steps;
};

MetadataTree::MetadataTree(Loader loader) : loader_(std::move(loader)) {
}

MetadataTree::~MetadataTree() = default;

Node MetadataTree::node(Address const& address) const {
    Cursors::Use use(cursors_);
    return moveTo(address, *use) ? nodeAt(*use) : nullptr;
}

bool MetadataTree::hasNode(Address const& address) const {
    Cursors::Use use(cursors_);
    return moveTo(address, *use) && nodeAt(*use);
}

/// The node at the last step of a cursor; null if none is stored there, as at the root.
Node const& MetadataTree::nodeAt(Cursor const& cursor) noexcept {
    static Node const none;
    auto const depth = cursor.depth();
    return depth == 0 ? none : cursor.level(depth).node(cursor.position(depth));
}

bool MetadataTree::exists(Address const& address) const {
    Cursors::Use use(cursors_);
    if (!moveTo(address, *use)) {
        return false;
    }
    if (address.depth() > 0) {
        return true; // an entry exists only as long as its address
    }
    auto const* level = levelBelow(*use, address, Loading::OnRequest);
    return level != nullptr && !level->empty();
}

std::vector<Address> MetadataTree::children(Address const& address) const {
    Cursors::Use use(cursors_);
    std::vector<Address> result;
    auto const* level = moveTo(address, *use) ? levelBelow(*use, address, Loading::OnRequest) : nullptr;
    if (level != nullptr) {
        result.reserve(level->size());
        level->forEach(
            [&](Level::Position at) { result.push_back(address.child(level->element(types_, at))); });
    }
    return result;
}

void MetadataTree::passChildren(Address const& address, ChildSink& children) const {
    {
        Cursors::Use use(cursors_);
        bool const isThere = moveTo(address, *use, Loading::Never);
        auto const* const found = below(*use);
        if (found == nullptr || found->isNone()) {
            return;
        }
        if (auto const* const level = found->loaded()) {
            if (isThere) {
                pass(*level, children);
            }
            return;
        }
    }
    std::lock_guard const guard(loading_);
    loader_(address, children);
}

void MetadataTree::pass(Level const& level, ChildSink& children) const {
    level.forEach([&](Level::Position at) {
        auto const element = level.element(types_, at);
        auto const* const below = level.below(at);
        auto const* const loaded = below == nullptr ? nullptr : below->loaded();
        bool const hasChildren =
            below != nullptr && !below->isNone() && (loaded == nullptr || !loaded->empty());
        children.add(
            {element.getType(), element.getLocation(), level.node(at), level.isCreated(at), hasChildren});
    });
}

Node const& MetadataTree::Search::node(Address const& address) {
    static Node const none;
    cursor_.beginBeside(address);
    return tree_.descend(address, cursor_) ? nodeAt(cursor_) : none;
}

bool MetadataTree::moveTo(Address const& address, Cursor& cursor, Loading loading) const {
    cursor.begin(address);
    return descend(address, cursor, loading);
}

bool MetadataTree::descend(Address const& address, Cursor& cursor, Loading loading) const {
    while (!cursor.isAtEnd()) {
        auto* const level = levelBelow(cursor, address, loading);
        if (level == nullptr || !cursor.stepDown(*level, types_)) {
            return false;
        }
    }
    return true;
}

Level* MetadataTree::levelBelow(Cursor const& cursor, Address const& address, Loading loading) const {
    auto* const found = below(cursor);
    if (found == nullptr) {
        return nullptr;
    }
    auto* const level = found->loaded();
    if (level != nullptr || loading == Loading::Never || found->isNone()) {
        return level;
    }
    load(*found, firstSteps(address, cursor.depth()));
    return found->loaded();
}

LevelBelow* MetadataTree::below(Cursor const& cursor) const noexcept {
    auto const depth = cursor.depth();
    return depth == 0 ? &root_ : cursor.level(depth).below(cursor.position(depth));
}

void MetadataTree::load(LevelBelow& below, Address const& address) const {
    std::lock_guard const guard(loading_);
    if (below.loaded() == nullptr) {
        below.set(loadLevel(address));
    }
}

LevelPointer MetadataTree::loadLevel(Address const& address) const {
    builder_.begin();
    loader_(address, builder_);
    return builder_.finish();
}

MetadataTree::Undo MetadataTree::apply(Batch const& batch) {
    cursors_.reset();
    auto done = std::make_shared<UndoSteps>();
    done->steps.reserve(batch.size());
    try {
        Cursor cursor;
        for (auto const& change : batch) {
            if (change.kind == Change::Kind::Remove) {
                remove(change.address, cursor, *done);
            } else {
                set(change, cursor, *done);
            }
        }
    } catch (...) {
        undo(std::move(done));
        throw;
    }
    return done;
}

void MetadataTree::set(Change const& change, Cursor& cursor, UndoSteps& undo) {
    using Kind = UndoSteps::Kind;
    auto const& address = change.address;
    bool const isCreated = change.kind == Change::Kind::Create;
    cursor.beginBeside(address);
    bool const isThere = descend(address, cursor);
    // Below an address that this batch has added, no step is needed: undoing that one removes everything.
    bool const needsStep = !cursor.isBelowInserted();
    if (isThere) {
        auto& level = cursor.level(cursor.depth());
        auto const at = cursor.position(cursor.depth());
        if (needsStep) {
            undo.steps.push_back({Kind::Replaced, address, {level.node(at), level.isCreated(at), {}}});
        }
        level.setState(at, change.node, isCreated);
        return;
    }
    if (needsStep) {
        undo.steps.push_back({Kind::Added, firstSteps(address, cursor.depth() + 1), {}});
    }
    while (cursor.depth() + 1 < address.depth()) {
        insertBelow(cursor, {});
    }
    insertBelow(cursor, {change.node, isCreated, {}});
}

/// Inserts the next element of the cursor.
void MetadataTree::insertBelow(Cursor& cursor, Place place) {
    auto const depth = cursor.depth();
    auto& found = depth == 0
                      ? root_
                      : cursor.level(depth).makeBelow(cursor.position(depth)); // created if there is none
    if (found.isNone()) {
        found.set(Level::create(&memory_));
    }
    auto const& element = cursor.next();
    cursor.insertBelow(*found.loaded(), {types_.index(element.getType()), NewName(element.getLocation())},
                       std::move(place));
}

void MetadataTree::remove(Address const& address, Cursor& cursor, UndoSteps& undo) {
    cursor.beginBeside(address);
    if (!descend(address, cursor)) {
        return;
    }
    // An address above that has no node, was not created, and has no other children is deleted too.
    auto depth = cursor.depth();
    while (depth > 1 && cursor.level(depth).hasOneEntry()) {
        auto const& level = cursor.level(depth - 1);
        auto const at = cursor.position(depth - 1);
        if (level.node(at) || level.isCreated(at)) {
            break;
        }
        --depth;
    }
    undo.steps.push_back({UndoSteps::Kind::Removed, firstSteps(address, depth), {}});
    extract(cursor, depth, undo.steps.back().place);
}

/// Extracts the place of a step of the cursor.
void MetadataTree::extract(Cursor& cursor, std::size_t depth, Place& place) noexcept {
    place = cursor.level(depth).extract(cursor.position(depth));
    cursor.ascendTo(depth - 1);
}

void MetadataTree::undo(Undo undo) noexcept {
    if (!undo) {
        return;
    }
    cursors_.reset();
    Cursor cursor;
    for (auto step = undo->steps.rbegin(); step != undo->steps.rend(); ++step) {
        auto const& address = step->address;
        cursor.beginBeside(address);
        bool const isThere = descend(address, cursor); // not for a change that threw
        switch (step->kind) {
        case UndoSteps::Kind::Added:
            if (isThere) {
                extract(cursor, cursor.depth(), step->place);
            }
            break;
        case UndoSteps::Kind::Replaced:
            cursor.level(cursor.depth())
                .setState(cursor.position(cursor.depth()), std::move(step->place.node),
                          step->place.isCreated);
            break;
        case UndoSteps::Kind::Removed:
            insertBelow(cursor, std::move(step->place));
            break;
        }
    }
}

void MetadataTree::forget() noexcept {
    cursors_.reset();
    root_ = LevelBelow::unloaded();
}

void MetadataTree::applyChanges(Changes const& changes) {
    if (changes.everything || changes.differences.size() > mostReloaded) {
        forget();
        return;
    }
    if (changes.differences.empty()) {
        return;
    }
    cursors_.reset();
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
        Cursor cursor;
        auto* const found = moveTo(level, cursor, Loading::Never) ? below(cursor) : nullptr;
        if (found != nullptr && found->loaded() != nullptr) {
            reload(*found, level);
        }
    }
}

void MetadataTree::reload(LevelBelow& below, Address const& address) {
    auto reloaded = loadLevel(address);
    auto const& earlier = *below.loaded();
    Level::Position hint;
    reloaded->forEach([&](Level::Position at) {
        auto* const unloaded = reloaded->below(at);
        if (unloaded == nullptr) {
            return;
        }
        auto const element = reloaded->element(types_, at);
        auto const found =
            earlier.findNear(ElementKey(types_, element.getType(), element.getLocation()), hint);
        hint = found.position;
        auto* const known = found.isFound ? earlier.below(found.position) : nullptr;
        if (known != nullptr && known->loaded() != nullptr && !known->loaded()->empty()) {
            *unloaded = std::move(*known);
        }
    });
    below.set(std::move(reloaded));
}

} // namespace project::stores
