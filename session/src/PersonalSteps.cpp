#include "PersonalSteps.hpp"

#include <utility>

namespace project::session {

void PersonalSteps::join(std::size_t depth) {
    while (parts_.size() < depth) {
        parts_.push_back({store_.transaction(), raised_.size()});
    }
}

void PersonalSteps::commit(std::size_t depth) {
    if (parts_.size() >= depth) {
        Part part = std::move(parts_.back());
        parts_.pop_back();
        try {
            part.writes.commit();
        } catch (...) {
            raised_.dropBehind(part.earlierEvents);
            rollBack(depth);
            throw;
        }
    }
    if (auto const error = depth == 1 ? std::exchange(error_, nullptr) : nullptr) {
        std::rethrow_exception(error);
    }
}

void PersonalSteps::rollBack(std::size_t depth) noexcept {
    while (parts_.size() >= depth) {
        raised_.dropBehind(parts_.back().earlierEvents);
        parts_.pop_back();
    }
    if (depth == 1) {
        error_ = nullptr;
    }
}

} // namespace project::session
