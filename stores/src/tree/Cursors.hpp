#pragma once

#include <array>
#include <atomic>
#include <cstddef>
#include <optional>

#include "tree/Cursor.hpp"

namespace project::stores {

/// The cursors of the threads that query one tree.
///
/// A thread always takes the cursor in the same slot. If another thread, for which the slot is the same, uses
/// it at this moment, the query gets a new cursor and begins at the root.
class Cursors {
    struct Slot;

public:
    /// A cursor for one query.
    class Use {
    public:
        explicit Use(Cursors& cursors);
        ~Use();
        Use(Use const&) = delete;
        Use& operator=(Use const&) = delete;

        Cursor& operator*() noexcept { return own_ ? *own_ : slot_.cursor; }

    private:
        Slot& slot_;
        std::optional<Cursor> own_;
    };

    /// Must be called after each change of the tree, and not during a query.
    void reset() noexcept;

private:
    static constexpr std::size_t slotCount = 8;
    static constexpr std::size_t cacheLine = 64;

    struct alignas(cacheLine) Slot {
        std::atomic<bool> isInUse = false;
        Cursor cursor;
    };

    Slot& slotOfThisThread() noexcept;

    std::array<Slot, slotCount> slots_;
};

} // namespace project::stores
