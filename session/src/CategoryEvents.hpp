#pragma once

#include <memory>
#include <utility>
#include <vector>

#include "ChangeEvents.hpp"

namespace project::session {

/// The events of categories and labels that others have changed. What these are, and were, the label manager
/// reads: in the project, and in one in memory that has what was there before.
class CategoryEvents {
public:
    /// @param differences at and below the head of the categories, sorted.
    CategoryEvents(std::vector<stores::Difference> const& differences,
                   std::shared_ptr<metadata::MetadataManager> const& store, management::Path const& root);
    ~CategoryEvents();
    CategoryEvents(CategoryEvents const&) = delete;
    CategoryEvents& operator=(CategoryEvents const&) = delete;

    /// By UUID, each category's followed by those of its labels.
    std::vector<Event> take() { return std::move(events_); }

    /// True when there are differences that none of these events tells, also those that the label manager
    /// can't read: people edit texts by hand.
    bool leaveSomething() const noexcept { return leaveSomething_; }

private:
    void add(stores::Difference const& difference);
    void addCategory(stores::Difference const& difference);
    void addLabel(stores::Difference const& difference);

    std::shared_ptr<metadata::MetadataManager> store_;
    management::ProjectManagerBase before_;
    management::ProjectManagerBase now_;
    std::vector<Event> events_;
    bool leaveSomething_ = false;
};

} // namespace project::session
