#include "MergeInput.hpp"

namespace {

using namespace project::fuzz;

/// Two versions: a merge in which at most one side changed the base gives the version of that side.
void run(std::string_view input) {
    auto const parts = partsOf(input);
    std::string const base = baseOf(parts[0]);
    std::string const side = textOf(parts[1]);
    auto const first = merged(base, side, base);
    if (!first) {
        return;
    }
    std::string const tidy = readText(side)->rewrittenWith({}).body();
    auto const check = [&](auto const& merge) {
        require(merge && merge->conflicts().empty(), "a change of one side is not a conflict");
        require(merge->text() == tidy, "a change of one side is applied");
    };
    check(first);
    check(merged(base, base, side));
    check(merged(base, side, side));
    check(merged("", side, side));
}

Registration const registration("unchanged", run);

} // namespace
