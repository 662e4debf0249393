#include <optional>
#include <string>

#include "Target.hpp"
#include "TextContents.hpp"
#include "text/TextLines.hpp"

namespace {

using namespace project::fuzz;
using project::stores::LineWalk;
using project::stores::MergeMarker;

struct Sides {
    std::string ours;
    std::string theirs;
};

/// The texts of both sides; nothing when the markers are not those of one merge behind the other, or there
/// are none.
std::optional<Sides> sidesOf(std::string_view text) {
    Sides sides;
    bool hasMarkers = false;
    MergeMarker within = MergeMarker::None;
    LineWalk walk(text, 0, 1);
    while (walk.next()) {
        MergeMarker const marker = project::stores::mergeMarker(walk.line().text);
        if (marker == MergeMarker::None) {
            bool const outside = within == MergeMarker::None;
            sides.ours += outside || within == MergeMarker::Ours ? walk.line().whole : "";
            sides.theirs += outside || within == MergeMarker::Theirs ? walk.line().whole : "";
            continue;
        }
        bool const follows = (marker == MergeMarker::Ours && within == MergeMarker::None) ||
                             (marker == MergeMarker::Base && within == MergeMarker::Ours) ||
                             (marker == MergeMarker::Theirs && within == MergeMarker::Ours) ||
                             (marker == MergeMarker::Theirs && within == MergeMarker::Base) ||
                             (marker == MergeMarker::End && within == MergeMarker::Theirs);
        if (!follows) {
            return std::nullopt;
        }
        hasMarkers = true;
        within = marker == MergeMarker::End ? MergeMarker::None : marker;
    }
    return hasMarkers && within == MergeMarker::None ? std::optional(sides) : std::nullopt;
}

void checkContains(Contents const& joined, Contents const& side, Contents const& other) {
    for (auto const& [address, line] : side) {
        auto const there = joined.find(address);
        require(there != joined.end(), "what a side has is there");
        auto const beside = other.find(address);
        bool const agreed = beside == other.end() || beside->second == line;
        require(!agreed || there->second == line, "what one side has, or both have alike, stands as it is");
    }
}

/// A text in which a merge left markers: nothing of either side is lost, and nothing else comes in.
void run(std::string_view input) {
    bool const whole = input.starts_with(R"({"format)") || input.starts_with("<<<<<<<");
    std::string const bytes = whole ? std::string(input) : framed(input);
    auto const text = readText(bytes);
    if (!text) {
        return;
    }
    checkText(*text, bytes);
    auto const sides = sidesOf(bytes);
    auto const ours = sides ? readText(sides->ours) : std::nullopt;
    auto const theirs = sides ? readText(sides->theirs) : std::nullopt;
    if (!ours || !theirs) {
        return;
    }
    Contents const joined = contentsOf(*text);
    Contents both = contentsOf(*ours);
    Contents const oursHas = both;
    Contents const theirsHas = contentsOf(*theirs);
    both.insert(theirsHas.begin(), theirsHas.end());
    checkContains(joined, oursHas, theirsHas);
    checkContains(joined, theirsHas, oursHas);
    require(joined.size() == both.size(), "nothing is there that no side has");
}

Registration const registration("conflict", run);

} // namespace
