#include "TextDifference.hpp"

#include <algorithm>
#include <set>

#include "JsonText.hpp"

namespace project::stores {

namespace {

bool isSame(Standing const& left, Standing const& right) {
    if (left.node == nullptr || right.node == nullptr) {
        return left.node == right.node && left.made == right.made;
    }
    return left.node == right.node || isEqual(*left.node, *right.node);
}

class Comparison {
public:
    Comparison(TextContent const& left, TextContent const& right, std::size_t limit)
        : left_(left), right_(right), limit_(limit) {}

    std::optional<std::vector<Address>> find() {
        compareBodies();
        lookThrough(left_);
        lookThrough(right_);
        if (tooMany()) {
            return std::nullopt;
        }
        return std::vector<Address>(found_.begin(), found_.end());
    }

private:
    bool tooMany() const noexcept { return found_.size() > limit_; }

    void look(Address const& address) {
        if (!isSame(left_.at(address), right_.at(address))) {
            found_.insert(address);
        }
    }

    void compareBodies() {
        TextBody const& left = left_.body();
        TextBody const& right = right_.body();
        std::size_t const same = firstDifference(left.bytes(), right.bytes());
        std::size_t l = std::min(left.linesBefore(same), right.linesBefore(same));
        std::size_t r = l;
        while ((l < left.size() || r < right.size()) && !tooMany()) {
            if (l < left.size() && r < right.size() && left.line(l) == right.line(r)) {
                ++l;
                ++r;
                continue;
            }
            bool const leftEnds = l == left.size();
            auto const order = leftEnds            ? std::strong_ordering::greater
                               : r == right.size() ? std::strong_ordering::less
                                                   : compare(left.address(l), right.address(r));
            look(toAddress(std::is_gt(order) ? right.address(r) : left.address(l)));
            l += std::is_lteq(order) ? 1 : 0;
            r += std::is_gteq(order) ? 1 : 0;
        }
    }

    /// Looks wherever a content says something else than its body does.
    void lookThrough(TextContent const& content) {
        for (auto const& [address, entry] : content.overlay().entries()) {
            if (tooMany()) {
                return;
            }
            look(address);
            if (entry.hides) {
                lookAtHidden(content.body(), address);
            }
        }
    }

    void lookAtHidden(TextBody const& body, Address const& address) {
        TextBody::Range const hidden = body.within(AddressText(address).view());
        for (std::size_t i = hidden.begin; i < hidden.end && !tooMany(); ++i) {
            look(toAddress(body.address(i)));
        }
    }

    TextContent const& left_;
    TextContent const& right_;
    std::size_t limit_;
    std::set<Address> found_;
};

} // namespace

std::optional<std::vector<Address>> differences(TextContent const& left, TextContent const& right,
                                                std::size_t limit) {
    return Comparison(left, right, limit).find();
}

} // namespace project::stores
