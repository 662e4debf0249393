#pragma once

#include <memory_resource>

#include "project/stores/Node.hpp"
#include "tree/Level.hpp"
#include "tree/TypeTable.hpp"

namespace project::stores {

/// Builds a level from children that arrive sorted, without unused memory. Can be used again and keeps its
/// own memory for that.
class LevelBuilder : public ChildSink {
public:
    /// @param memory for the levels.
    LevelBuilder(TypeTable& types, std::pmr::memory_resource* memory) : types_(types), memory_(memory) {}

    /// Discards the children of a level that was not finished.
    void begin();

    void add(LoadedChild const& child) override;

    LevelPointer finish();

private:
    void addChunk();

    TypeTable& types_;
    std::pmr::memory_resource* memory_;
    Chunk chunk_{std::pmr::get_default_resource()};
    LevelPointer level_;
};

} // namespace project::stores
