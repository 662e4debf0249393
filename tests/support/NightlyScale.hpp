#pragma once

#include <charconv>
#include <cstdint>
#include <cstdlib>
#include <random>
#include <string_view>

namespace project::test {

/// The number by which the nightly run scales a test, from the environment, or the usual one.
inline std::uint64_t numberFromEnvironment(char const* name, std::uint64_t usual) {
    char const* const text = std::getenv(name);
    std::string_view const digits(text != nullptr ? text : "");
    std::uint64_t number = usual;
    std::from_chars(digits.data(), digits.data() + digits.size(), number);
    return number;
}

/// The duration of a test that runs for a time.
inline std::uint64_t testSeconds(std::uint64_t usual) {
    return numberFromEnvironment("PROJECT_TEST_SECONDS", usual);
}

/// The seed of random choices, which differs in each run unless one is given to repeat a run. A test that
/// fails must show it.
inline std::uint64_t testSeed() {
    return numberFromEnvironment("PROJECT_TEST_SEED", std::random_device()());
}

} // namespace project::test
