#include "tree/LevelBelow.hpp"

#include <memory_resource>
#include <utility>

#include "tree/Level.hpp"

namespace project::stores {

void LevelDeleter::operator()(Level* level) const noexcept {
    std::pmr::polymorphic_allocator<Level>(level->memory()).delete_object(level);
}

LevelBelow LevelBelow::unloaded() noexcept {
    LevelBelow result;
    result.level_.store(unloadedMark(), std::memory_order_relaxed);
    return result;
}

LevelBelow& LevelBelow::operator=(LevelBelow&& other) noexcept {
    auto* const level = other.take();
    set(nullptr);
    level_.store(level, std::memory_order_relaxed);
    return *this;
}

LevelBelow::~LevelBelow() {
    set(nullptr);
}

void LevelBelow::set(LevelPointer level) noexcept {
    auto* const before = level_.load(std::memory_order_relaxed);
    level_.store(level.release(), std::memory_order_release);
    if (before != nullptr && before != unloadedMark()) {
        LevelPointer const deleted(before);
    }
}

Level* LevelBelow::take() noexcept {
    auto* const level = level_.load(std::memory_order_relaxed);
    level_.store(nullptr, std::memory_order_relaxed);
    return level;
}

} // namespace project::stores
