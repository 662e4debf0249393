#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <unordered_set>
#include <vector>

namespace project::test {

/// The values at a few addresses of a store: three with two below each, a, a/x, a/y, b, b/x and so on.
struct Slots {
    static constexpr std::size_t count = 9;
    static constexpr std::size_t inGroup = 3; ///< the first slot of a group is above the other two

    static constexpr std::uint32_t nothing = 0;
    static constexpr std::uint32_t created = 1; ///< created without a node; values of nodes are higher

    std::array<std::uint32_t, count> values;

    friend bool operator==(Slots const&, Slots const&) = default;

    /// True if an address or one below it has a value.
    bool exists(std::size_t slot) const;

    /// The values as a reader sees them: an address without a node and with values below it appears as
    /// created.
    Slots seen() const;
};

/// One operation of a process on a store, with the values that the process saw.
struct Operation {
    enum class Kind : std::uint8_t { Read, Set, Remove, Create };

    Kind kind;
    bool hasSeen = false;   ///< also for a write, if it read under the same guard before
    std::uint16_t mask = 0; ///< the slots that it writes, one bit each
    std::uint32_t value = 0;
    Slots seen{};

    /// The values after it; nothing if it saw other values than those before.
    std::optional<Slots> applyTo(Slots const& before) const;
};

/// Decides whether a history of several processes is linearizable: as if each operation took effect at one
/// moment between its begin and its end.
///
/// Follows the history in time with all possible states of the store, each with the unfinished operations
/// that have taken effect in it. When an operation ends, only the states remain in which it has taken effect.
/// Unfinished writes are tried in every order, so operations should see much of what they change. Reads are
/// cheap, since a read takes effect as soon as the values are those that it saw.
class Linearizability {
public:
    static constexpr std::size_t lanes = 8;

    explicit Linearizability(Slots const& atFirst) : possible_{{atFirst, 0}} {}

    /// A process begins an operation. The values that a read sees must already be known.
    void begin(std::size_t lane, Operation const& operation);

    /// @return false if the history so far is not linearizable.
    bool end(std::size_t lane);

    /// A process died: its operation has taken effect or not.
    void die(std::size_t lane);

    /// The number of states that a reader could see now.
    std::size_t countPossible() const { return possible_.size(); }

private:
    struct Possible {
        Slots slots;
        std::uint32_t done; ///< one bit for each lane whose operation has taken effect

        friend bool operator==(Possible const&, Possible const&) = default;
    };

    struct Hash {
        std::size_t operator()(Possible const& possible) const noexcept;
    };

    using Set = std::unordered_set<Possible, Hash>;

    /// The possible states after any unfinished operations in any order, including a lane's.
    Set doneIn(std::size_t lane) const;
    Possible withReads(Possible possible) const;

    std::array<std::optional<Operation>, lanes> pending_;
    Set possible_;
};

} // namespace project::test
