#pragma once

#include "DefinitionStager.hpp"
#include "project/decorators/EntryPointManagerDecorator.hpp"

namespace project::session {

/// The entry points and their groups, with the project's text staged after each change.
class StagingEntryPointManager : public management::EntryPointManagerDecorator {
public:
    /// @param inner borrowed, as the stager is; both must outlive this object.
    StagingEntryPointManager(management::EntryPointManager& inner, DefinitionStager& stager);

    void setEntryPoint(management::EntryPoint& entryPoint) override;
    void removeEntryPoint(management::Path file) override;
    void deleteEntryPointGroup(management::EntryPointGroup const& group) override;
    void createEntryPointGroup(management::EntryPointGroup const& group) override;
    void renameEntryPointGroup(management::EntryPointGroup const& group,
                               std::u16string const& newName) override;

private:
    DefinitionStager& stager_;
};

} // namespace project::session
