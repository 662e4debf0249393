#include "TextContents.hpp"

#include "Target.hpp"
#include "TextInput.hpp"
#include "line/NodeLine.hpp"

namespace project::fuzz {

using stores::Address;
using stores::Child;
using stores::Children;
using stores::Node;
using stores::ProjectText;

namespace {

/// Calls add(address, node) for each address with a node or created without one, in order.
/// @return true if there are any.
template <typename Add>
bool walk(ProjectText const& text, Address const& parent, Add const& add) {
    Children const children = text.children(parent);
    for (std::size_t i = 0; i < children.size(); ++i) {
        Child const& child = children[i];
        require(i == 0 || children[i - 1].element < child.element, "children are sorted");
        require(child.node || child.isCreated || child.hasChildren,
                "a child has a node, was created, or has children");
        require(!child.node || !child.isCreated, "an address has a node or was created without one");
        Address const address = parent.child(child.element);
        if (child.node || child.isCreated) {
            add(address, child.node);
        }
        require(child.hasChildren == walk(text, address, add), "a child says whether it has children");
    }
    return !children.empty();
}

void appendLine(std::string& out, Address const& address, Node const& node) {
    stores::appendNodeLine(out, stores::AddressText(address), node);
}

} // namespace

Contents contentsOf(ProjectText const& text) {
    Contents contents;
    walk(text, Address::root(),
         [&](Address const& address, Node const& node) { appendLine(contents[address], address, node); });
    return contents;
}

std::string canonicalOf(ProjectText const& text) {
    std::string lines;
    walk(text, Address::root(), [&](Address const& address, Node const& node) {
        appendLine(lines, address, node);
        lines += '\n';
    });
    return framed(lines);
}

void requireTidy(ProjectText const& text) {
    require(text.faults().empty(), "a written text has no faults");
    require(text.isTidy() && text.tailSize() == 0, "a written text is tidy");
}

} // namespace project::fuzz
