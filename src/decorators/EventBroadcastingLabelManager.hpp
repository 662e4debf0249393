#pragma once

#include "project/decorators/DispatchableProjectEventBroadcaster.hpp"
#include "project/decorators/LabelManagerDecorator.hpp"

namespace project::management {

/// Raises an event after each change of a category or a label.
class EventBroadcastingLabelManager : public LabelManagerDecorator {
public:
    /// @param inner borrowed, as is the broadcaster; both must outlive this object.
    EventBroadcastingLabelManager(LabelManager& inner, DispatchableProjectEventBroadcaster& broadcaster);

    void createCategory(CategoryIdentifier const& category) override;
    void deleteCategory(CategoryIdentifier const& category) override;

    /// The event contains the category that the caller passed, with the old name.
    void renameCategory(CategoryIdentifier const& category, std::u16string const& newName) override;

    void createLabel(CategoryIdentifier const& category, LabelIdentifier const& label) override;

    /// The event contains a label that is no longer in the store.
    void deleteLabel(CategoryIdentifier const& category, LabelIdentifier const& label) override;

private:
    DispatchableProjectEventBroadcaster& broadcaster_;
};

} // namespace project::management
