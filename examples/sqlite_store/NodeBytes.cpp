#include "NodeBytes.hpp"

#include <cstdint>
#include <memory>

#include <project/metadata/MetadataNodeSpecification.hpp>

namespace sqlite_store {

using project::metadata::MetadataNode;
using project::metadata::MetadataNodeSpecification;

namespace {

/// Nodes are nested two levels deep. The limit protects the stack from damaged bytes.
constexpr int deepestNesting = 100;

constexpr int bitsOfAByte = 8;

void requireNesting(int depth) {
    if (depth > deepestNesting) {
        throw NodeBytesError("a node is nested too deeply");
    }
}

void appendNumber(std::string& out, std::size_t number) {
    if (number > UINT32_MAX) {
        throw NodeBytesError("a node is too large");
    }
    for (int shift = 3 * bitsOfAByte; shift >= 0; shift -= bitsOfAByte) {
        out += static_cast<char>((number >> shift) & 0xFF);
    }
}

void appendText(std::string& out, std::u16string_view text) {
    auto const bytes = bytesOf(text);
    appendNumber(out, bytes.size());
    out += bytes;
}

void appendNode(std::string& out, MetadataNode const& node, int depth) {
    requireNesting(depth);
    appendText(out, node.getType());
    auto const keys = node.getKeys();
    appendNumber(out, keys.size());
    for (auto const& key : keys) {
        appendText(out, key);
        appendText(out, node.get(key));
    }
    appendNumber(out, node.getChildren().size());
    for (auto const& child : node.getChildren()) {
        appendNode(out, *child, depth + 1);
    }
}

/// Takes the parts of a node off the front of its bytes.
class NodeReader {
public:
    explicit NodeReader(std::string_view bytes) : rest_(bytes) {}

    bool isAtEnd() const { return rest_.empty(); }

    std::u16string takeText() { return textOf(take(takeNumber())); }

    /// Takes the keys and nested nodes of a node, whose type was taken already.
    void fill(MetadataNode& node, int depth) {
        requireNesting(depth);
        for (auto count = takeNumber(); count > 0; --count) {
            auto key = takeText();
            node.put(std::move(key), takeText());
        }
        for (auto count = takeNumber(); count > 0; --count) {
            fill(*node.addChild(takeText()), depth + 1);
        }
    }

private:
    std::string_view take(std::size_t size) {
        if (size > rest_.size()) {
            throw NodeBytesError("a node is cut off");
        }
        auto const taken = rest_.substr(0, size);
        rest_.remove_prefix(size);
        return taken;
    }

    std::size_t takeNumber() {
        std::size_t number = 0;
        for (char const byte : take(sizeof(std::uint32_t))) {
            number = (number << bitsOfAByte) | static_cast<unsigned char>(byte);
        }
        return number;
    }

    std::string_view rest_;
};

} // namespace

std::string bytesOf(std::u16string_view text) {
    std::string bytes;
    bytes.reserve(2 * text.size());
    for (char16_t const unit : text) {
        bytes += static_cast<char>(unit >> bitsOfAByte);
        bytes += static_cast<char>(unit & 0xFF);
    }
    return bytes;
}

std::u16string textOf(std::string_view bytes) {
    if (bytes.size() % 2 != 0) {
        throw NodeBytesError("a text is cut off");
    }
    std::u16string text;
    text.reserve(bytes.size() / 2);
    for (std::size_t at = 0; at < bytes.size(); at += 2) {
        auto const high = static_cast<unsigned char>(bytes[at]);
        auto const low = static_cast<unsigned char>(bytes[at + 1]);
        text += static_cast<char16_t>((high << bitsOfAByte) | low);
    }
    return text;
}

std::string bytesOf(MetadataNode const& node) {
    std::string bytes;
    appendNode(bytes, node, 0);
    return bytes;
}

project::stores::Node nodeOf(std::string_view bytes) {
    NodeReader reader(bytes);
    auto const node = std::make_shared<MetadataNodeSpecification>(reader.takeText());
    reader.fill(*node, 0);
    if (!reader.isAtEnd()) {
        throw NodeBytesError("a node has bytes left over");
    }
    return node;
}

} // namespace sqlite_store
