#include "project/metadata/MetadataPath.hpp"

#include <algorithm>
#include <atomic>
#include <utility>

#include "project/metadata/MetadataPathBuilder.hpp"

namespace project::metadata {

using Elements = std::vector<PathElement>;

/// A step and a pointer to the step above it, shared by all addresses that contain both.
struct MetadataPath::Step {
    Step(std::shared_ptr<Step const> above, PathElement last)
        : parent(std::move(above)), element(std::move(last)), depth(parent ? parent->depth + 1 : 1) {}

    Step(Step const&) = delete;
    Step& operator=(Step const&) = delete;

    /// Releases the steps above in a loop. Recursion through the pointers would overflow the stack for a very
    /// long address.
    ~Step() {
        delete list.load(std::memory_order_relaxed);
        auto above = std::move(parent);
        while (above && above.use_count() == 1) {
            auto next = above->parent;
            above = std::move(next);
        }
    }

    std::shared_ptr<Step const> parent;
    PathElement element;
    std::size_t depth;
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
        left = left->parent.get();
        right = right->parent.get();
    }
    return order;
}

template <typename Step>
Step const* ascend(Step const* step, std::size_t depth) noexcept {
    while (step != nullptr && step->depth > depth) {
        step = step->parent.get();
    }
    return step;
}

} // namespace

MetadataPath::MetadataPath(std::vector<PathElement> elements) {
    for (auto& element : elements) {
        step_ = std::make_shared<Step const>(std::move(step_), std::move(element));
    }
}

MetadataPath::MetadataPath(SharedSteps, std::shared_ptr<Step const> last) noexcept : step_(std::move(last)) {
}

MetadataPath::~MetadataPath() = default;

std::vector<PathElement> const& MetadataPath::getPath() const {
    static Elements const none;
    if (!step_) {
        return none;
    }
    if (auto const* list = step_->list.load(std::memory_order_acquire)) {
        return *list;
    }
    auto created = std::make_unique<Elements>();
    created->reserve(step_->depth);
    for (auto const* step = step_.get(); step != nullptr; step = step->parent.get()) {
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
    return step_ ? step_->element : PathElement(u"", u"");
}

PathElement const& MetadataPath::leaf() const noexcept {
    return step_->element;
}

PathElement const& MetadataPath::operator[](std::size_t index) const noexcept {
    return ascend(step_.get(), index + 1)->element;
}

void MetadataPath::listSteps(std::vector<PathElement const*>& steps) const {
    steps.resize(depth());
    auto const* step = step_.get();
    for (auto place = steps.rbegin(); place != steps.rend(); ++place) {
        *place = &step->element;
        step = step->parent.get();
    }
}

std::size_t MetadataPath::depth() const noexcept {
    return step_ ? step_->depth : 0;
}

MetadataPath MetadataPath::parent() const {
    return step_ ? MetadataPath(SharedSteps(), step_->parent) : *this;
}

MetadataPath MetadataPath::child(PathElement element) const {
    return MetadataPath(SharedSteps(), std::make_shared<Step const>(step_, std::move(element)));
}

bool MetadataPath::isWithin(MetadataPath const& other) const noexcept {
    auto const* step = ascend(step_.get(), other.depth());
    return depth() >= other.depth() && std::is_eq(compareSteps(step, other.step_.get()));
}

std::strong_ordering compare(MetadataPath const& left, MetadataPath const& right) noexcept {
    std::size_t const depth = std::min(left.depth(), right.depth());
    std::strong_ordering const order =
        compareSteps(ascend(left.step_.get(), depth), ascend(right.step_.get(), depth));
    return std::is_neq(order) ? order : left.depth() <=> right.depth();
}

MetadataPathBuilder& MetadataPathBuilder::add(std::u16string const& type, std::u16string const& location) {
    path_ = path_.child(PathElement(type, location));
    return *this;
}

MetadataPathBuilder& MetadataPathBuilder::add(MetadataPath const& path) {
    for (auto const& element : path.getPath()) {
        path_ = path_.child(element);
    }
    return *this;
}

MetadataPath MetadataPathBuilder::build() const {
    return path_;
}

} // namespace project::metadata
