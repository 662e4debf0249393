#include "text/TextContent.hpp"

#include <algorithm>
#include <utility>

#include "line/LineParser.hpp"
#include "line/NodeLine.hpp"
#include "text/OverlaidChildren.hpp"

namespace project::stores {

namespace {

Standing standingOf(std::string_view line) {
    Node node = nodeOfLine(line);
    bool const made = node == nullptr;
    return {std::move(node), made};
}

} // namespace

Children TextContent::children(Address const& parent) const {
    AddressText const text(parent);
    TextBody::Range lines{0, 0};
    if (!overlay_.isHidden(parent)) {
        lines = body_.within(text.view());
        bool const own = !lines.empty() && std::is_eq(compare(body_.address(lines.begin), text.view()));
        lines.begin += own ? 1 : 0;
    }
    Overlay::Range const entries = overlay_.below(parent);
    if (entries.empty()) {
        return body_.children(lines, parent.depth());
    }
    return overlaidChildren(body_, lines, entries, parent.depth());
}

Standing TextContent::at(Address const& address) const {
    Overlay::Entry const* const entry = overlay_.find(address);
    if (entry != nullptr) {
        return entry->standing;
    }
    if (overlay_.isHidden(address)) {
        return {};
    }
    auto const line = body_.find(AddressText(address).view());
    return line ? standingOf(body_.line(*line)) : Standing{};
}

std::vector<Address> TextContent::standingWithin(Address const& address) const {
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
    auto const addStanding = [&](Address const& candidate, Overlay::Entry const& entry) {
        if (entry.standing) {
            found.push_back(candidate);
        }
    };
    if (Overlay::Entry const* const own = overlay_.find(address)) {
        addStanding(address, *own);
    }
    for (auto const& [candidate, entry] : overlay_.below(address)) {
        addStanding(candidate, entry);
    }
    std::sort(found.begin(), found.end());
    return found;
}

void TextContent::apply(Change const& change) {
    if (!joins_.empty()) {
        auto const begin = joins_.lower_bound(change.address);
        auto end = begin;
        bool const withAllBelow = change.kind == Change::Kind::Remove;
        while (end != joins_.end() &&
               (withAllBelow ? end->first.isWithin(change.address) : end->first == change.address)) {
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
        Standing const earlier = at(change.address);
        if (!earlier || (earlier.made && change.kind == Change::Kind::Set)) {
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
    Overlay overlay = overlay_;
    for (Change const& change : batch) {
        requireWritable(change);
        overlay.apply(change);
    }
    constexpr std::size_t expectedLine = 64;
    BodyWriter writer(body_, overlay.entries().size() * expectedLine);
    TextBody::Range rest = body_.all();
    std::string line;
    for (auto const& [address, entry] : overlay.entries()) {
        AddressText const text(address);
        std::size_t const found = body_.lowerBound(rest, text.view());
        writer.copy({rest.begin, found});
        rest.begin = found;
        if (entry.hides) {
            rest.begin = body_.endOf(rest, text.view());
        } else if (!rest.empty() && std::is_eq(compare(body_.address(found), text.view()))) {
            ++rest.begin;
        }
        if (entry.standing) {
            line.clear();
            appendNodeLine(line, text, entry.standing.node);
            writer.add(line);
        }
    }
    writer.copy(rest);
    return std::move(writer).finish();
}

} // namespace project::stores
