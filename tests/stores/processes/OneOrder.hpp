#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <unordered_set>
#include <vector>

namespace project::test {

/// What stands at a few addresses of a store: three with two below each, a, a/x, a/y, b, b/x and so on.
struct Slots {
    static constexpr std::size_t count = 9;
    static constexpr std::size_t inGroup = 3; ///< the first one of a group stands above the other two

    static constexpr std::uint32_t nothing = 0;
    static constexpr std::uint32_t made = 1; ///< without a node; any higher number is a node's value

    std::array<std::uint32_t, count> values;

    friend bool operator==(Slots const&, Slots const&) = default;

    /// True when something is at an address or below it.
    bool exists(std::size_t slot) const;

    /// What a reader can see: an address without a node that something is below looks as if it was made.
    Slots seen() const;
};

/// What one process does at once with a store, and what it sees of it.
struct Operation {
    enum class Kind : std::uint8_t { Read, Set, Remove, Make };

    Kind kind;
    bool hasSeen;       ///< also of a write, when it has read under the same guard before
    std::uint16_t mask; ///< the slots that it writes, one bit each
    std::uint32_t value;
    Slots seen;

    /// What is there after it; empty when it saw something else than what was there before.
    std::optional<Slots> applyTo(Slots const& before) const;
};

/// Decides whether what several processes did and saw is as if each operation was done at one moment between
/// its begin and its end.
///
/// Follows the history in time with all the states in which the store can be, each with those of the
/// unfinished operations that are done in it. When an operation ends, only the states stay in which it is
/// done. A state is followed in every order that unfinished writes can have, so operations should see much of
/// what they change; readers cost nothing, since a read is done as soon as there is what it saw.
class OneOrder {
public:
    static constexpr std::size_t lanes = 8;

    explicit OneOrder(Slots const& atFirst) : possible_{{atFirst, 0}} {}

    /// A process, which is in no other operation, begins one. Of a read all must be known already.
    void begin(std::size_t lane, Operation const& operation);

    /// @return false when there is no order in which all of it happened so far.
    bool end(std::size_t lane);

    /// A process died: the operation that it was in is done or is not.
    void die(std::size_t lane);

    /// All that a reader could see if nothing was going on.
    std::size_t countPossible() const { return possible_.size(); }

private:
    struct Possible {
        Slots slots;
        std::uint32_t done; ///< one bit for each lane whose operation is done

        friend bool operator==(Possible const&, Possible const&) = default;
    };

    struct Hash {
        std::size_t operator()(Possible const& possible) const noexcept;
    };

    using Set = std::unordered_set<Possible, Hash>;

    /// The possible states after any of the unfinished operations in any order, up to a lane's.
    Set doneIn(std::size_t lane) const;
    Possible withReads(Possible possible) const;

    std::array<std::optional<Operation>, lanes> pending_;
    Set possible_;
};

} // namespace project::test
