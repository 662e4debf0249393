#pragma once

#include "project/core/ProjectReferenceManager.hpp"

namespace project::management {

/// A project reference manager that returns the list of another one. Deliberately a class with one getter:
/// the interface that it forwards has one operation.
class PROJECT_MANAGEMENT_EXPORT ProjectReferenceManagerDecorator : public ProjectReferenceManager {
public:
    /// @param inner borrowed; must outlive this object.
    explicit ProjectReferenceManagerDecorator(ProjectReferenceManager& inner);
    ~ProjectReferenceManagerDecorator() override;

    FolderReferenceManager& getFolderReferenceManager() override;

private:
    ProjectReferenceManager& inner_;
};

} // namespace project::management
