#include "TextContents.hpp"

#include <algorithm>

#include "Target.hpp"
#include "line/NodeLine.hpp"
#include "project/stores/StoreError.hpp"
#include "text/TextLines.hpp"

namespace project::fuzz {

using stores::Address;
using stores::Child;
using stores::Children;
using stores::Fault;
using stores::Node;
using stores::ProjectText;

namespace {

void walk(ProjectText const& text, Address const& parent, Contents& contents) {
    Children const children = text.children(parent);
    for (std::size_t i = 0; i < children.size(); ++i) {
        Child const& child = children[i];
        require(i == 0 || children[i - 1].element < child.element, "children are sorted");
        require(child.node || child.isCreated || child.hasChildren, "a child has something");
        require(!child.node || !child.isCreated, "an address has a node or was made without");
        Address const address = parent.child(child.element);
        if (child.node || child.isCreated) {
            contents.emplace(address, lineOf(address, child.node));
        }
        std::size_t const before = contents.size();
        walk(text, address, contents);
        require(child.hasChildren == (contents.size() > before), "a child knows whether something is below");
    }
}

bool hasFault(ProjectText const& text, Fault::Kind kind) {
    auto const& faults = text.faults();
    return std::any_of(faults.begin(), faults.end(), [&](Fault const& fault) { return fault.kind == kind; });
}

void checkTidy(ProjectText const& tidy, Contents const& contents) {
    require(tidy.faults().empty(), "what is written has no faults");
    require(tidy.isTidy() && tidy.tailSize() == 0, "what is written is tidy");
    require(contentsOf(tidy) == contents, "what is written says what was read");
}

} // namespace

std::string lineOf(Address const& address, Node const& node) {
    std::string line;
    stores::appendNodeLine(line, stores::AddressText(address), node);
    return line;
}

Contents contentsOf(ProjectText const& text) {
    Contents contents;
    walk(text, Address::root(), contents);
    return contents;
}

std::string framed(std::string_view lines, std::string_view tail) {
    std::string text(stores::firstLine);
    text += '\n';
    text += lines;
    text += lines.empty() || lines.ends_with('\n') ? "" : "\n";
    text += stores::endLine;
    text += '\n';
    text += tail;
    return text;
}

std::optional<ProjectText> readText(std::string bytes) {
    try {
        return ProjectText::read(std::move(bytes), "input");
    } catch (stores::StoreError const&) {
        return std::nullopt;
    }
}

void checkText(ProjectText const& text, std::string_view bytes) {
    Contents const contents = contentsOf(text);
    require(text.hasSameBytes(bytes), "a text keeps the bytes that were read");
    require(text.damagedLines().empty() != hasFault(text, Fault::Kind::Damage), "what is damaged is kept");

    ProjectText const tidy = text.rewrittenWith({});
    checkTidy(tidy, contents);
    require(text.isTidy() == (tidy.body() == bytes), "a text is tidy if writing it gives the same bytes");
    auto const again = readText(tidy.body());
    require(again.has_value(), "what is written can be read");
    checkTidy(*again, contents);
    require(again->rewrittenWith({}).body() == tidy.body(), "the same content gives the same bytes");
    require(text.differencesTo(*again).empty() && again->differencesTo(text).empty() &&
                text.differencesTo(text).empty(),
            "texts that say the same do not differ");
    require(text.differencesTo(ProjectText::empty()).empty() == contents.empty(),
            "a text with something in it differs from one without");
}

} // namespace project::fuzz
