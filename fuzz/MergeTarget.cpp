#include <algorithm>
#include <array>
#include <optional>
#include <string>
#include <vector>

#include "TailLines.hpp"
#include "Target.hpp"
#include "TextContents.hpp"
#include "project/stores/StoreError.hpp"
#include "project/stores/TextMerge.hpp"

namespace {

using namespace project::fuzz;
using project::stores::Fault;
using project::stores::MergeSide;
using project::stores::mergeTexts;
using project::stores::TextMerge;

/// Lines of a body, and behind a line "+" those of a tail.
std::string versionOf(std::string_view lines) {
    constexpr std::string_view behindBody = "\n+\n";
    std::size_t const end = lines.find(behindBody);
    std::string text = framed(lines.substr(0, end));
    if (end != lines.npos) {
        for (std::string const& piece : tailOf(lines.substr(end + behindBody.size()), text)) {
            text += piece;
        }
    }
    return text;
}

/// Three parts, parted by lines "---"; those that are missing are empty.
std::array<std::string_view, 3> partsOf(std::string_view input) {
    constexpr std::string_view border = "\n---\n";
    std::array<std::string_view, 3> parts;
    for (std::string_view& part : parts) {
        std::size_t const end = std::min(input.find(border), input.size());
        part = input.substr(0, end);
        input.remove_prefix(std::min(end + border.size(), input.size()));
    }
    return parts;
}

std::optional<TextMerge> merged(std::string const& base, std::string const& ours, std::string const& theirs) {
    try {
        return mergeTexts(base, ours, theirs);
    } catch (project::stores::StoreError const&) {
        return std::nullopt;
    }
}

void requireSound(std::string const& text) {
    auto const read = readText(text);
    require(read && read->faults().empty() && read->isTidy(), "a merged text is sound and tidy");
    contentsOf(*read);
}

std::vector<MergeSide> all(TextMerge const& merge, MergeSide side) {
    return std::vector(merge.conflicts().size(), side);
}

void checkMarkers(TextMerge const& merge) {
    std::string const marked = merge.textWithMarkers();
    auto const read = readText(marked);
    require(read.has_value(), "a text with markers can be read");
    bool hasConflict = false;
    for (Fault const& fault : read->faults()) {
        hasConflict = hasConflict || fault.kind == Fault::Kind::Conflict;
        require(fault.kind == Fault::Kind::Conflict, "a text with markers has nothing else wrong with it");
    }
    require(hasConflict == !merge.conflicts().empty(), "there are markers where there are conflicts");
    contentsOf(*read);
}

void checkExchanged(TextMerge const& merge, TextMerge const& exchanged) {
    require(merge.conflicts().size() == exchanged.conflicts().size(),
            "exchanging the sides changes no conflict");
    if (merge.conflicts().empty()) {
        require(merge.text() == exchanged.text(), "exchanging the sides changes nothing");
    }
    requireSound(merge.text(all(merge, MergeSide::Ours)));
    requireSound(merge.text(all(merge, MergeSide::Theirs)));
    checkMarkers(merge);
    if (merge.conflicts().size() > 1) {
        std::vector<MergeSide> mixed = all(merge, MergeSide::Ours);
        mixed.front() = MergeSide::Theirs;
        requireSound(merge.text(mixed));
    }
}

/// A merge in which one side, or nobody, changed something gives what the other one has.
void checkUnchanged(std::string const& base, std::string const& side) {
    std::string const tidy = readText(side)->rewrittenWith({}).body();
    for (auto const& merge : {merged(base, side, base), merged(base, base, side), merged(base, side, side),
                              merged("", side, side)}) {
        require(merge && merge->conflicts().empty(), "what only one side changed is no conflict");
        require(merge->text() == tidy, "what only one side changed is taken");
    }
}

/// Three versions.
void run(std::string_view input) {
    auto const parts = partsOf(input);
    std::string const base = versionOf(parts[0]);
    std::string const ours = versionOf(parts[1]);
    std::string const theirs = versionOf(parts[2]);
    auto const merge = merged(base, ours, theirs);
    if (!merge) {
        return;
    }
    checkExchanged(*merge, *merged(base, theirs, ours));
    checkUnchanged(base, ours);
    checkUnchanged(base, theirs);
    auto const both = merged("", ours, theirs);
    checkExchanged(*both, *merged("", theirs, ours));
}

Registration const registration("merge", run);

} // namespace
