#include "MergeInput.hpp"

namespace {

using namespace project::fuzz;

/// Three versions: exchanging the sides changes neither the merged text nor the conflicts. Without a conflict
/// the merged text is sound.
void run(std::string_view input) {
    auto const parts = partsOf(input);
    std::string const base = baseOf(parts[0]);
    std::string const ours = textOf(parts[1]);
    std::string const theirs = textOf(parts[2]);
    auto const merge = merged(base, ours, theirs);
    if (!merge) {
        return;
    }
    auto const exchanged = merged(base, theirs, ours);
    require(exchanged.has_value(), "the sides can be exchanged");
    require(merge->conflicts().size() == exchanged->conflicts().size(),
            "exchanging the sides changes no conflict");
    if (merge->conflicts().empty()) {
        std::string const text = merge->text();
        require(text == exchanged->text(), "exchanging the sides changes nothing");
        requireSound(text);
        require(merge->textWithMarkers() == text, "a merge without conflicts has no markers");
    }
}

Registration const registration("merge", run);

} // namespace
