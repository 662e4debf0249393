#include "text/TextContent.hpp"

#include <algorithm>
#include <optional>
#include <utility>

#include "line/LineParser.hpp"
#include "line/NodeLine.hpp"

namespace project::stores {

namespace {

using metadata::PathElement;
using Iterator = Overlay::Entries::const_iterator;

/// Walks the lines of a body and the entries of an overlay below one address side by side, child by child.
class ChildWalk {
public:
    ChildWalk(TextBody const& body, TextBody::Range lines, Overlay::Range entries, std::size_t depth)
        : body_(body), lines_(lines), entry_(entries.begin()), end_(entries.end()), depth_(depth) {}

    void passOn(ChildSink& children) {
        while (!lines_.empty() || entry_ != end_) {
            Child const child = next();
            if (child.node || child.isCreated || child.hasChildren) {
                children.add({child.element.getType(), child.element.getLocation(), child.node,
                              child.isCreated, child.hasChildren});
            }
        }
    }

private:
    Child next() {
        std::optional<PathElement> const inBody = lines_.empty() ? std::nullopt : elementOfLine();
        std::optional<PathElement> const inOverlay = entry_ == end_ ? std::nullopt : elementOfEntry();
        bool const isInBody = inBody && (!inOverlay || !(*inOverlay < *inBody));
        bool const isInOverlay = inOverlay && (!inBody || !(*inBody < *inOverlay));
        Child child{isInBody ? *inBody : *inOverlay, nullptr, false, false};
        TextBody::Range lines{lines_.begin, lines_.begin};
        if (isInBody) {
            lines = takeLines(child);
        }
        Iterator const first = entry_;
        if (isInOverlay) {
            takeEntries(child, lines);
        }
        Iterator const below = first != entry_ && isChild(first->first) ? std::next(first) : first;
        child.hasChildren = hasAnything(lines, below, entry_);
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

    static void setState(Child& child, AddressState state) {
        child.node = std::move(state.node);
        child.isCreated = state.isCreated;
    }

    /// Takes the lines at and below the child. @return those strictly below it.
    TextBody::Range takeLines(Child& child) {
        LineSteps steps = stepsOfLine();
        LineAddress const prefix = steps.prefix();
        std::size_t const end = body_.endOf(lines_, prefix);
        TextBody::Range below{lines_.begin, end};
        if (!steps.next()) {
            setState(child, stateOfLine(body_.line(lines_.begin)));
            ++below.begin;
        }
        lines_.begin = end;
        return below;
    }

    /// Takes the entries at and below the child. @param lines the lines below it; emptied if they are hidden.
    void takeEntries(Child& child, TextBody::Range& lines) {
        Iterator const first = entry_;
        while (entry_ != end_ && entry_->first[depth_] == child.element) {
            ++entry_;
        }
        if (!isChild(first->first)) {
            return;
        }
        setState(child, first->second.state);
        if (first->second.isHiding) {
            lines.begin = lines.end;
        }
    }

    /// True if an entry has a state, or a line is not hidden by the entries.
    bool hasAnything(TextBody::Range lines, Iterator begin, Iterator end) const {
        auto const hasState = [](auto const& entry) { return static_cast<bool>(entry.second.state); };
        if (std::any_of(begin, end, hasState)) {
            return true;
        }
        // All entries hide. Both are sorted, so the first line that is not hidden remains the first.
        for (auto hiding = begin; hiding != end; ++hiding) {
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

/// Writes a body and the entries over it, which arrive sorted by address.
class ContentWriter {
public:
    ContentWriter(TextBody const& body, std::size_t entries)
        : body_(body), rest_(body.all()), writer_(body, entries * expectedLine) {}

    /// @param node null for an address without a line of its own or without a node.
    /// @return false if the address does not come after the previous one.
    bool add(Address const& address, Node const& node, bool isCreated, bool isHiding) {
        std::swap(address_, previous_);
        address_.assign(address);
        LineAddress const text = address_.view();
        if (std::is_gteq(compare(previous_.view(), text))) {
            return false;
        }
        std::size_t const found = body_.lowerBound(rest_, text);
        writer_.copy({rest_.begin, found});
        rest_.begin = found;
        if (isHiding) {
            rest_.begin = body_.endOf(rest_, text);
        } else if (!rest_.empty() && std::is_eq(compare(body_.address(found), text))) {
            ++rest_.begin;
        }
        if (node || isCreated) {
            line_.clear();
            appendNodeLine(line_, address_, node);
            writer_.add(line_);
        }
        return true;
    }

    TextBody finish() && {
        writer_.copy(rest_);
        return std::move(writer_).finish();
    }

private:
    static constexpr std::size_t expectedLine = 64;

    TextBody const& body_;
    TextBody::Range rest_; ///< the lines that are neither copied nor replaced yet
    BodyWriter writer_;
    AddressText address_{Address::root()};
    AddressText previous_{Address::root()};
    std::string line_;
};

/// Writes the entries of an overlay and over them the changes of a batch without removals.
/// @return false if the batch does not set each address once and in order. The batches of many addresses do;
/// they can be written without a sorted copy.
bool writeOver(ContentWriter& writer, Overlay const& overlay, Batch const& batch) {
    auto entry = overlay.entries().begin();
    auto const end = overlay.entries().end();
    auto const writeEntry = [&] {
        auto const& [address, content] = *entry++;
        return writer.add(address, content.state.node, content.state.isCreated, content.isHiding);
    };
    for (Change const& change : batch) {
        requireWritable(change);
        while (entry != end && entry->first < change.address) {
            writeEntry();
        }
        bool const isReplacing = entry != end && entry->first == change.address;
        bool const isHiding = isReplacing && entry->second.isHiding;
        entry = isReplacing ? std::next(entry) : entry;
        if (!writer.add(change.address, change.node, change.kind == Change::Kind::Create, isHiding)) {
            return false;
        }
    }
    while (entry != end) {
        writeEntry();
    }
    return true;
}

} // namespace

void TextContent::children(Address const& parent, ChildSink& children) const {
    AddressText const text(parent);
    TextBody::Range lines{0, 0};
    if (!overlay_.isHidden(parent)) {
        lines = body_.within(text.view());
        bool const hasOwnLine =
            !lines.empty() && std::is_eq(compare(body_.address(lines.begin), text.view()));
        lines.begin += hasOwnLine ? 1 : 0;
    }
    Overlay::Range const entries = overlay_.below(parent);
    if (entries.empty()) {
        body_.children(lines, parent.depth(), children);
    } else {
        ChildWalk(body_, lines, entries, parent.depth()).passOn(children);
    }
}

AddressState TextContent::at(Address const& address) const {
    Overlay::Entry const* const entry = overlay_.find(address);
    if (entry != nullptr) {
        return entry->state;
    }
    if (overlay_.isHidden(address)) {
        return {};
    }
    auto const line = body_.find(AddressText(address).view());
    return line ? stateOfLine(body_.line(*line)) : AddressState{};
}

std::vector<Address> TextContent::addressesWithin(Address const& address) const {
    std::vector<Address> found;
    TextBody::Range const lines = body_.within(AddressText(address).view());
    for (std::size_t i = lines.begin; i < lines.end; ++i) {
        found.push_back(toAddress(body_.address(i)));
    }
    if (overlay_.empty()) {
        return found;
    }
    std::erase_if(found, [this](Address const& candidate) {
        return overlay_.find(candidate) != nullptr || overlay_.isHidden(candidate);
    });
    auto const addEntry = [&](Address const& candidate, Overlay::Entry const& entry) {
        if (entry.state) {
            found.push_back(candidate);
        }
    };
    if (Overlay::Entry const* const own = overlay_.find(address)) {
        addEntry(address, *own);
    }
    for (auto const& [candidate, entry] : overlay_.below(address)) {
        addEntry(candidate, entry);
    }
    std::sort(found.begin(), found.end());
    return found;
}

void TextContent::apply(Change const& change) {
    if (!joins_.empty()) {
        auto const begin = joins_.lower_bound(change.address);
        auto end = begin;
        bool const isRemoval = change.kind == Change::Kind::Remove;
        while (end != joins_.end() &&
               (isRemoval ? end->first.isWithin(change.address) : end->first == change.address)) {
            ++end;
        }
        joins_.erase(begin, end);
    }
    overlay_.apply(change);
}

void TextContent::join(Change const& change) {
    if (change.kind == Change::Kind::Remove) {
        apply(change);
        return;
    }
    auto open = joins_.find(change.address);
    if (open == joins_.end()) {
        AddressState const earlier = at(change.address);
        if (!earlier || (earlier.isCreated && change.kind == Change::Kind::Set)) {
            apply(change);
            return;
        }
        if (earlier.node && change.kind == Change::Kind::Set) {
            open = joins_.try_emplace(change.address, *earlier.node).first;
        }
    }
    if (change.kind == Change::Kind::Set) {
        open->second.add(*change.node);
    }
}

void TextContent::finishJoining() {
    for (auto& [address, join] : joins_) {
        overlay_.put(address, {std::move(join).take(), false});
    }
    joins_.clear();
}

TextBody TextContent::write(Batch const& batch) const {
    auto const isRemoval = [](Change const& change) { return change.kind == Change::Kind::Remove; };
    if (std::none_of(batch.begin(), batch.end(), isRemoval)) {
        ContentWriter writer(body_, overlay_.entries().size() + batch.size());
        if (writeOver(writer, overlay_, batch)) {
            return std::move(writer).finish();
        }
    }
    Overlay overlay = overlay_;
    for (Change const& change : batch) {
        requireWritable(change);
        overlay.apply(change);
    }
    ContentWriter again(body_, overlay.entries().size());
    writeOver(again, overlay, {});
    return std::move(again).finish();
}

} // namespace project::stores
