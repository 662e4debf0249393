#include <string>

#include "Target.hpp"
#include "line/CanonicalLine.hpp"
#include "line/LineParser.hpp"
#include "line/NodeLine.hpp"
#include "project/metadata/MetadataNode.hpp"

namespace {

using namespace project::fuzz;
using project::stores::AddressText;
using project::stores::Change;
using project::stores::Node;

bool areSame(Node const& left, Node const& right) {
    return left == right || (left && right && isEqual(*left, *right));
}

std::string written(Change const& change) {
    std::string line;
    appendChangeLine(line, change);
    return line;
}

/// A readable line has the same change once it is written. There is one written form, which is recognised
/// without building a node.
void checkLine(std::string const& line) {
    auto const parsed = project::stores::parseLine(line);
    auto const canonical = project::stores::canonicalAddress(line);
    require(parsed.change.has_value() != (parsed.problem != nullptr), "a line has a change or a problem");
    if (!parsed.change) {
        require(!canonical, "an unreadable line is not canonical");
        return;
    }
    std::string const again = written(*parsed.change);
    auto const reread = project::stores::parseLine(again);
    require(reread.change && reread.change->kind == parsed.change->kind &&
                reread.change->address == parsed.change->address &&
                areSame(reread.change->node, parsed.change->node),
            "a written line has the same change");
    bool const removal = parsed.change->kind == Change::Kind::Remove;
    require(removal || canonical.has_value() == (again == line),
            "a line is canonical if it is written in this form");
    if (canonical) {
        require(toAddress(*canonical) == parsed.change->address, "a canonical line shows its address");
        require(toAddress(project::stores::addressOfCanonical(line)) == parsed.change->address,
                "the address of a canonical line is found");
        require(areSame(project::stores::stateOfLine(line).node, parsed.change->node),
                "a canonical line has its node");
    }
    std::string const ended = line + '\n';
    if (std::size_t const length = project::stores::plainPathLength(ended); length + 2 == line.size()) {
        require(canonical && canonical->text.size() == length, "the fast path accepts only canonical lines");
    }
}

/// Written addresses compare like the addresses themselves.
void checkOrder(std::string const& left, std::string const& right) {
    auto const one = project::stores::parseLine(left).change;
    auto const other = project::stores::parseLine(right).change;
    if (!one || !other) {
        return;
    }
    AddressText const oneText(one->address);
    AddressText const otherText(other->address);
    require(compare(oneText.view(), otherText.view()) == compare(one->address, other->address),
            "written addresses have the order of the addresses");
    require(isWithin(oneText.view(), otherText.view()) == one->address.isWithin(other->address),
            "written addresses lie within each other like the addresses");
}

/// Two lines.
void run(std::string_view input) {
    std::size_t const end = input.find('\n');
    std::string const first(input.substr(0, end));
    std::string const second(end == input.npos ? std::string_view() : input.substr(end + 1));
    if (second.find('\n') == std::string::npos) {
        checkLine(first);
        checkLine(second);
        checkOrder(first, second);
        checkOrder(second, first);
    }
}

Registration const registration("line", run);

} // namespace
