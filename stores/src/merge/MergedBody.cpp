#include "merge/MergedBody.hpp"

#include <algorithm>
#include <string_view>
#include <utility>

#include "line/CanonicalLine.hpp"
#include "line/LineParser.hpp"
#include "line/NodeLine.hpp"
#include "node/NodeMerge.hpp"

namespace project::stores {

namespace {

using Line = std::optional<std::string_view>;

AddressState stateOf(Line const& line) {
    return line ? stateOfLine(*line) : AddressState{};
}

void appendLine(std::string& out, std::string_view line) {
    out += line;
    out += '\n';
}

std::string lineOf(Address const& address, AddressState const& state) {
    std::string line;
    if (state) {
        appendNodeLine(line, AddressText(address), state.node);
        line += '\n';
    }
    return line;
}

/// A cursor over the lines of one of the bodies.
class Version {
public:
    explicit Version(TextBody const& body) : body_(body) {
        if (!isAtEnd()) {
            readLine();
        }
    }

    bool isAtEnd() const noexcept { return next_ == body_.size(); }

    /// The current line; nothing at the end.
    Line const& line() const noexcept { return line_; }

    /// The address of the current line. Must not be called at the end.
    LineAddress const& address() const noexcept { return address_; }

    bool isAt(LineAddress const& address) const noexcept {
        return !isAtEnd() && std::is_eq(compare(address_, address));
    }

    bool hasAnythingWithin(LineAddress const& address) const noexcept {
        return !isAtEnd() && isWithin(address_, address);
    }

    void advance() {
        ++next_;
        readLine();
    }

    /// Consumes the lines at and below an address. @return these lines.
    TextBody::Range take(LineAddress const& address) {
        TextBody::Range const taken{next_, body_.endOf({next_, body_.size()}, address)};
        next_ = taken.end;
        readLine();
        return taken;
    }

    TextBody const& body() const noexcept { return body_; }

    std::string text(TextBody::Range lines) const {
        std::string text;
        for (std::size_t i = lines.begin; i < lines.end; ++i) {
            appendLine(text, body_.line(i));
        }
        return text;
    }

private:
    void readLine() {
        line_ = isAtEnd() ? std::nullopt : Line(body_.line(next_));
        address_ = line_ ? addressOfCanonical(*line_) : address_;
    }

    TextBody const& body_;
    std::size_t next_ = 0;
    Line line_;
    LineAddress address_{LineAddress::Form::Steps, {}};
};

/// The addresses of lines that add something to the base or change it.
std::vector<Address> changedLines(TextBody const& base, TextBody::Range before, TextBody const& body,
                                  TextBody::Range lines) {
    std::vector<Address> changed;
    for (std::size_t i = lines.begin; i < lines.end; ++i) {
        LineAddress const address = body.address(i);
        before.begin = base.lowerBound(before, address);
        bool const isInBase = !before.empty() && std::is_eq(compare(base.address(before.begin), address));
        Line const old = isInBase ? Line(base.line(before.begin)) : std::nullopt;
        if (old != body.line(i) && !isReductionOf(stateOf(body.line(i)), stateOf(old))) {
            changed.push_back(toAddress(address));
        }
    }
    return changed;
}

/// Walks through the three bodies side by side.
class BodyMerge {
public:
    explicit BodyMerge(ThreeWay<TextBody> const& bodies)
        : base_(bodies.base), ours_(bodies.ours), theirs_(bodies.theirs) {
        merged_.lines.reserve(std::max(bodies.ours.bytes().size(), bodies.theirs.bytes().size()));
    }

    MergedBody merge() {
        while (!base_.isAtEnd() || !ours_.isAtEnd() || !theirs_.isAtEnd()) {
            if (base_.line() == ours_.line() && ours_.line() == theirs_.line()) {
                appendLine(merged_.lines, *base_.line());
                base_.advance();
                ours_.advance();
                theirs_.advance();
            } else {
                mergeAt(firstAddress());
            }
        }
        return std::move(merged_);
    }

private:
    LineAddress firstAddress() const {
        std::optional<LineAddress> first;
        for (Version const* const version : {&base_, &ours_, &theirs_}) {
            if (!version->isAtEnd() && (!first || std::is_lt(compare(version->address(), *first)))) {
                first = version->address();
            }
        }
        return *first;
    }

