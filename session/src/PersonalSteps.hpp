#pragma once

#include <cstddef>
#include <exception>
#include <vector>

#include "EventQueue.hpp"
#include "project/stores/TreeMetadataManager.hpp"

namespace project::session {

/// The personal part of the steps of a session. A step takes part in the personal text only from its first
/// personal change on, so that steps without one do not open or lock that text.
///
/// Guards are always taken in this order: one of the project's store, then one of the personal text. A step
/// of the session has the project's write guard; a personal change alone has a read guard of the project and
/// the write guard of the personal text. Either way, only one thread at a time uses this object.
class PersonalSteps {
public:
    /// @param store of the personal text, borrowed.
    explicit PersonalSteps(stores::TreeMetadataManager& store) : store_(store) {}

    PersonalSteps(PersonalSteps const&) = delete;
    PersonalSteps& operator=(PersonalSteps const&) = delete;

    /// The queue of the events that the personal managers raise.
    EventQueue& raised() noexcept { return raised_; }

    /// Lets the steps up to a depth take part. Call it before a personal change.
    /// @param depth of the innermost step; 1 for the outermost.
    /// @throws stores::StoreError if the personal text cannot be opened, or another process holds its lock.
    void join(std::size_t depth);

    /// Whether an open step takes part.
    bool hasJoined() const noexcept { return !parts_.empty(); }

    /// Ends the part of the step at a depth, if it has one. That of the outermost step is committed.
    /// @throws stores::StoreError: the personal changes are rolled back.
    void commit(std::size_t depth);

    /// Rolls back the parts of the steps from a depth on.
    void rollBack(std::size_t depth) noexcept;

    /// Keeps an error of the personal text that must not prevent a change of the project. It is thrown when
    /// the outermost step is committed.
    void keepError(std::exception_ptr error) noexcept { error_ = std::move(error); }

private:
    struct Part {
        stores::Transaction writes;
        std::size_t earlierEvents;
    };

    stores::TreeMetadataManager& store_;
    EventQueue raised_;
    std::vector<Part> parts_; ///< of the steps from the outermost on
    std::exception_ptr error_;
};

} // namespace project::session
