#include "line/LineParser.hpp"

#include <map>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "line/JsonReader.hpp"
#include "line/JsonText.hpp"
#include "line/LineAddress.hpp"
#include "line/NodeLine.hpp"
#include "project/metadata/MetadataNodeSpecification.hpp"

namespace project::stores {

using metadata::MetadataNode;
using metadata::MetadataNodeSpecification;

namespace {

/// A node as it is written, before its type is known.
struct WrittenNode {
    std::optional<std::u16string> type;
    std::optional<std::map<std::u16string, std::u16string>> keys;
    std::optional<std::vector<WrittenNode>> children;
};

void fill(MetadataNode& node, WrittenNode&& written) {
    if (written.keys) {
        for (auto& [key, value] : *written.keys) {
            node.put(key, std::move(value));
        }
    }
    if (written.children) {
        for (WrittenNode& child : *written.children) {
            fill(*node.addChild(std::move(*child.type)), std::move(child));
        }
    }
}

Node buildNode(WrittenNode&& written) {
    std::u16string type = std::move(written.type).value_or(std::u16string(plainNodeType));
    bool const isEmpty =
        (!written.keys || written.keys->empty()) && (!written.children || written.children->empty());
    if (type == plainNodeType && isEmpty) {
        return plainNode();
    }
    auto node = std::make_shared<MetadataNodeSpecification>(std::move(type));
    fill(*node, std::move(written));
    node->shareValues(); // every query copies the node
    return node;
}

/// Reads one line, whatever the order of its members and its white space.
class LineParser {
public:
    explicit LineParser(std::string_view line) noexcept : reader_(line) {}

    /// @return false if the line is unreadable. Then problem returns the reason, and no other function may be
    /// called.
    bool parse() {
        bool const isRead = reader_.isNext('"') ? path() : object() && complete();
        return isRead && reader_.end();
    }

    char const* problem() const noexcept { return reader_.problem(); }

    Change::Kind kind() const noexcept { return kind_; }

    Address address() const {
        if (!path_.empty()) {
            return toAddress({LineAddress::Form::Names, path_});
        }
        Address address = Address::root();
        for (std::size_t i = 0; i < steps_.size(); i += 2) {
            address = address.child({decodeJsonContent(steps_[i]), decodeJsonContent(steps_[i + 1])});
        }
        return address;
    }

    /// May be called once.
    Node node() { return kind_ == Change::Kind::Set ? buildNode(std::move(node_)) : Node(); }

private:
    bool path() {
        std::string_view content;
        if (!reader_.string(content)) {
            return false;
        }
        if (content.find('\\') == std::string_view::npos) {
            path_ = content;
        } else {
            appendJsonContent(path_, decodeJsonContent(content));
        }
        return isPathContent(path_) || reader_.fail("PathWrong");
    }

    bool steps() {
        if (!reader_.expect('[')) {
            return false;
        }
        do {
            if (steps_.size() == 2 * deepestAddress) {
                return reader_.fail("AddressTooLong");
            }
            if (!reader_.string(steps_.emplace_back())) {
                return false;
            }
        } while (reader_.accept(','));
        return reader_.expect(']') && (steps_.size() % 2 == 0 || reader_.fail("AddressOpen"));
    }

    bool object() {
        return members([this](std::string_view name) { return lineMember(name); });
    }

    template <typename Member>
    bool members(Member const& member) {
        if (!reader_.expect('{')) {
            return false;
        }
        do {
            std::string_view name;
            if (!reader_.string(name) || !reader_.expect(':') || !member(name)) {
                return false;
            }
        } while (reader_.accept(','));
        return reader_.expect('}');
    }

    bool lineMember(std::string_view name) {
        if (name == "file" || name == "at" || name == "remove") {
            if (!std::exchange(addressMember_, name).empty()) {
                return reader_.fail("AddressTwice");
            }
            bool const isPath = name == "file" || (name == "remove" && reader_.isNext('"'));
            return isPath ? path() : steps();
        }
        if (name == "node" && !std::exchange(isCreated_, true)) {
            return reader_.word("false");
        }
        return nodeMember(name, node_, 0);
    }

    bool nodeMember(std::string_view name, WrittenNode& node, std::size_t nesting) {
        if (name == "type" && !node.type) {
            std::string_view content;
            bool const isRead = reader_.string(content);
            node.type = isRead ? decodeJsonContent(content) : std::u16string();
            return isRead;
        }
        if (name == "keys" && !node.keys) {
            return keys(node.keys.emplace());
        }
        if (name == "children" && !node.children) {
            return children(node.children.emplace(), nesting + 1);
        }
        return reader_.fail("MemberWrong");
    }

    bool keys(std::map<std::u16string, std::u16string>& keys) {
        if (!reader_.expect('{') || reader_.accept('}')) {
            return reader_.problem() == nullptr;
        }
        do {
            std::string_view key;
            std::string_view value;
            if (!reader_.string(key) || !reader_.expect(':') || !reader_.string(value)) {
                return false;
            }
            std::size_t const before = keys.size();
            keys.try_emplace(keys.end(), decodeJsonContent(key), decodeJsonContent(value));
            if (keys.size() == before) {
                return reader_.fail("KeyTwice");
            }
        } while (reader_.accept(','));
        return reader_.expect('}');
    }

    bool children(std::vector<WrittenNode>& children, std::size_t nesting) {
        if (nesting > deepestNesting) {
            return reader_.fail("NodesTooDeep");
        }
        if (!reader_.expect('[') || reader_.accept(']')) {
            return reader_.problem() == nullptr;
        }
        do {
            WrittenNode& child = children.emplace_back();
            if (!members([&](std::string_view name) { return nodeMember(name, child, nesting); })) {
                return false;
            }
            if (!child.type) {
                return reader_.fail("NodeWithoutType");
            }
        } while (reader_.accept(','));
        return reader_.expect(']');
    }

    /// Checks that the members of an object form a line.
    bool complete() {
        if (addressMember_.empty()) {
            return reader_.fail("AddressMissing");
        }
        bool const hasNode = node_.type || node_.keys || node_.children;
        bool const isRemoval = addressMember_ == "remove";
        if ((isCreated_ && hasNode) || (isRemoval && (isCreated_ || hasNode))) {
            return reader_.fail("MembersContradict");
        }
        kind_ = isRemoval ? Change::Kind::Remove : isCreated_ ? Change::Kind::Create : Change::Kind::Set;
        return true;
    }

    JsonReader reader_;
    std::string_view addressMember_;
    std::string path_;
    std::vector<std::string_view> steps_;
    bool isCreated_ = false;
    WrittenNode node_;
    Change::Kind kind_ = Change::Kind::Set;
};

} // namespace

ParsedLine parseLine(std::string_view line) {
    LineParser parser(line);
    if (!parser.parse()) {
        return {std::nullopt, parser.problem()};
    }
    return {Change{parser.kind(), parser.address(), parser.node()}, nullptr};
}

ParsedLine parseBodyLine(std::string_view line) {
    ParsedLine parsed = parseLine(line);
    if (parsed.change && parsed.change->kind == Change::Kind::Remove) {
        return {std::nullopt, "RemovalInBody"};
    }
    return parsed;
}

AddressState stateOfLine(std::string_view line) {
    if (isPlainPath(line)) {
        return {plainNode()};
    }
    LineParser parser(line);
    if (!parser.parse()) {
        return {};
    }
    return {parser.node(), parser.kind() == Change::Kind::Create};
}

} // namespace project::stores
