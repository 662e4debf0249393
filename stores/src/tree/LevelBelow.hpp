#pragma once

#include <atomic>
#include <cstddef>
#include <memory>

namespace project::stores {

class Level;

/// Returns a level to the memory that it came from.
struct LevelDeleter {
    void operator()(Level* level) const noexcept;
};

using LevelPointer = std::unique_ptr<Level, LevelDeleter>;

/// The addresses directly below an address: there are none, or they are not loaded yet, or they are loaded.
///
/// One thread may load it while others read it: they see all of the level or nothing. Every other change must
/// not run at the same time as any operation.
class LevelBelow {
public:
    LevelBelow() noexcept = default;

    static LevelBelow unloaded() noexcept;

    LevelBelow(LevelBelow&& other) noexcept : level_(other.take()) {}

    LevelBelow& operator=(LevelBelow&& other) noexcept;
    ~LevelBelow();

    /// True if there is nothing below the address. It stays true during a load.
    bool isNone() const noexcept { return level_.load(std::memory_order_relaxed) == nullptr; }

    /// The loaded level; null if there is none, or if it is not loaded.
    Level* loaded() const noexcept {
        auto* const level = level_.load(std::memory_order_acquire);
        return level == unloadedMark() ? nullptr : level;
    }

    /// Publishes the level, in place of the mark that it is not loaded or of an earlier level.
    void set(LevelPointer level) noexcept;

private:
    /// An address that no level has. It is never dereferenced.
    static Level* unloadedMark() noexcept { return reinterpret_cast<Level*>(&unloadedMark_); }

    Level* take() noexcept;

    inline static std::max_align_t unloadedMark_{};

    std::atomic<Level*> level_ = nullptr;
};

} // namespace project::stores
