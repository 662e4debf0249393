#pragma once

#include "project/core/Export.hpp"

namespace project::management {

class FolderReferenceManager;

/// The project path: folders of the project's own, kept relative to its root.
class PROJECT_MANAGEMENT_EXPORT ProjectPathManager {
public:
    virtual ~ProjectPathManager();

    /// The list itself: the same object at each call, valid as long as this one.
    virtual FolderReferenceManager& getFolderReferenceManager() = 0;
};

} // namespace project::management
