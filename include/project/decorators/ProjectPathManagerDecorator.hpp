#pragma once

#include "project/core/ProjectPathManager.hpp"

namespace project::management {

/// A project path manager that returns the list of another one. Deliberately a class with one getter: the
/// interface that it forwards has one operation.
class PROJECT_MANAGEMENT_EXPORT ProjectPathManagerDecorator : public ProjectPathManager {
public:
    /// @param inner borrowed; must outlive this object.
    explicit ProjectPathManagerDecorator(ProjectPathManager& inner);
    ~ProjectPathManagerDecorator() override;

    FolderReferenceManager& getFolderReferenceManager() override;

private:
    ProjectPathManager& inner_;
};

} // namespace project::management
