#pragma once

#include <algorithm>
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
        isBelowInserted_ = false;
    }

    /// Begins a search at the last step that the address shares with the address of the previous search,
    /// which must still exist.
    void beginBeside(Address const& address) {
        std::swap(elements_, previous_);
        address.listSteps(elements_);
        std::size_t const most = std::min(depth_, elements_.size());
        isBelowInserted_ = false;
        for (depth_ = 0; depth_ < most && elements_[depth_] == previous_[depth_]; ++depth_) {
            isBelowInserted_ = isBelowInserted_ || steps_[depth_].isInserted;
        }
    }

    /// The number of steps that were found.
    std::size_t depth() const noexcept { return depth_; }

    /// True if all steps of the address were found.
    bool isAtEnd() const noexcept { return depth_ == elements_.size(); }

    /// True if this cursor has inserted the last step that was found, or one above it, and has stayed there
    /// since. It may have inserted it even if this is false.
    bool isBelowInserted() const noexcept { return isBelowInserted_; }

    /// The first element that was not found.
    metadata::PathElement const& next() const noexcept { return *elements_[depth_]; }

    /// Searches the next step in the level below. @return false if it is not there; the cursor does not move.
    bool stepDown(Level& level, TypeTable const& types) {
        ElementKey const key(types, next().getType(), next().getLocation());
        if (steps_.size() == depth_) {
            steps_.emplace_back();
        }
        auto& step = steps_[depth_];
        bool const isSameLevel = step.level == &level;
        auto const found = isSameLevel ? level.findNear(key, step.position) : level.find(key);
        bool const isSame = isSameLevel && found.isFound && found.position == step.position;
        step = {&level, found.position, isSame && step.isInserted};
        isBelowInserted_ = isBelowInserted_ || step.isInserted;
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
        step = {&level, level.insert(position, element, std::move(place)), true};
        isBelowInserted_ = true;
        ++depth_;
    }

    /// Returns to a step above, for example because the steps below it were extracted.
    void ascendTo(std::size_t depth) noexcept {
        for (auto left = depth; left < steps_.size(); ++left) {
            steps_[left].isInserted = false;
        }
        depth_ = depth;
    }

    /// The level and the position of a found step; of the last one for depth().
    Level& level(std::size_t depth) const noexcept { return *steps_[depth - 1].level; }

    Level::Position position(std::size_t depth) const noexcept { return steps_[depth - 1].position; }

    void reset() noexcept {
        depth_ = 0;
        steps_.clear();
        elements_.clear();
        previous_.clear();
    }

private:
    struct Step {
        Level* level = nullptr;
        Level::Position position;
        bool isInserted = false;
    };

    std::vector<metadata::PathElement const*> elements_; ///< of the address
    std::vector<metadata::PathElement const*> previous_; ///< of the previous one, only in beginBeside
    std::size_t depth_ = 0;
    bool isBelowInserted_ = false;
    std::vector<Step> steps_; ///< those behind depth_ are hints
};

} // namespace project::stores
