#pragma once

#include "DefinitionStager.hpp"
#include "project/decorators/LabelManagerDecorator.hpp"

namespace project::session {

/// The categories and labels, with the project's text staged after each change.
class StagingLabelManager : public management::LabelManagerDecorator {
public:
    /// @param inner borrowed, as the stager is; both must outlive this object.
    StagingLabelManager(management::LabelManager& inner, DefinitionStager& stager);

    void createCategory(management::CategoryIdentifier const& category) override;
    void deleteCategory(management::CategoryIdentifier const& category) override;
    void renameCategory(management::CategoryIdentifier const& category,
                        std::u16string const& newName) override;
    void createLabel(management::CategoryIdentifier const& category,
                     management::LabelIdentifier const& label) override;
    void deleteLabel(management::CategoryIdentifier const& category,
                     management::LabelIdentifier const& label) override;

private:
    DefinitionStager& stager_;
};

} // namespace project::session
