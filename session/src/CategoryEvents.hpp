#pragma once

#include <memory>
#include <utility>
#include <vector>

#include "ChangeEvents.hpp"

namespace project::session {

/// The events for categories and labels that others have changed.
///
/// Label managers read them as they are and as they were: from the project, and from a store in memory that
/// contains the nodes from before the changes.
class CategoryEvents {
public:
    /// @param differences at and below the head of the categories, sorted.
    CategoryEvents(std::vector<stores::Difference> const& differences,
                   std::shared_ptr<metadata::MetadataManager> const& store, management::Path const& root);
    ~CategoryEvents();
    CategoryEvents(CategoryEvents const&) = delete;
    CategoryEvents& operator=(CategoryEvents const&) = delete;

    /// Ordered by UUID; the event of a category precedes those of its labels.
    std::vector<Event> take() { return std::move(events_); }

    /// True if none of these events reports some of the differences, for instance because the label manager
    /// cannot read them: texts may be edited by hand.
    bool hasUnreported() const noexcept { return hasUnreported_; }

private:
    void add(stores::Difference const& difference);
    void addCategory(stores::Difference const& difference);
    void addLabel(stores::Difference const& difference);

    std::shared_ptr<metadata::MetadataManager> store_;
    management::ProjectManagerBase before_;
    management::ProjectManagerBase now_;
    std::vector<Event> events_;
    bool hasUnreported_ = false;
};

} // namespace project::session
