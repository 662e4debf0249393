#include "text/ConflictReader.hpp"

#include <algorithm>
#include <iterator>
#include <span>
#include <utility>

#include "line/LineParser.hpp"
#include "text/TextLines.hpp"
#include "text/TextSum.hpp"
#include "text/TextTail.hpp"
#include "texts/ErrorTexts.hpp"

namespace project::stores {

namespace {

struct Sides {
    std::vector<TextLine> ours;
    std::vector<TextLine> theirs;
    std::vector<Fault> faults; ///< one for each conflict
};

Sides split(std::string const& bytes) {
    Sides sides;
    MergeMarker within = MergeMarker::None;
    LineWalk walk(bytes, 0, 1);
    while (walk.next()) {
        TextLine const& line = walk.line();
        MergeMarker const marker = mergeMarker(line.text);
        if (marker == MergeMarker::None) {
            if (within == MergeMarker::None || within == MergeMarker::Ours) {
                sides.ours.push_back(line);
            }
            if (within == MergeMarker::None || within == MergeMarker::Theirs) {
                sides.theirs.push_back(line);
            }
            continue;
        }
        if (marker == MergeMarker::Ours || within == MergeMarker::None) {
            sides.faults.push_back({Fault::Kind::Conflict, line.number, errorTexts.get("ConflictMarkers")});
        }
        bool const isEnd =
            marker == MergeMarker::End || (marker == MergeMarker::Theirs && within == MergeMarker::None);
        within = isEnd ? MergeMarker::None : marker;
    }
    return sides;
}

/// One side. Its lines need no order, because nothing is searched in them.
class Side {
public:
    explicit Side(std::span<TextLine const> lines) : lines_(lines) {}

    /// @return false if its first line is incomplete.
    bool hasFirstLine(std::string const& file) const {
        return !lines_.empty() && checkFirstLine(lines_.front().text, lines_.front().hasEnd(), file);
    }

    /// @return false if it does not contain the last line of the body.
    bool read() {
        std::size_t i = 1;
        TextSum sum;
        sum.add(lines_.front().text);
        for (; i < lines_.size() && lines_[i].text != endLine; ++i) {
            sum.add(lines_[i].text);
            bodyLine(lines_[i]);
        }
        bool const hasEndLine = i < lines_.size();
        if (hasEndLine) {
            sum.add(lines_[i].text);
            readTailOf(lines_.subspan(i + 1), sum.hex());
        }
        content.finishJoining();
        return hasEndLine;
    }

    TextContent content;
    std::vector<Fault> faults;
    std::map<std::size_t, std::string> damage;

private:
    void bodyLine(TextLine const& line) {
        ParsedLine const parsed = parseBodyLine(line.text);
        if (parsed.change) {
            content.join(*parsed.change);
        } else if (!line.text.empty()) {
            faults.push_back({Fault::Kind::Damage, line.number, errorTexts.get(parsed.problem)});
            damage.emplace(line.number, line.whole);
        }
    }

    void readTailOf(std::span<TextLine const> lines, std::string after) {
        TailReading tail = readTail({lines.begin(), lines.end()}, std::move(after));
        applyTail(content, tail);
        std::move(tail.faults.begin(), tail.faults.end(), std::back_inserter(faults));
        damage.merge(tail.damage);
    }

    std::span<TextLine const> lines_;
};

std::string joined(std::vector<TextLine> const& lines) {
    std::string text;
    for (TextLine const& line : lines) {
        text += line.whole;
    }
    return text;
}

/// Sorts faults by line. Faults in lines of both sides are reported once.
void sortFaults(std::vector<Fault>& faults) {
    std::stable_sort(faults.begin(), faults.end(),
                     [](Fault const& left, Fault const& right) { return left.line < right.line; });
    auto const isSame = [](Fault const& left, Fault const& right) {
        return left.line == right.line && left.kind == right.kind && left.problem == right.problem;
    };
    faults.erase(std::unique(faults.begin(), faults.end(), isSame), faults.end());
}

} // namespace

std::optional<TextReading> readConflictedText(std::string bytes, std::string const& file) {
    Sides sides = split(bytes);
    Side ours(sides.ours);
    Side theirs(sides.theirs);
    if (!ours.hasFirstLine(file) || !theirs.hasFirstLine(file)) {
        return std::nullopt;
    }
    bool const isOursComplete = ours.read();
    bool const isTheirsComplete = theirs.read();
    if (!isOursComplete && !isTheirsComplete) {
        return std::nullopt;
    }
    TextReading reading;
    reading.faults = std::move(sides.faults);
    for (Side* const side : {&ours, &theirs}) {
        for (auto const& [address, entry] : side->content.overlay().entries()) {
            if (entry.state) {
                auto const kind = entry.state.node ? Change::Kind::Set : Change::Kind::Create;
                reading.content.join({kind, address, entry.state.node});
            }
        }
        std::move(side->faults.begin(), side->faults.end(), std::back_inserter(reading.faults));
        reading.damage.merge(side->damage);
    }
    reading.content.finishJoining();
    sortFaults(reading.faults);
    reading.isCanonical = false;
    reading.content.body() = TextBody(std::move(bytes));
    return reading;
}

std::pair<std::string, std::string> sidesOfConflictedText(std::string const& bytes) {
    Sides const sides = split(bytes);
    return {joined(sides.ours), joined(sides.theirs)};
}

} // namespace project::stores
