#include <cstddef>
#include <cstdint>

#include "Target.hpp"

/// What libFuzzer calls with each input. The program has one target. A broken law ends it, which libFuzzer
/// takes for the find that it is.
extern "C" int LLVMFuzzerTestOneInput(std::uint8_t const* bytes, std::size_t size) {
    auto const* const text = reinterpret_cast<char const*>(bytes); // NOLINT: it comes as bytes
    project::fuzz::targets().front().run({text, size});
    return 0;
}
