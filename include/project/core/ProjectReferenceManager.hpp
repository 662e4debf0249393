#pragma once

#include "project/core/Export.hpp"

namespace project::management {

class FolderReferenceManager;

/// The references to other projects: folders, kept relative to the root or absolute.
class PROJECT_MANAGEMENT_EXPORT ProjectReferenceManager {
public:
    virtual ~ProjectReferenceManager();

    /// The list itself: the same object at each call, valid as long as this one.
    virtual FolderReferenceManager& getFolderReferenceManager() = 0;
};

} // namespace project::management
