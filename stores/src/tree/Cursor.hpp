#pragma once

#include <cstddef>
#include <utility>
#include <vector>

#include "tree/Level.hpp"

namespace project::stores {

/// The entries of the steps of one address, from the root down to the last step that was found. The next
/// search looks for each step first where the previous search has found the step of the same depth, and then
/// beside it.
///
/// It refers to the tree only, and not to the address: an address that it kept alive would keep the memory
/// around it in use. It must be reset after the tree has changed, except by its own user.
class Cursor {
public:
    /// Begins a search at the root. The address must outlive the search.
    void begin(Address const& address) {
        address.listSteps(elements_);
        depth_ = 0;
    }

    /// The number of steps that were found.
    std::size_t depth() const noexcept { return depth_; }

    /// True if all steps of the address were found.
    bool isAtEnd() const noexcept { return depth_ == elements_.size(); }

    /// The first element that was not found.
    metadata::PathElement const& next() const noexcept { return *elements_[depth_]; }

    /// Searches the next step in the level below. @return false if it is not there; the cursor does not move.
    bool stepDown(Level& level, TypeTable const& types) {
        ElementKey const key(types, next().getType(), next().getLocation());
        if (steps_.size() == depth_) {
            steps_.emplace_back();
        }
        auto& step = steps_[depth_];
        auto const found = level.find(key, step.level == &level ? step.position : Level::Position());
        step = {&level, found.position};
        depth_ += found.isFound ? 1 : 0;
        return found.isFound;
    }

    /// Inserts the next step where stepDown has not found it, or into an empty level.
    void insertBelow(Level& level, NewElement const& element, Place place) {
        if (steps_.size() == depth_) {
            steps_.emplace_back();
        }
        auto& step = steps_[depth_];
        auto const position = level.empty() ? Level::Position() : step.position;
        step = {&level, level.insert(position, element, std::move(place))};
        ++depth_;
    }

    /// Returns to a step above, for example because the steps below it were extracted.
    void ascendTo(std::size_t depth) noexcept { depth_ = depth; }

    /// The level and the position of a found step; of the last one for depth().
    Level& level(std::size_t depth) const noexcept { return *steps_[depth - 1].level; }

    Level::Position position(std::size_t depth) const noexcept { return steps_[depth - 1].position; }

    void reset() noexcept {
        depth_ = 0;
        steps_.clear();
        elements_.clear();
    }

private:
    struct Step {
        Level* level = nullptr;
        Level::Position position;
    };

    std::vector<metadata::PathElement const*> elements_; ///< of the address
    std::size_t depth_ = 0;
    std::vector<Step> steps_; ///< those behind depth_ are hints
};

} // namespace project::stores
