#pragma once

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <functional>
#include <memory>
#include <random>

#include "project/stores/Backend.hpp"

namespace project::test {

/// Lets eight processes run random operations on one store, each with a store object of its own, and decides
/// whether there is one order of all operations that explains what each of them saw.
class RandomProcesses {
public:
    /// How the processes use the store.
    struct Store {
        /// Opens the store in a process. @param lane the number of the process.
        std::function<std::unique_ptr<stores::Backend>(std::size_t lane, std::mt19937& random)> open;

        std::function<void(stores::Backend&)> tidy;

        /// Waits until no operation of a killed process can take effect any more.
        std::function<void(std::size_t lane)> awaitDeath = [](std::size_t) {};
    };

    enum class Deaths { None, Some };

    explicit RandomProcesses(Store store);

    /// Runs rounds for some time, and for the time of the nightly run if that is longer. Prints the number of
    /// operations. The test fails if the history of a round is not linearizable.
    /// @param deaths Some: processes are killed at random moments, and others take their place.
    void runFor(std::chrono::milliseconds usual, Deaths deaths);

    std::uint64_t operations() const { return operations_; }

    std::uint64_t deaths() const { return deaths_; }

private:
    void emptySlots();
    void runRound(std::chrono::milliseconds time, Deaths deaths);

    Store store_;
    std::uint64_t seed_;
    std::mt19937 random_;
    std::uint32_t lastValue_;
    std::uint64_t operations_ = 0;
    std::uint64_t deaths_ = 0;
};

} // namespace project::test
