#include "line/NodeLine.hpp"

#include <algorithm>
#include <memory>
#include <utility>
#include <vector>

#include "line/JsonText.hpp"
#include "project/metadata/MetadataNodeSpecification.hpp"
#include "project/stores/StoreError.hpp"
#include "texts/ErrorTexts.hpp"

namespace project::stores {

using metadata::MetadataNode;

namespace {

bool isPlain(MetadataNode const& node) {
    return &node == plainNode().get() ||
           (node.getType() == plainNodeType && node.getChildren().empty() && node.getKeys().empty());
}

void appendKeys(std::string& out, MetadataNode const& node) {
    std::vector<std::u16string> const keys = node.getKeys();
    char before = '{';
    for (std::u16string const& key : keys) {
        out += before == '{' ? R"(,"keys":)" : "";
        out += std::exchange(before, ',');
        appendJsonString(out, key);
        out += ':';
        appendJsonString(out, node.get(key));
    }
    out += keys.empty() ? "" : "}";
}

void appendChildren(std::string& out, MetadataNode const& node) {
    char before = '[';
    for (auto const& child : node.getChildren()) {
        out += before == '[' ? R"(,"children":)" : "";
        out += std::exchange(before, ',');
        appendNestedNode(out, *child);
    }
    out += node.getChildren().empty() ? "" : "]";
}

/// The address as the value of a member.
void appendAddress(std::string& out, LineAddress const& address) {
    bool const isPath = address.form == LineAddress::Form::Names;
    out += isPath ? '"' : '[';
    out += address.text;
    out += isPath ? '"' : ']';
}

/// True if a node has at most this many levels of nested nodes.
bool nestsWithin(MetadataNode const& node, std::size_t levels) {
    auto const& children = node.getChildren();
    return children.empty() ||
           (levels > 0 && std::all_of(children.begin(), children.end(),
                                      [&](auto const& child) { return nestsWithin(*child, levels - 1); }));
}

} // namespace

Node const& plainNode() {
    static Node const node =
        std::make_shared<metadata::MetadataNodeSpecification>(std::u16string(plainNodeType));
    return node;
}

void appendNodeLine(std::string& out, AddressText const& address, Node const& node) {
    LineAddress const view = address.view();
    bool const isPath = view.form == LineAddress::Form::Names;
    if (isPath && node && isPlain(*node)) {
        appendAddress(out, view);
        return;
    }
    out += isPath ? R"({"file":)" : R"({"at":)";
    appendAddress(out, view);
    if (!node) {
        out += R"(,"node":false})";
        return;
    }
    if (node->getType() != plainNodeType) {
        out += R"(,"type":)";
        appendJsonString(out, node->getType());
    }
    appendKeys(out, *node);
    appendChildren(out, *node);
    out += '}';
}

void appendRemovalLine(std::string& out, AddressText const& address) {
    out += R"({"remove":)";
    appendAddress(out, address.view());
    out += '}';
}

void appendChangeLine(std::string& out, Change const& change) {
    AddressText const address(change.address);
    if (change.kind == Change::Kind::Remove) {
        appendRemovalLine(out, address);
    } else {
        appendNodeLine(out, address, change.node);
    }
}

void appendNestedNode(std::string& out, MetadataNode const& node) {
    out += R"({"type":)";
    appendJsonString(out, node.getType());
    appendKeys(out, node);
    appendChildren(out, node);
    out += '}';
}

void requireWritable(Change const& change) {
    if (change.address.depth() > deepestAddress) {
        throw StoreError(StoreError::Kind::Refused, "", 0, errorTexts.get("AddressTooDeep"),
                         errorTexts.get("RemedyOfDeepAddress"));
    }
    if (change.node && !nestsWithin(*change.node, deepestNesting)) {
        throw StoreError(StoreError::Kind::Refused, "", 0, errorTexts.get("NestedTooDeep"), "");
    }
}

} // namespace project::stores
