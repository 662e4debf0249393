#include "merge/MergedBody.hpp"

#include <algorithm>
#include <string_view>
#include <utility>

#include "line/CanonicalLine.hpp"
#include "line/LineParser.hpp"
#include "line/NodeLine.hpp"
#include "node/NodeMerge.hpp"
#include "node/NodeReduction.hpp"

namespace project::stores {

namespace {

using Line = std::optional<std::string_view>;

Standing standingOf(Line const& line) {
    if (!line) {
        return {};
    }
    Node node = nodeOfLine(*line);
    bool const made = node == nullptr;
    return {std::move(node), made};
}

void appendLine(std::string& out, std::string_view line) {
    out += line;
    out += '\n';
}

std::string lineOf(Address const& address, Standing const& standing) {
    std::string line;
    if (standing) {
        appendNodeLine(line, AddressText(address), standing.node);
        line += '\n';
    }
    return line;
}

/// One of the bodies, read from its first line to its last.
class Version {
public:
    explicit Version(TextBody const& body) : body_(body) {
        if (!atEnd()) {
            look();
        }
    }

    bool atEnd() const noexcept { return next_ == body_.size(); }

    /// The next line; nothing at the end.
    Line const& line() const noexcept { return line_; }

    /// The address of the next line. Not to be called at the end.
    LineAddress const& address() const noexcept { return address_; }

    bool isAt(LineAddress const& address) const noexcept {
        return !atEnd() && std::is_eq(compare(address_, address));
    }

    bool hasAnythingWithin(LineAddress const& address) const noexcept {
        return !atEnd() && isWithin(address_, address);
    }

    void advance() {
        ++next_;
        look();
    }

    /// Passes over the lines within an address. @return them.
    TextBody::Range take(LineAddress const& address) {
        TextBody::Range const taken{next_, body_.endOf({next_, body_.size()}, address)};
        next_ = taken.end;
        look();
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
    void look() {
        line_ = atEnd() ? std::nullopt : Line(body_.line(next_));
        address_ = line_ ? addressOfCanonical(*line_) : address_;
    }

    TextBody const& body_;
    std::size_t next_ = 0;
    Line line_;
    LineAddress address_{LineAddress::Form::Steps, {}};
};

/// The addresses in some lines of a body at which something was added to what stands in the base, or changed.
std::vector<Address> changedLines(TextBody const& base, TextBody::Range before, TextBody const& body,
                                  TextBody::Range lines) {
    std::vector<Address> changed;
    for (std::size_t i = lines.begin; i < lines.end; ++i) {
        LineAddress const address = body.address(i);
        before.begin = base.lowerBound(before, address);
        bool const stood = !before.empty() && std::is_eq(compare(base.address(before.begin), address));
        Line const old = stood ? Line(base.line(before.begin)) : std::nullopt;
        if (old != body.line(i) && !isReductionOf(standingOf(body.line(i)), standingOf(old))) {
            changed.push_back(toAddress(address));
        }
    }
    return changed;
}

class Walk {
public:
    explicit Walk(ThreeWay<TextBody> const& bodies)
        : base_(bodies.base), ours_(bodies.ours), theirs_(bodies.theirs) {
        merged_.lines.reserve(std::max(bodies.ours.bytes().size(), bodies.theirs.bytes().size()));
    }

    MergedBody merge() {
        while (!base_.atEnd() || !ours_.atEnd() || !theirs_.atEnd()) {
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
            if (!version->atEnd() && (!first || std::is_lt(compare(version->address(), *first)))) {
                first = version->address();
            }
        }
        return *first;
    }

    void mergeAt(LineAddress const& address) {
        bool const stood = base_.isAt(address);
        bool const oursStays = !stood || ours_.hasAnythingWithin(address);
        bool const theirsStays = !stood || theirs_.hasAnythingWithin(address);
        if (oursStays && theirsStays) {
            mergeLine(address);
        } else if (oursStays) {
            mergeRemoved(address, MergeSide::Theirs);
        } else if (theirsStays) {
            mergeRemoved(address, MergeSide::Ours);
        } else {
            base_.take(address);
        }
    }

    /// Merges an address that one side has removed with all below it.
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
        conflict.nodes.base = nodeOfLine(base_.body().line(before.begin));
        Node& node = by == MergeSide::Ours ? conflict.nodes.theirs : conflict.nodes.ours;
        if (std::is_eq(compare(other.body().address(kept.begin), removed))) {
            node = nodeOfLine(other.body().line(kept.begin));
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
        ThreeWay<Standing> const standings{standingOf(lines.base), standingOf(lines.ours),
                                           standingOf(lines.theirs)};
        std::size_t const before = merged_.conflicts.size();
        Standing const ours = mergeStandings(address, standings, [this](MergeConflict&& conflict) {
            merged_.conflicts.push_back(std::move(conflict));
            return MergeSide::Ours;
        });
        std::size_t const conflicts = merged_.conflicts.size() - before;
        if (conflicts == 0) {
            merged_.lines += lineOf(address, ours);
            return;
        }
        Standing const theirs =
            mergeStandings(address, standings, [](MergeConflict&&) { return MergeSide::Theirs; });
        ThreeWay<std::string> texts{lineOf(address, standings.base), lineOf(address, ours),
                                    lineOf(address, theirs)};
        merged_.sites.push_back({address, merged_.lines.size(), conflicts, std::move(texts), standings});
    }

    Version base_;
    Version ours_;
    Version theirs_;
    MergedBody merged_;
};

} // namespace

MergedBody mergeBodies(ThreeWay<TextBody> const& bodies) {
    return Walk(bodies).merge();
}

std::string chosenLines(MergeSite const& site, MergeSide const* choices) {
    if (!site.standings) {
        return site.lines.of(*choices);
    }
    return lineOf(site.address,
                  mergeStandings(site.address, *site.standings, [&](MergeConflict&&) { return *choices++; }));
}

} // namespace project::stores
