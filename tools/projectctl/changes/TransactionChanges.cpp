#include "changes/TransactionChanges.hpp"

#include <algorithm>
#include <utility>

#include "project/stores/Node.hpp"
#include "project/stores/TreeMetadataManager.hpp"

namespace projectctl {

using project::stores::Address;
using project::stores::Backend;
using project::stores::Child;
using project::stores::Children;
using project::stores::Difference;
using project::stores::TreeMetadataManager;

namespace {

bool isSame(project::stores::Node const& left, project::stores::Node const& right) {
    return left == right || (left && right && project::metadata::isEqual(*left, *right));
}

/// The comparison of two lists of children, which are sorted.
class LevelComparison {
public:
    /// @param found receives the differences. @param below receives the addresses to compare next.
    LevelComparison(Address const& parent, std::vector<Difference>& found, std::vector<Address>& below)
        : parent_(parent), found_(found), below_(below) {}

    void run(Children const& before, Children const& after) {
        auto left = before.begin();
        auto right = after.begin();
        while (left != before.end() || right != after.end()) {
            if (right == after.end() || (left != before.end() && left->element < right->element)) {
                compare(*left, {left->element, nullptr, false, false});
                ++left;
            } else if (left == before.end() || right->element < left->element) {
                compare({right->element, nullptr, false, false}, *right);
                ++right;
            } else {
                compare(*left++, *right++);
            }
        }
    }

private:
    void compare(Child const& before, Child const& after) {
        bool const isChanged = !isSame(before.node, after.node);
        if (isChanged || before.hasChildren || after.hasChildren) {
            auto address = parent_.child(before.element);
            if (isChanged) {
                found_.push_back({address, before.node, after.node});
            }
            if (before.hasChildren || after.hasChildren) {
                below_.push_back(std::move(address));
            }
        }
    }

    Address const& parent_;
    std::vector<Difference>& found_;
    std::vector<Address>& below_;
};

std::vector<Difference> differences(Backend& before, TreeMetadataManager& now) {
    std::vector<Difference> result;
    std::vector<Address> waiting{Address::root()};
    while (!waiting.empty()) {
        auto const address = std::move(waiting.back());
        waiting.pop_back();
        project::stores::ChildCollector after;
        now.loadChildren(address, after);
        LevelComparison(address, result, waiting).run(before.load(address), after.take());
    }
    std::ranges::sort(result,
                      [](auto const& left, auto const& right) { return left.address < right.address; });
    return result;
}

} // namespace

std::vector<Difference> changesOfTransaction(OpenProject& project) {
    return differences(project.backend(), project.access().store());
}

std::vector<Difference> personalChangesOfTransaction(OpenProject& project) {
    auto& access = project.access();
    return access.hasPersonalChanges() ? differences(access.personalText(), access.personalStore())
                                       : std::vector<Difference>();
}

} // namespace projectctl
