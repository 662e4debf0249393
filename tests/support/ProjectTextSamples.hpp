#pragma once

#include <initializer_list>
#include <map>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "text/ProjectText.hpp"

namespace project::stores::samples {

/// What stands at each address: a node told in full, or "made".
using Content = std::map<Address, std::string>;

/// A node told by its type, keys and nested nodes, in a form of its own that no line of a text has.
std::string told(metadata::MetadataNode const& node);

/// A node as told tells it, or "made" for none.
std::string told(Node const& node);

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

/// The closing line of a batch, its sum taken over the lines and the sum before.
std::string closingOf(std::vector<std::string> const& lines, std::string const& after);

/// The sum over the lines of a text.
std::string sumOf(std::string_view text);

/// Reads a text that is expected to be whole.
ProjectText readWhole(std::string bytes);

/// Walks through the whole content, and fails the test where children are not sorted, empty, or have more or
/// less below them than they say.
Content contentOf(ProjectText const& text);

/// Kinds and lines, as "Damage 3, Conflict 5".
std::string told(std::vector<Fault> const& faults);

/// Where a difference is, in their order.
std::vector<Address> addressesOf(std::vector<Difference> const& differences);

Change set(Address const& address, Node const& node = plainNode());
Change remove(Address const& address);
Change make(Address const& address);

} // namespace project::stores::samples
