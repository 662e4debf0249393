#include "text/TextBody.hpp"

#include <algorithm>
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
    std::size_t step = 1;
    while (low < range.end && holds(std::min(low + step, range.end) - 1)) {
        low = std::min(low + step, range.end);
        step *= 2;
    }
    std::size_t high = std::min(low + step, range.end);
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

} // namespace

std::string_view TextBody::line(std::size_t index) const noexcept {
    std::size_t const begin = starts_[index];
    return {bytes_.data() + begin, bytes_.find('\n', begin) - begin};
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
    std::size_t const begin = lowerBound(all(), wanted);
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
    std::u16string type;
    std::u16string location;
    while (!below.empty()) {
        LineSteps steps(address(below.begin));
        for (std::size_t i = 0; i <= depth; ++i) {
            steps.next();
        }
        decodeJsonContent(steps.type(), type);
        decodeJsonContent(steps.location(), location);
        LineAddress const prefix = steps.prefix();
        AddressState state;
        if (!steps.next()) {
            state = stateOfLine(line(below.begin));
            ++below.begin;
        }
        std::size_t const end = endOf(below, prefix);
        children.add({type, location, state.node, state.isCreated, end > below.begin});
        below.begin = end;
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
