#include "project/metadata/MetadataPath.hpp"

#include <algorithm>
#include <atomic>
#include <cstdint>
#include <memory>
#include <utility>

#include "project/metadata/MetadataPathBuilder.hpp"

namespace project::metadata {

using Elements = std::vector<PathElement>;

/// A step and a pointer to the step above it, shared by all addresses that contain both.
struct MetadataPath::Step {
    /// @param above a use that the new step takes over.
    Step(Step const* above, PathElement last)
        : depth(above != nullptr ? above->depth + 1 : 1), parent(above), element(std::move(last)) {}

    Step(Step const&) = delete;
    Step& operator=(Step const&) = delete;

    ~Step() { delete list.load(std::memory_order_relaxed); }

    /// Adds a use. @return the step.
    static Step const* use(Step const* step) noexcept {
        if (step != nullptr) {
            step->uses.fetch_add(1, std::memory_order_relaxed);
        }
        return step;
    }

    /// Removes a use, and deletes the step after the last one. Releases the steps above in a loop: recursion
    /// would overflow the stack for a very long address.
    static void release(Step const* step) noexcept {
        while (step != nullptr && step->uses.fetch_sub(1, std::memory_order_acq_rel) == 1) {
            auto const* const above = step->parent;
            delete step;
            step = above;
        }
    }

    mutable std::atomic<std::uint32_t> uses = 1;
    std::uint32_t depth;
    Step const* parent;
    PathElement element;
    mutable std::atomic<Elements const*> list = nullptr;
};

namespace {

std::strong_ordering compareElements(PathElement const& left, PathElement const& right) noexcept {
    int const types = left.getType().compare(right.getType());
    int const order = types != 0 ? types : left.getLocation().compare(right.getLocation());
    return order <=> 0;
}

/// Compares two steps of the same depth, from the root down to them.
template <typename Step>
std::strong_ordering compareSteps(Step const* left, Step const* right) noexcept {
    std::strong_ordering order = std::strong_ordering::equal;
    while (left != right) {
        std::strong_ordering const here = compareElements(left->element, right->element);
        if (std::is_neq(here)) {
            order = here; // the difference nearest to the root decides, and this loop ends at the root
        }
        left = left->parent;
        right = right->parent;
    }
    return order;
}

template <typename Step>
Step const* ascend(Step const* step, std::size_t depth) noexcept {
    while (step != nullptr && step->depth > depth) {
        step = step->parent;
    }
    return step;
}

} // namespace

MetadataPath::MetadataPath(std::vector<PathElement> elements) : MetadataPath(root()) {
    for (auto& element : elements) {
        step_ = new Step(step_, std::move(element));
    }
}

MetadataPath::MetadataPath(MetadataPath const& other) noexcept : step_(Step::use(other.step_)) {
}

MetadataPath& MetadataPath::operator=(MetadataPath const& other) noexcept {
    MetadataPath copy(other);
    std::swap(step_, copy.step_);
    return *this;
}

MetadataPath::~MetadataPath() {
    Step::release(step_);
}

std::vector<PathElement> const& MetadataPath::getPath() const {
    static Elements const none;
    if (step_ == nullptr) {
        return none;
    }
    if (auto const* list = step_->list.load(std::memory_order_acquire)) {
        return *list;
    }
    auto created = std::make_unique<Elements>();
    created->reserve(step_->depth);
    for (auto const* step = step_; step != nullptr; step = step->parent) {
        created->push_back(step->element);
    }
    std::reverse(created->begin(), created->end());
    Elements const* expected = nullptr;
    if (step_->list.compare_exchange_strong(expected, created.get(), std::memory_order_acq_rel)) {
        return *created.release();
    }
    return *expected; // another thread was first
}

PathElement MetadataPath::getLeaf() const {
    return step_ != nullptr ? step_->element : PathElement(u"", u"");
}

PathElement const& MetadataPath::leaf() const noexcept {
    return step_->element;
}

PathElement const& MetadataPath::operator[](std::size_t index) const noexcept {
    return ascend(step_, index + 1)->element;
}

void MetadataPath::listSteps(std::vector<PathElement const*>& steps) const {
    steps.resize(depth());
    auto const* step = step_;
    for (auto place = steps.rbegin(); place != steps.rend(); ++place) {
        *place = &step->element;
        step = step->parent;
    }
}

std::size_t MetadataPath::depth() const noexcept {
    return step_ != nullptr ? step_->depth : 0;
}

MetadataPath MetadataPath::parent() const {
    return step_ != nullptr ? MetadataPath(LastStep(), Step::use(step_->parent)) : root();
}

MetadataPath MetadataPath::child(PathElement element) const {
    auto above = *this;
    auto const* const step = new Step(above.step_, std::move(element));
    above.step_ = nullptr; // the step has its use
    return MetadataPath(LastStep(), step);
}

void MetadataPath::replaceSteps(std::size_t kept, std::u16string_view type,
                                std::span<std::u16string_view const> locations) {
    std::size_t const wanted = kept + locations.size();
    bool const canReuse = isAloneBehind(kept);
    while (depth() > (canReuse ? wanted : kept)) {
        *this = parent();
    }
    std::size_t const reused = depth() - kept;
    auto* step = const_cast<Step*>(step_); // no step is created constant
    for (std::size_t place = reused; place > 0; --place) {
        step->element.assign(type, locations[place - 1]);
        delete step->list.exchange(nullptr, std::memory_order_relaxed);
        step = const_cast<Step*>(step->parent);
    }
    for (auto const& location : locations.subspan(reused)) {
        *this = child(PathElement(std::u16string(type), std::u16string(location)));
    }
}

bool MetadataPath::isAloneBehind(std::size_t first) const noexcept {
    auto const* step = step_;
    while (step != nullptr && step->depth > first && step->uses.load(std::memory_order_acquire) == 1) {
        step = step->parent;
    }
    return step == nullptr || step->depth <= first;
}

bool MetadataPath::isWithin(MetadataPath const& other) const noexcept {
    auto const* step = ascend(step_, other.depth());
    return depth() >= other.depth() && std::is_eq(compareSteps(step, other.step_));
}

std::strong_ordering compare(MetadataPath const& left, MetadataPath const& right) noexcept {
    std::size_t const depth = std::min(left.depth(), right.depth());
    std::strong_ordering const order = compareSteps(ascend(left.step_, depth), ascend(right.step_, depth));
    return std::is_neq(order) ? order : left.depth() <=> right.depth();
}

MetadataPathBuilder& MetadataPathBuilder::add(std::u16string const& type, std::u16string const& location) {
    path_ = path_.child(PathElement(type, location));
    return *this;
}

MetadataPathBuilder& MetadataPathBuilder::add(MetadataPath const& path) {
    if (path_.depth() == 0) {
        path_ = path; // and shares its steps
        return *this;
    }
    for (auto const& element : path.getPath()) {
        path_ = path_.child(element);
    }
    return *this;
}

MetadataPath MetadataPathBuilder::build() const {
    return path_;
}

} // namespace project::metadata
