#include "project/stores/TextMerge.hpp"

#include <algorithm>
#include <optional>
#include <stdexcept>
#include <utility>

#include "merge/DisputedBase.hpp"
#include "merge/FollowedRenames.hpp"
#include "merge/MergedBody.hpp"
#include "moves/MovedBody.hpp"
#include "project/stores/StoreError.hpp"
#include "text/ConflictReader.hpp"
#include "text/TextLines.hpp"
#include "text/TextReader.hpp"
#include "texts/ErrorTexts.hpp"

namespace project::stores {

namespace {

Fault const* firstFault(TextReading const& reading, Fault::Kind kind) {
    auto const found = std::ranges::find(reading.faults, kind, &Fault::kind);
    return found == reading.faults.end() ? nullptr : &*found;
}

/// Reads a version, unless the merge could silently lose something of it. A torn tail is ignored, as
/// everywhere.
TextReading readUndamaged(std::string_view text, char const* version) {
    std::optional<TextReading> reading = readText(std::string(text), version);
    if (!reading) {
        auto const lines = static_cast<std::size_t>(std::count(text.begin(), text.end(), '\n'));
        throw StoreError(StoreError::Kind::Damaged, version,
                         lines + (text.empty() || text.back() != '\n' ? 1 : 0),
                         errorTexts.get("TextUnfinished"), "");
    }
    if (auto const* const damage = firstFault(*reading, Fault::Kind::Damage)) {
        throw StoreError(StoreError::Kind::Damaged, version, damage->line,
                         errorTexts.get("VersionDamaged", damage->problem),
                         errorTexts.get("RemedyOfDamagedVersion"));
    }
    return *std::move(reading);
}

TextBody bodyOf(TextReading reading) {
    bool const isTidy = reading.isCanonical && reading.content.overlay().empty();
    return isTidy ? std::move(reading.content.body()) : reading.content.write({});
}

TextBody readSide(std::string_view text, char const* version) {
    auto reading = readUndamaged(text, version);
    if (auto const* const conflict = firstFault(reading, Fault::Kind::Conflict)) {
        throw StoreError(StoreError::Kind::Conflict, version, conflict->line,
                         errorTexts.get("VersionConflicted"), errorTexts.get("RemedyOfConflictedVersion"));
    }
    return bodyOf(std::move(reading));
}

/// An ASCII text that neither body contains.
std::string textInNeither(TextBody const& ours, TextBody const& theirs) {
    std::string text = "(disputed)";
    auto const isIn = [&](TextBody const& body) { return body.bytes().find(text) != std::string::npos; };
    while (isIn(ours) || isIn(theirs)) {
        text += ')';
    }
    return text;
}

TextBody readBase(std::string_view text, TextBody const& ours, TextBody const& theirs) {
    if (text.empty()) {
        return {};
    }
    constexpr char const* version = "base";
    auto reading = readUndamaged(text, version);
    if (firstFault(reading, Fault::Kind::Conflict) == nullptr) {
        return bodyOf(std::move(reading));
    }
    auto const [first, second] = sidesOfConflictedText(std::string(text));
    std::string const disputed = textInNeither(ours, theirs);
    return disputedBase(bodyOf(readUndamaged(first, version)), bodyOf(readUndamaged(second, version)),
                        std::u16string(disputed.begin(), disputed.end()));
}

void appendPart(std::string& out, std::string_view marker, std::string_view lines) {
    out += marker;
    out += '\n';
    out += lines;
}

std::string withMarkers(ThreeWay<std::string> const& lines) {
    std::string text;
    appendPart(text, "<<<<<<< ours", lines.ours);
    appendPart(text, "||||||| base", lines.base);
    appendPart(text, "=======", lines.theirs);
    appendPart(text, ">>>>>>> theirs", "");
    return text;
}

} // namespace

class TextMerge::State {
public:
    explicit State(MergedBody merged) : merged_(std::move(merged)) {}

    std::vector<MergeConflict> const& conflicts() const noexcept { return merged_.conflicts; }

    /// @param linesOf gives the lines of a site.
    template <typename LinesOf>
    std::string text(LinesOf const& linesOf) const {
        std::string text;
        text.reserve(merged_.lines.size() + firstLine.size() + endLine.size() + 2);
        text += firstLine;
        text += '\n';
        std::size_t written = 0;
        for (MergeSite const& site : merged_.sites) {
            text.append(merged_.lines, written, site.offset - written);
            text += linesOf(site);
            written = site.offset;
        }
        text.append(merged_.lines, written);
        text += endLine;
        text += '\n';
        return text;
    }

private:
    MergedBody merged_;
};

TextMerge::TextMerge(std::unique_ptr<State const> state) noexcept : state_(std::move(state)) {
}

TextMerge::TextMerge(TextMerge&&) noexcept = default;
TextMerge& TextMerge::operator=(TextMerge&&) noexcept = default;
TextMerge::~TextMerge() = default;

std::vector<MergeConflict> const& TextMerge::conflicts() const noexcept {
    return state_->conflicts();
}

std::string TextMerge::text(std::vector<MergeSide> const& choices) const {
    if (choices.size() != conflicts().size()) {
        throw std::invalid_argument(errorTexts.get("ChoicesWrong"));
    }
    MergeSide const* next = choices.data();
    return state_->text([&](MergeSite const& site) {
        MergeSide const* const own = std::exchange(next, next + site.conflicts);
        return chosenLines(site, own);
    });
}

std::string TextMerge::textWithMarkers() const {
    return state_->text([](MergeSite const& site) { return withMarkers(site.lines); });
}

TextMerge mergeTexts(std::string_view base, std::string_view ours, std::string_view theirs) {
    return mergeTexts(base, ours, theirs, {}, {});
}

TextMerge mergeTexts(std::string_view base, std::string_view ours, std::string_view theirs,
                     SideRenames const& ourRenames, SideRenames const& theirRenames) {
    ThreeWay<TextBody> bodies{{}, readSide(ours, "ours"), readSide(theirs, "theirs")};
    bodies.base = readBase(base, bodies.ours, bodies.theirs);
    auto const moves = followedRenames(bodies, ourRenames, theirRenames);
    bodies = {movedBody(std::move(bodies.base), moves.base), movedBody(std::move(bodies.ours), moves.ours),
              movedBody(std::move(bodies.theirs), moves.theirs)};
    return TextMerge(std::make_unique<TextMerge::State const>(mergeBodies(bodies)));
}

} // namespace project::stores
