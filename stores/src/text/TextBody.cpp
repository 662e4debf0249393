#include "text/TextBody.hpp"

#include <algorithm>
#include <array>
#include <optional>
#include <utility>

#include "line/CanonicalLine.hpp"
#include "line/JsonText.hpp"
#include "line/LineParser.hpp"
#include "text/TextLines.hpp"

namespace project::stores {

namespace {

/// The first index in a range for which a condition does not hold. The condition must hold for all indexes
/// before it and for none from there on. Searches in doubling steps and then by bisection.
template <typename Condition>
std::size_t gallop(TextBody::Range range, Condition const& holds) noexcept(noexcept(holds(0))) {
    std::size_t low = range.begin;
    std::size_t high = range.end; // the condition does not hold from there on
    for (std::size_t step = 1; low < range.end; step *= 2) {
        std::size_t const probe = std::min(low + step, range.end) - 1;
        if (!holds(probe)) {
            high = probe;
            break;
        }
        low = probe + 1;
    }
    while (low < high) {
        std::size_t const middle = low + (high - low) / 2;
        if (holds(middle)) {
            low = middle + 1;
        } else {
            high = middle;
        }
    }
    return low;
}

/// The steps of lines that are all below one address, from that address on. In each form of a line the
/// address has the same text, so it is walked once for each form.
class StepsBelow {
public:
    /// @param depth the number of steps of the address.
    explicit StepsBelow(std::size_t depth) : depth_(depth) {}

    LineSteps of(LineAddress const& line) {
        auto& above = above_[line.form == LineAddress::Form::Names ? 0 : 1];
        if (!above) {
            above.emplace(line);
            for (std::size_t i = 0; i < depth_; ++i) {
                above->next();
            }
        }
        return above->continuedIn(line);
    }

private:
    std::size_t depth_;
    std::array<std::optional<LineSteps>, 2> above_;
};

} // namespace

std::string_view TextBody::line(std::size_t index) const noexcept {
    std::size_t const begin = starts_[index];
    bool const isEndKnown = isGapless_ && index + 1 < starts_.size();
    std::size_t const end = isEndKnown ? starts_[index + 1] - 1 : bytes_.find('\n', begin);
    return {bytes_.data() + begin, end - begin};
}

LineAddress TextBody::address(std::size_t index) const noexcept {
    return addressOfCanonical(line(index));
}

std::size_t TextBody::lowerBound(Range range, LineAddress const& wanted) const noexcept {
    return gallop(range, [&](std::size_t i) noexcept { return std::is_lt(compare(address(i), wanted)); });
}

std::size_t TextBody::endOf(Range range, LineAddress const& wanted) const noexcept {
    return gallop(range, [&](std::size_t i) noexcept { return isWithin(address(i), wanted); });
}

TextBody::Range TextBody::within(LineAddress const& wanted) const noexcept {
    std::size_t const hint = std::min(lastFound_.get(), size());
    bool const isBehind = hint > 0 && std::is_lt(compare(address(hint - 1), wanted));
    std::size_t const begin = lowerBound({isBehind ? hint : 0, size()}, wanted);
    lastFound_.set(begin);
    return {begin, endOf({begin, size()}, wanted)};
}

std::optional<std::size_t> TextBody::find(LineAddress const& wanted) const noexcept {
    std::size_t const found = lowerBound(all(), wanted);
    bool const isExact = found < size() && std::is_eq(compare(address(found), wanted));
    return isExact ? std::optional(found) : std::nullopt;
}

std::size_t TextBody::linesBefore(std::size_t offset) const noexcept {
    std::size_t const begun = gallop(all(), [&](std::size_t i) noexcept { return starts_[i] < offset; });
    return begun == 0 ? 0 : begun - 1;
}

void TextBody::children(Range below, std::size_t depth, ChildSink& children) const {
    StepsBelow start(depth);
    std::u16string type;
    std::string_view typeContent;
    std::u16string location;
    while (!below.empty()) {
        std::string_view const first = line(below.begin);
        LineSteps steps = start.of(addressOfCanonical(first));
        steps.next();
        if (typeContent != steps.type()) {
            typeContent = steps.type();
            decodeJsonContent(typeContent, type);
        }
        decodeJsonContent(steps.location(), location);
        LineAddress const prefix = steps.prefix();
        bool const hasOwnLine = !steps.next();
        below.begin += hasOwnLine ? 1 : 0;
        std::size_t const end = endOf(below, prefix);
        bool const hasChildren = end > below.begin;
        below.begin = end;
        if (hasOwnLine && isPlainPath(first)) {
            children.add({type, location, plainNode(), false, hasChildren}); // most children
        } else {
            AddressState const state = hasOwnLine ? stateOfLine(first) : AddressState();
            children.add({type, location, state.node, state.isCreated, hasChildren});
        }
    }
}

std::string TextBody::cutAt(std::size_t size) {
    std::string rest = bytes_.substr(size);
    bytes_.resize(size);
    return rest;
}

BodyWriter::BodyWriter(TextBody const& old, std::size_t added) : old_(old) {
    written_.bytes_.reserve(old.bytes().size() + added + firstLine.size() + endLine.size() + 2);
    written_.bytes_ += firstLine;
    written_.bytes_ += '\n';
}

void BodyWriter::copy(TextBody::Range run) {
    if (run.empty()) {
        return;
    }
    if (!old_.isGapless()) {
        for (std::size_t i = run.begin; i < run.end; ++i) {
            add(old_.line(i));
        }
        return;
    }
    std::size_t const first = old_.starts_[run.begin];
    std::size_t const last = old_.starts_[run.end - 1];
    std::size_t const end = last + old_.line(run.end - 1).size() + 1;
    std::size_t const moved =
        written_.bytes_.size() - first; // wraps around if lines move towards the beginning
    written_.bytes_.append(old_.bytes_, first, end - first);
    for (std::size_t i = run.begin; i < run.end; ++i) {
        written_.starts_.add(old_.starts_[i] + moved);
    }
}

void BodyWriter::add(std::string_view line) {
    written_.starts_.add(written_.bytes_.size());
    written_.bytes_ += line;
    written_.bytes_ += '\n';
}

TextBody BodyWriter::finish() && {
    written_.bytes_ += endLine;
    written_.bytes_ += '\n';
    written_.isGapless_ = true;
    return std::move(written_);
}

} // namespace project::stores
