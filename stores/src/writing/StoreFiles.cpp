#include "writing/StoreFiles.hpp"

#include <array>
#include <cstdio>
#include <random>

#include <unistd.h>
#include <xxhash.h>

namespace project::stores {

namespace {

constexpr std::string_view temporaryStart = "project.jsonl.";
constexpr std::string_view temporaryEnd = ".tmp";
constexpr std::string_view swapEnd = ".swap.tmp";
constexpr std::string_view displacedStart = "displaced-";

std::string hex(std::uint64_t number) {
    std::array<char, 17> text{};
    std::snprintf(text.data(), text.size(), "%016llx", static_cast<unsigned long long>(number));
    return text.data();
}

std::string randomHex() {
    std::random_device device;
    return hex((std::uint64_t{device()} << 32) | device());
}

constexpr std::size_t digitsOfFile = 8; ///< of the 16 of a state

/// A short text that identifies a state of a file, whatever its name: one half for the file, one for its
/// state.
std::string stateOf(FileIdentity const& file) {
    constexpr unsigned half = 32;
    std::array<std::uint64_t, 2> const state{file.size, static_cast<std::uint64_t>(file.modified)};
    auto const ofFile = XXH3_64bits(&file.inode, sizeof(file.inode)) >> half;
    auto const ofState = XXH3_64bits(state.data(), sizeof(state)) >> half;
    return hex((ofFile << half) | ofState);
}

} // namespace

std::string StoreFiles::newTemporary() {
    return std::string(temporaryStart) + std::to_string(::getpid()) + "-" + randomHex() +
           std::string(temporaryEnd);
}

std::string StoreFiles::swapping(FileIdentity const& old, FileIdentity const& fresh) {
    return std::string(temporaryStart) + stateOf(old) + "-" + stateOf(fresh) + std::string(swapEnd);
}

std::string StoreFiles::newDisplaced() {
    return std::string(displacedStart) + randomHex();
}

std::string StoreFiles::newDamaged() {
    return "damaged-" + randomHex() + ".jsonl";
}

bool StoreFiles::isTemporary(std::string_view name) {
    return name.starts_with(temporaryStart) && name.ends_with(temporaryEnd) &&
           name.size() > temporaryStart.size() + temporaryEnd.size();
}

bool StoreFiles::isDisplaced(std::string_view name) {
    return name.starts_with(displacedStart);
}

bool StoreFiles::Swap::isOld(FileIdentity const& file) const {
    return stateOf(file) == oldState;
}

bool StoreFiles::Swap::isOldFile(FileIdentity const& file) const {
    return stateOf(file).compare(0, digitsOfFile, oldState, 0, digitsOfFile) == 0;
}

bool StoreFiles::Swap::isNew(FileIdentity const& file) const {
    return stateOf(file) == newState;
}

std::optional<StoreFiles::Swap> StoreFiles::parseSwapping(std::string_view name) {
    constexpr std::size_t digits = 16;
    if (name.size() != temporaryStart.size() + digits + 1 + digits + swapEnd.size() ||
        !name.starts_with(temporaryStart) || !name.ends_with(swapEnd)) {
        return std::nullopt;
    }
    name.remove_prefix(temporaryStart.size());
    return Swap{std::string(name.substr(0, digits)), std::string(name.substr(digits + 1, digits))};
}

} // namespace project::stores
