#include <vector>

#include "Target.hpp"
#include "TextContents.hpp"
#include "TextInput.hpp"

namespace {

using namespace project::fuzz;
using project::stores::Address;
using project::stores::Difference;

/// The addresses at which two contents differ, in order.
std::vector<Address> differing(Contents const& left, Contents const& right) {
    std::vector<Address> found;
    auto l = left.begin();
    auto r = right.begin();
    while (l != left.end() || r != right.end()) {
        bool const onlyLeft = r == right.end() || (l != left.end() && l->first < r->first);
        bool const onlyRight = l == left.end() || (r != right.end() && r->first < l->first);
        if (onlyLeft || onlyRight || l->second != r->second) {
            found.push_back(onlyRight ? r->first : l->first);
        }
        l = onlyRight ? l : std::next(l);
        r = onlyLeft ? r : std::next(r);
    }
    return found;
}

bool areAt(std::vector<Difference> const& differences, std::vector<Address> const& addresses) {
    return std::equal(
        differences.begin(), differences.end(), addresses.begin(), addresses.end(),
        [](Difference const& difference, Address const& address) { return difference.address == address; });
}

/// Two texts differ at the addresses at which their contents differ.
void run(std::string_view input) {
    auto const parts = partsOf(input);
    auto const left = readText(textOf(parts[0]));
    auto const right = readText(textOf(parts[1]));
    if (!left || !right) {
        return;
    }
    auto const expected = differing(contentsOf(*left), contentsOf(*right));
    require(areAt(left->differencesTo(*right), expected),
            "texts differ at the addresses at which their contents differ");
    require(areAt(right->differencesTo(*left), expected), "texts differ in both directions");
    require(left->differencesTo(*left).empty(), "a text does not differ from itself");
}

Registration const registration("difference", run);

} // namespace
