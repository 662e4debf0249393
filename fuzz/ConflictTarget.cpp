#include <optional>
#include <string>

#include "Target.hpp"
#include "TextContents.hpp"
#include "TextInput.hpp"
#include "text/TextLines.hpp"

namespace {

using namespace project::fuzz;
using project::stores::LineWalk;
using project::stores::MergeMarker;

struct Sides {
    std::string ours;
    std::string theirs;
};

/// The texts of both sides; nothing if there are no markers, or if they are not those of consecutive
/// conflicts.
std::optional<Sides> sidesOf(std::string_view text) {
    Sides sides;
    bool hasMarkers = false;
    MergeMarker region = MergeMarker::None;
    LineWalk walk(text, 0, 1);
    while (walk.next()) {
        MergeMarker const marker = project::stores::mergeMarker(walk.line().text);
        if (marker == MergeMarker::None) {
            bool const isOutside = region == MergeMarker::None;
            sides.ours += isOutside || region == MergeMarker::Ours ? walk.line().whole : "";
            sides.theirs += isOutside || region == MergeMarker::Theirs ? walk.line().whole : "";
            continue;
        }
        bool const follows = (marker == MergeMarker::Ours && region == MergeMarker::None) ||
                             (marker == MergeMarker::Base && region == MergeMarker::Ours) ||
                             (marker == MergeMarker::Theirs && region == MergeMarker::Ours) ||
                             (marker == MergeMarker::Theirs && region == MergeMarker::Base) ||
                             (marker == MergeMarker::End && region == MergeMarker::Theirs);
        if (!follows) {
            return std::nullopt;
        }
        hasMarkers = true;
        region = marker == MergeMarker::End ? MergeMarker::None : marker;
    }
    return hasMarkers && region == MergeMarker::None ? std::optional(sides) : std::nullopt;
}

void checkContains(Contents const& joined, Contents const& side, Contents const& other) {
    for (auto const& [address, line] : side) {
        auto const inJoined = joined.find(address);
        require(inJoined != joined.end(), "the content of each side is kept");
        auto const inOther = other.find(address);
        bool const isAgreed = inOther == other.end() || inOther->second == line;
        require(!isAgreed || inJoined->second == line, "a node of one side, or equal on both, is unchanged");
    }
}

/// A text in which a merge left markers: it has the content of both sides and nothing else.
void run(std::string_view input) {
    std::string const bytes = textOf(input);
    auto const sides = sidesOf(bytes);
    auto const text = sides ? readText(bytes) : std::nullopt;
    auto const ours = text ? readText(sides->ours) : std::nullopt;
    auto const theirs = ours ? readText(sides->theirs) : std::nullopt;
    if (!theirs) {
        return;
    }
    Contents const joined = contentsOf(*text);
    Contents const oursHas = contentsOf(*ours);
    Contents const theirsHas = contentsOf(*theirs);
    Contents both = oursHas;
    both.insert(theirsHas.begin(), theirsHas.end());
    checkContains(joined, oursHas, theirsHas);
    checkContains(joined, theirsHas, oursHas);
    require(joined.size() == both.size(), "no content comes from elsewhere");
}

Registration const registration("conflict", run);

} // namespace
