#include "text/TextDifference.hpp"

#include <algorithm>
#include <iterator>
#include <utility>
#include <vector>

#include "line/JsonText.hpp"

namespace project::stores {

namespace {

bool isSame(AddressState const& left, AddressState const& right) {
    if (left.node == nullptr || right.node == nullptr) {
        return left.node == right.node && left.isCreated == right.isCreated;
    }
    return left.node == right.node || isEqual(*left.node, *right.node);
}

/// Finds the addresses at which two contents may differ: those at which the lines of their bodies differ, and
/// those that an overlay covers.
class Candidates {
public:
    Candidates(TextContent const& left, TextContent const& right) : left_(left), right_(right) {
        compareBodies();
        std::size_t const ofBodies = found_.size();
        addOverlay(left_);
        addOverlay(right_);
        if (found_.size() > ofBodies) {
            std::sort(found_.begin(), found_.end());
            found_.erase(std::unique(found_.begin(), found_.end()), found_.end());
        }
    }

    /// Sorted.
    std::vector<Address> const& found() const noexcept { return found_; }

private:
    void compareBodies() {
        TextBody const& left = left_.body();
        TextBody const& right = right_.body();
        std::size_t const same = firstDifference(left.bytes(), right.bytes());
        std::size_t l = std::min(left.linesBefore(same), right.linesBefore(same));
        std::size_t r = l;
        while (l < left.size() || r < right.size()) {
            if (l < left.size() && r < right.size() && left.line(l) == right.line(r)) {
                ++l;
                ++r;
                continue;
            }
            bool const isLeftAtEnd = l == left.size();
            auto const order = isLeftAtEnd         ? std::strong_ordering::greater
                               : r == right.size() ? std::strong_ordering::less
                                                   : compare(left.address(l), right.address(r));
            found_.push_back(toAddress(std::is_gt(order) ? right.address(r) : left.address(l)));
            l += std::is_lteq(order) ? 1 : 0;
            r += std::is_gteq(order) ? 1 : 0;
        }
    }

    void addOverlay(TextContent const& content) {
        for (auto const& [address, entry] : content.overlay().entries()) {
            found_.push_back(address);
            if (entry.isHiding) {
                addHidden(content.body(), address);
            }
        }
    }

    void addHidden(TextBody const& body, Address const& address) {
        TextBody::Range const hidden = body.within(AddressText(address).view());
        for (std::size_t i = hidden.begin; i < hidden.end; ++i) {
            found_.push_back(toAddress(body.address(i)));
        }
    }

    TextContent const& left_;
    TextContent const& right_;
    std::vector<Address> found_;
};

} // namespace

void addIfDifferent(std::vector<Difference>& found, Address const& address, AddressState const& before,
                    AddressState const& after) {
    if (!isSame(before, after)) {
        found.push_back({address, before.node, after.node});
    }
}

std::vector<Difference> differences(TextContent const& before, TextContent const& after) {
    std::vector<Difference> found;
    Candidates const candidates(before, after);
    for (Address const& address : candidates.found()) {
        addIfDifferent(found, address, before.at(address), after.at(address));
    }
    return found;
}

void addChanges(Changes& earlier, Changes later) {
    earlier.everything = earlier.everything || later.everything;
    if (later.differences.empty()) {
        return; // as after nearly every check
    }
    earlier.differences.insert(earlier.differences.end(), std::make_move_iterator(later.differences.begin()),
                               std::make_move_iterator(later.differences.end()));
}

} // namespace project::stores
