#include "text/OverlaidChildren.hpp"

#include <algorithm>
#include <optional>
#include <utility>

#include "line/LineParser.hpp"

namespace project::stores {

namespace {

using metadata::PathElement;
using Iterator = Overlay::Entries::const_iterator;

/// Walks the lines of a body and the changes over it side by side, child by child.
class Walk {
public:
    Walk(TextBody const& body, TextBody::Range lines, Overlay::Range entries, std::size_t depth)
        : body_(body), lines_(lines), entry_(entries.begin()), end_(entries.end()), depth_(depth) {}

    Children children() {
        Children children;
        while (!lines_.empty() || entry_ != end_) {
            Child child = next();
            if (child.node || child.made || child.hasChildren) {
                children.push_back(std::move(child));
            }
        }
        return children;
    }

private:
    Child next() {
        std::optional<PathElement> const inBody = lines_.empty() ? std::nullopt : elementOfLine();
        std::optional<PathElement> const inOverlay = entry_ == end_ ? std::nullopt : elementOfEntry();
        bool const fromBody = inBody && (!inOverlay || !(*inOverlay < *inBody));
        bool const fromOverlay = inOverlay && (!inBody || !(*inBody < *inOverlay));
        Child child{fromBody ? *inBody : *inOverlay, nullptr, false, false};
        TextBody::Range lines{lines_.begin, lines_.begin};
        if (fromBody) {
            lines = takeLines(child);
        }
        Iterator const first = entry_;
        if (fromOverlay) {
            takeEntries(child, lines);
        }
        Iterator const below = first != entry_ && isChild(first->first) ? std::next(first) : first;
        child.hasChildren = anythingStands(lines, below, entry_);
        return child;
    }

    LineSteps stepsOfLine() const {
        LineSteps steps(body_.address(lines_.begin));
        for (std::size_t i = 0; i <= depth_; ++i) {
            steps.next();
        }
        return steps;
    }

    std::optional<PathElement> elementOfLine() const { return toElement(stepsOfLine()); }

    std::optional<PathElement> elementOfEntry() const { return entry_->first[depth_]; }

    bool isChild(Address const& address) const { return address.depth() == depth_ + 1; }

    /// @return the lines strictly below the child.
    TextBody::Range takeLines(Child& child) {
        LineSteps steps = stepsOfLine();
        LineAddress const prefix = steps.prefix();
        std::size_t const end = body_.endOf(lines_, prefix);
        TextBody::Range below{lines_.begin, end};
        if (!steps.next()) {
            child.node = nodeOfLine(body_.line(lines_.begin));
            child.made = child.node == nullptr;
            ++below.begin;
        }
        lines_.begin = end;
        return below;
    }

    void takeEntries(Child& child, TextBody::Range& lines) {
        Iterator const first = entry_;
        while (entry_ != end_ && entry_->first[depth_] == child.element) {
            ++entry_;
        }
        if (!isChild(first->first)) {
            return;
        }
        child.node = first->second.standing.node;
        child.made = first->second.standing.made;
        if (first->second.hides) {
            lines.begin = lines.end;
        }
    }

    /// True when something is left of some lines under the changes that are laid over them, or a change puts
    /// something there.
    bool anythingStands(TextBody::Range lines, Iterator begin, Iterator end) const {
        auto const stands = [](auto const& entry) { return static_cast<bool>(entry.second.standing); };
        if (std::any_of(begin, end, stands)) {
            return true;
        }
        for (Iterator hiding = begin; hiding != end; ++hiding) { // sorted, so a line that is left stays first
            lines.begin = body_.endOf(lines, AddressText(hiding->first).view());
        }
        return !lines.empty();
    }

    TextBody const& body_;
    TextBody::Range lines_;
    Iterator entry_;
    Iterator end_;
    std::size_t depth_;
};

} // namespace

Children overlaidChildren(TextBody const& body, TextBody::Range lines, Overlay::Range entries,
                          std::size_t depth) {
    return Walk(body, lines, entries, depth).children();
}

} // namespace project::stores