    void mergeAt(LineAddress const& address) {
        bool const isInBase = base_.isAt(address);
        bool const isRemovedByOurs = isInBase && !ours_.hasAnythingWithin(address);
        bool const isRemovedByTheirs = isInBase && !theirs_.hasAnythingWithin(address);
        if (!isRemovedByOurs && !isRemovedByTheirs) {
            mergeLine(address);
        } else if (!isRemovedByOurs) {
            mergeRemoved(address, MergeSide::Theirs);
        } else if (!isRemovedByTheirs) {
            mergeRemoved(address, MergeSide::Ours);
        } else {
            base_.take(address);
        }
    }

    /// Merges an address that one side removed with everything below it.
    void mergeRemoved(LineAddress const& removed, MergeSide by) {
        Version& other = by == MergeSide::Ours ? theirs_ : ours_;
        TextBody::Range const before = base_.take(removed);
        TextBody::Range const kept = other.take(removed);
        std::vector<Address> changed = changedLines(base_.body(), before, other.body(), kept);
        if (changed.empty()) {
            return;
        }
        MergeConflict conflict{
            MergeConflict::Kind::Subtree, toAddress(removed), {}, {}, by, {}, {}, std::move(changed)};
        conflict.nodes.base = stateOfLine(base_.body().line(before.begin)).node;
        Node& node = by == MergeSide::Ours ? conflict.nodes.theirs : conflict.nodes.ours;
        if (std::is_eq(compare(other.body().address(kept.begin), removed))) {
            node = stateOfLine(other.body().line(kept.begin)).node;
        }
        MergeSite site{conflict.address, merged_.lines.size(), 1, {}, std::nullopt};
        site.lines.base = base_.text(before);
        (by == MergeSide::Ours ? site.lines.theirs : site.lines.ours) = other.text(kept);
        merged_.conflicts.push_back(std::move(conflict));
        merged_.sites.push_back(std::move(site));
    }

    void mergeLine(LineAddress const& address) {
        ThreeWay<Line> const lines{take(base_, address), take(ours_, address), take(theirs_, address)};
        if (lines.ours == lines.theirs || lines.theirs == lines.base) {
            keep(lines.ours);
        } else if (lines.ours == lines.base) {
            keep(lines.theirs);
        } else {
            mergeChanged(toAddress(address), lines);
        }
    }

    static Line take(Version& version, LineAddress const& address) {
        if (!version.isAt(address)) {
            return std::nullopt;
        }
        Line const line = version.line();
        version.advance();
        return line;
    }

    void keep(Line const& line) {
        if (line) {
            appendLine(merged_.lines, *line);
        }
    }

    void mergeChanged(Address const& address, ThreeWay<Line> const& lines) {
        ThreeWay<AddressState> const states{stateOf(lines.base), stateOf(lines.ours), stateOf(lines.theirs)};
        std::size_t const before = merged_.conflicts.size();
        AddressState const ours = mergeStates(address, states, [this](MergeConflict&& conflict) {
            merged_.conflicts.push_back(std::move(conflict));
            return MergeSide::Ours;
        });
        std::size_t const conflicts = merged_.conflicts.size() - before;
        if (conflicts == 0) {
            merged_.lines += lineOf(address, ours);
            return;
        }
        AddressState const theirs =
            mergeStates(address, states, [](MergeConflict&&) { return MergeSide::Theirs; });
        ThreeWay<std::string> texts{lineOf(address, states.base), lineOf(address, ours),
                                    lineOf(address, theirs)};
        merged_.sites.push_back({address, merged_.lines.size(), conflicts, std::move(texts), states});
    }

    Version base_;
    Version ours_;
    Version theirs_;
    MergedBody merged_;
};

} // namespace

MergedBody mergeBodies(ThreeWay<TextBody> const& bodies) {
    return BodyMerge(bodies).merge();
}

std::string chosenLines(MergeSite const& site, MergeSide const* choices) {
    if (!site.states) {
        return site.lines.of(*choices);
    }
    return lineOf(site.address,
                  mergeStates(site.address, *site.states, [&](MergeConflict&&) { return *choices++; }));
}

} // namespace project::stores
