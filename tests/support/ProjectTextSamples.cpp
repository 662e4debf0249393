#include "support/ProjectTextSamples.hpp"

#include <stdexcept>

#include <gtest/gtest.h>

#include "project/metadata/MetadataNodeSpecification.hpp"
#include "text/TextLines.hpp"
#include "text/TextSum.hpp"

namespace project::stores::samples {

namespace {

std::string asciiOf(std::u16string const& text) {
    std::string result;
    for (char16_t const unit : text) {
        bool const letter = unit >= 0x20 && unit < 0x7F && unit != '<' && unit != '>';
        result += letter ? std::string(1, static_cast<char>(unit)) : "<" + std::to_string(unit) + ">";
    }
    return result;
}

void fill(metadata::MetadataNode& node, Keys const& keys, std::vector<Nested> const& nested) {
    for (auto const& [key, value] : keys) {
        node.put(key, value);
    }
    for (Nested const& child : nested) {
        fill(*node.addChild(child.type), child.keys, child.nested);
    }
}

void walk(ProjectText const& text, Address const& parent, Content& content) {
    Children const children = text.children(parent);
    for (std::size_t i = 0; i < children.size(); ++i) {
        Child const& child = children[i];
        Address const address = parent.child(child.element);
        EXPECT_TRUE(i == 0 || children[i - 1].element < child.element)
            << described(plainNode()) << " at " << i;
        EXPECT_TRUE(child.node != nullptr || child.isCreated || child.hasChildren);
        EXPECT_FALSE(child.node != nullptr && child.isCreated);
        if (child.node || child.isCreated) {
            content.emplace(address, described(child.node));
        }
        std::size_t const before = content.size();
        walk(text, address, content);
        EXPECT_EQ(child.hasChildren, content.size() > before);
    }
}

} // namespace

std::string described(metadata::MetadataNode const& node) {
    std::string result = asciiOf(node.getType()) + "(";
    for (std::u16string const& key : node.getKeys()) {
        result += asciiOf(key) + "=" + asciiOf(node.get(key)) + ";";
    }
    for (auto const& child : node.getChildren()) {
        result += described(*child);
    }
    return result + ")";
}

std::string described(Node const& node) {
    return node ? described(*node) : "created";
}

Node makeNode(std::u16string const& type, Keys const& keys, std::vector<Nested> const& nested) {
    auto node = std::make_shared<metadata::MetadataNodeSpecification>(type);
    fill(*node, keys, nested);
    return node;
}

Address fileAddress(std::u16string_view path) {
    Address address = addressOf({u"Files", u"Root"});
    while (true) {
        std::size_t const end = path.find(u'/');
        address = address.child({u"File", std::u16string(path.substr(0, end))});
        if (end == path.npos) {
            return address;
        }
        path.remove_prefix(end + 1);
    }
}

Address addressOf(std::initializer_list<char16_t const*> steps) {
    Address address = Address::root();
    for (auto step = steps.begin(); step != steps.end(); step += 2) {
        address = address.child({step[0], step[1]});
    }
    return address;
}

std::string bodyOf(std::initializer_list<std::string_view> lines) {
    std::string text = std::string(firstLine) + "\n";
    for (std::string_view const line : lines) {
        text += line;
        text += '\n';
    }
    return text + std::string(endLine) + "\n";
}

std::string closingOf(std::vector<std::string> const& lines, std::string const& after) {
    TextSum sum;
    for (std::string const& line : lines) {
        sum.add(line);
    }
    sum.add(after);
    return R"({"batch":{"lines":)" + std::to_string(lines.size()) + R"(,"after":")" + after + R"(","sum":")" +
           sum.hex() + R"("}})";
}

std::string sumOf(std::string_view text) {
    TextSum sum;
    sum.addLines(text);
    return sum.hex();
}

ProjectText readWhole(std::string bytes) {
    auto text = ProjectText::read(std::move(bytes), "project.jsonl");
    if (!text) {
        throw std::runtime_error("the text of this test is incomplete");
    }
    return *std::move(text);
}

Content contentOf(ProjectText const& text) {
    Content content;
    walk(text, Address::root(), content);
    return content;
}

std::string described(std::vector<Fault> const& faults) {
    constexpr char const* kinds[] = {"Damage", "Conflict", "Irregular", "TornTail", "Displaced"};
    std::string result;
    for (Fault const& fault : faults) {
        result += result.empty() ? "" : ", ";
        result += kinds[static_cast<int>(fault.kind)];
        result += ' ' + std::to_string(fault.line);
    }
    return result;
}

std::vector<Address> addressesOf(std::vector<Difference> const& differences) {
    std::vector<Address> addresses;
    addresses.reserve(differences.size());
    for (auto const& difference : differences) {
        addresses.push_back(difference.address);
    }
    return addresses;
}

Change set(Address const& address, Node const& node) {
    return {Change::Kind::Set, address, node};
}

Change remove(Address const& address) {
    return {Change::Kind::Remove, address, nullptr};
}

Change make(Address const& address) {
    return {Change::Kind::Create, address, nullptr};
}

} // namespace project::stores::samples
