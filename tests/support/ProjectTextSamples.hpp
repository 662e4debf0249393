#pragma once

#include <initializer_list>
#include <map>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "text/ProjectText.hpp"

namespace project::stores::samples {

/// The node at each address, described in full, or "created".
using Content = std::map<Address, std::string>;

/// Describes a node by its type, keys and nested nodes, in a form that differs from every line of a text.
std::string described(metadata::MetadataNode const& node);

/// The same, or "created" for no node.
std::string described(Node const& node);

using Keys = std::map<std::u16string, std::u16string>;

struct Nested {
    std::u16string type;
    Keys keys;
    std::vector<Nested> nested;
};

Node makeNode(std::u16string const& type, Keys const& keys, std::vector<Nested> const& nested = {});

/// The address of a file by its path.
Address fileAddress(std::u16string_view path);

/// The address with these types and locations in turn.
Address addressOf(std::initializer_list<char16_t const*> steps);

/// A body of these lines, between the first and the last one.
std::string bodyOf(std::initializer_list<std::string_view> lines);

/// The closing line of a batch, with the checksum over the lines and the preceding checksum.
std::string closingOf(std::vector<std::string> const& lines, std::string const& after);

/// The checksum over the lines of a text.
std::string sumOf(std::string_view text);

/// Reads a complete text.
ProjectText readWhole(std::string bytes);

/// Walks through the whole content. The test fails when children are not sorted or empty, or when one has
/// children and does not say so, or the reverse.
Content contentOf(ProjectText const& text);

/// Kinds and lines, as "Damage 3, Conflict 5".
std::string described(std::vector<Fault> const& faults);

/// The addresses of differences, in order.
std::vector<Address> addressesOf(std::vector<Difference> const& differences);

Change set(Address const& address, Node const& node = plainNode());
Change remove(Address const& address);
Change make(Address const& address);

} // namespace project::stores::samples
