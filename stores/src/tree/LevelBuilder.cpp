#include "tree/LevelBuilder.hpp"

#include <utility>

namespace project::stores {

void LevelBuilder::begin() {
    chunk_.clear();
    level_ = Level::create(memory_);
}

void LevelBuilder::add(LoadedChild const& child) {
    if (chunk_.size() == Chunk::mostEntries) {
        addChunk();
    }
    chunk_.insert(chunk_.size(), {types_.index(child.type), NewName(child.location)},
                  {child.node, child.isCreated, child.hasChildren ? LevelBelow::unloaded() : LevelBelow()});
}

LevelPointer LevelBuilder::finish() {
    if (!chunk_.empty()) {
        addChunk();
    }
    level_->trim();
    return std::move(level_);
}

void LevelBuilder::addChunk() {
    level_->append(chunk_.takeTrimmed(memory_));
}

} // namespace project::stores
