#include "text/TextReader.hpp"

#include <algorithm>
#include <iterator>
#include <utility>

#include "line/CanonicalLine.hpp"
#include "line/LineParser.hpp"
#include "text/ConflictReader.hpp"
#include "text/TextLines.hpp"
#include "text/TextSum.hpp"
#include "text/TextTail.hpp"
#include "texts/ErrorTexts.hpp"

namespace project::stores {

namespace {

/// Reads a text without conflict markers, from its first line to its last.
class Reader {
public:
    explicit Reader(std::string bytes) : body_(reading_.content.body()) {
        constexpr std::size_t usualLine = 32;
        body_ = TextBody(std::move(bytes));
        body_.reserve(body_.bytes().size() / usualLine);
        reading_.isCanonical = true;
    }

    enum class Outcome { Complete, Incomplete, Conflict };

    Outcome read(std::string const& file) {
        LineWalk first(body_.bytes(), 0, 1);
        if (!first.next()) {
            return Outcome::Incomplete;
        }
        if (mergeMarker(first.line().text) != MergeMarker::None) {
            return Outcome::Conflict;
        }
        if (!checkFirstLine(first.line().text, first.line().hasEnd(), file)) {
            return Outcome::Incomplete;
        }
        bool const isFirstLinePlain = first.line().text == firstLine && first.line().hasPlainEnd();
        offset_ = first.offset();
        ++number_;
        Outcome const outcome = readBody();
        body_.setGapless(reading_.isCanonical);
        reading_.isCanonical = reading_.isCanonical && isFirstLinePlain && isEndPlain_;
        return outcome == Outcome::Complete ? readTailOf() : outcome;
    }

    TextReading result() && { return std::move(reading_); }

    std::string takeBytes() && { return body_.cutAt(0) + reading_.tail; }

private:
    Outcome readBody() {
        std::string const& bytes = body_.bytes();
        while (offset_ < bytes.size()) {
            std::size_t const length = plainPathLength(std::string_view(bytes).substr(offset_));
            LineAddress const path{LineAddress::Form::Names, {bytes.data() + offset_ + 1, length}};
            constexpr std::size_t quotes = 2;
            if (length > 0 && bytes[offset_ + length + quotes] == '\n' && std::is_lt(compare(last_, path))) {
                body_.addLine(offset_);
                last_ = path;
                offset_ += length + quotes + 1;
                ++number_;
            } else if (std::optional<Outcome> const outcome = readLine()) {
                return *outcome;
            }
        }
        return Outcome::Incomplete;
    }

    /// Reads a line that is not a plain path in order. @return the outcome if it is the last line.
    std::optional<Outcome> readLine() {
        LineWalk walk(body_.bytes(), offset_, number_);
        walk.next();
        TextLine const& line = walk.line();
        if (line.text == endLine) {
            isEndPlain_ = line.hasPlainEnd();
            bodySize_ = walk.offset();
            ++number_;
            return Outcome::Complete;
        }
        if (!line.hasEnd()) {
            return Outcome::Incomplete;
        }
        if (mergeMarker(line.text) != MergeMarker::None) {
            return Outcome::Conflict;
        }
        std::optional<LineAddress> const address =
            line.hasPlainEnd() ? canonicalAddress(line.text) : std::nullopt;
        if (address && std::is_lt(compare(last_, *address))) {
            body_.addLine(offset_);
            last_ = *address;
        } else {
            addToOverlay(line);
        }
        offset_ = walk.offset();
        ++number_;
        return std::nullopt;
    }

    /// Puts a line that is not canonical or out of order into the overlay.
    void addToOverlay(TextLine const& line) {
        reading_.isCanonical = false;
        ParsedLine parsed = parseBodyLine(line.text);
        if (line.text.empty()) {
            fault(Fault::Kind::Irregular, "LineEmpty");
        } else if (!parsed.change) {
            fault(Fault::Kind::Damage, parsed.problem);
            reading_.damage.emplace(line.number, line.whole);
        } else {
            checkOrder(*parsed.change);
            reading_.content.join(*parsed.change);
        }
    }

    void checkOrder(Change const& change) {
        AddressText address(change.address);
        auto const order = compare(last_, address.view());
        if (std::is_gt(order)) {
            fault(Fault::Kind::Irregular, "LineOutOfOrder");
        } else if (std::is_eq(order)) {
            fault(Fault::Kind::Irregular, "LineRepeated");
        } else {
            lastText_ = std::move(address);
            last_ = lastText_.view();
        }
    }

    Outcome readTailOf() {
        reading_.tail = body_.cutAt(bodySize_);
        std::vector<TextLine> lines;
        LineWalk walk(reading_.tail, 0, number_);
        while (walk.next()) {
            if (mergeMarker(walk.line().text) != MergeMarker::None) {
                return Outcome::Conflict;
            }
            lines.push_back(walk.line());
        }
        bool const isTorn = !lines.empty() && readBatches(lines);
        reading_.content.finishJoining();
        bool const hasEnd = lines.empty() ? body_.bytes().ends_with('\n') : lines.back().hasEnd();
        if (!hasEnd && !isTorn) {
            number_ = lines.empty() ? number_ - 1 : lines.back().number;
            fault(Fault::Kind::Irregular, "LineEndMissing");
        }
        return Outcome::Complete;
    }

    /// @return true if the tail is torn.
    bool readBatches(std::vector<TextLine> const& lines) {
        TextSum sum;
        sum.addLines(body_.bytes());
        TailReading tail = readTail(lines, sum.hex());
        applyTail(reading_.content, tail);
        std::move(tail.faults.begin(), tail.faults.end(), std::back_inserter(reading_.faults));
        reading_.damage.merge(tail.damage);
        reading_.nextAfter = std::move(tail.nextAfter);
        return tail.isTorn;
    }

    /// @param problem the name of its text.
    void fault(Fault::Kind kind, char const* problem) {
        reading_.faults.push_back({kind, number_, errorTexts.get(problem)});
    }

    TextReading reading_;
    TextBody& body_;
    std::size_t offset_ = 0;
    std::size_t number_ = 1;
    std::size_t bodySize_ = 0;
    bool isEndPlain_ = false;
    AddressText lastText_{Address::root()};
    LineAddress last_ = lastText_.view(); ///< of the last line that is in order
};

} // namespace

std::optional<TextReading> readText(std::string bytes, std::string const& file) {
    Reader reader(std::move(bytes));
    switch (reader.read(file)) {
    case Reader::Outcome::Complete:
        return std::move(reader).result();
    case Reader::Outcome::Conflict:
        return readConflictedText(std::move(reader).takeBytes(), file);
    default:
        return std::nullopt;
    }
}

} // namespace project::stores
