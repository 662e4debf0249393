#include <algorithm>
#include <vector>

#include "MergeInput.hpp"

namespace {

using namespace project::fuzz;
using project::stores::Fault;
using project::stores::MergeSide;
using project::stores::TextMerge;

void checkMarkers(TextMerge const& merge) {
    auto const read = readText(merge.textWithMarkers());
    require(read.has_value(), "a text with markers can be read");
    require(!read->faults().empty(), "there are markers where there are conflicts");
    require(std::ranges::all_of(read->faults(),
                                [](Fault const& fault) { return fault.kind == Fault::Kind::Conflict; }),
            "a text with markers has no other faults");
    canonicalOf(*read);
}

/// Three versions in conflict: every choice gives a sound text, and the text with markers can be read.
void run(std::string_view input) {
    auto const parts = partsOf(input);
    auto const merge = merged(baseOf(parts[0]), textOf(parts[1]), textOf(parts[2]));
    if (!merge || merge->conflicts().empty()) {
        return;
    }
    std::vector<MergeSide> choices(merge->conflicts().size(), MergeSide::Ours);
    requireSound(merge->text(choices));
    choices.front() = MergeSide::Theirs;
    requireSound(merge->text(choices));
    std::ranges::fill(choices, MergeSide::Theirs);
    requireSound(merge->text(choices));
    checkMarkers(*merge);
}

Registration const registration("resolution", run);

} // namespace
