#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <string_view>

#include "Target.hpp"

namespace {

/// The target that the environment names.
project::fuzz::Target const& chosenTarget() {
    auto const* const named = std::getenv("PROJECT_FUZZ_TARGET");
    std::string_view const name = named == nullptr ? "" : named;
    auto const& all = project::fuzz::targets();
    auto const found = std::find_if(all.begin(), all.end(),
                                    [&](project::fuzz::Target const& target) { return target.name == name; });
    if (found == all.end()) {
        std::fputs("Set PROJECT_FUZZ_TARGET to the name of a folder in fuzz/corpus.\n", stderr);
        std::exit(1);
    }
    return *found;
}

} // namespace

/// libFuzzer calls this with each input. The exception of a broken law ends the program, which libFuzzer
/// reports as a failure.
extern "C" int LLVMFuzzerTestOneInput(std::uint8_t const* bytes, std::size_t size) {
    static project::fuzz::Target const target = chosenTarget();
    auto const* const text = reinterpret_cast<char const*>(bytes); // NOLINT: libFuzzer passes bytes
    target.run({text, size});
    return 0;
}
