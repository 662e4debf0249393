#pragma once

#include "DefinitionStager.hpp"
#include "project/decorators/FolderReferenceManagerDecorator.hpp"

namespace project::session {

/// A list of folder references, with the project's text staged after each change.
class StagingFolderReferenceManager : public management::FolderReferenceManagerDecorator {
public:
    /// @param inner borrowed, as the stager is; both must outlive this object.
    StagingFolderReferenceManager(management::FolderReferenceManager& inner, DefinitionStager& stager);

    void addReferences(std::vector<management::FolderReference> const& references) override;
    void removeReferences(std::vector<management::FolderReference> const& references) override;

private:
    DefinitionStager& stager_;
};

} // namespace project::session
