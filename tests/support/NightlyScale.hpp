#pragma once

#include <charconv>
#include <cstdint>
#include <cstdlib>
#include <random>
#include <string_view>

namespace project::test {

/// A number from the environment by which the nightly run makes a test larger, or the usual one.
inline std::uint64_t numberFromEnvironment(char const* name, std::uint64_t usual) {
    char const* const text = std::getenv(name);
    std::string_view const digits(text != nullptr ? text : "");
    std::uint64_t number = usual;
    std::from_chars(digits.data(), digits.data() + digits.size(), number);
    return number;
}

/// How long a test that goes on for a time goes on.
inline std::uint64_t testSeconds(std::uint64_t usual) {
    return numberFromEnvironment("PROJECT_TEST_SECONDS", usual);
}

/// What random choices begin with: another one in each run, unless one is given to repeat a run. To be shown
/// when a test fails.
inline std::uint64_t testSeed() {
    return numberFromEnvironment("PROJECT_TEST_SEED", std::random_device()());
}

} // namespace project::test
