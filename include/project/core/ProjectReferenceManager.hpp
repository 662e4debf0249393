#pragma once

#include "project/core/Export.hpp"

namespace project::management {

class FolderReferenceManager;

/// The references to other projects: a list of folders, stored relative to the project's root or absolute.
///
/// The interface has one getter and no operations of its own deliberately: decorators replace the list by
/// replacing this object.
class PROJECT_MANAGEMENT_EXPORT ProjectReferenceManager {
public:
    virtual ~ProjectReferenceManager();

    /// Returns the list. It is the same object at each call, and valid as long as this object.
    virtual FolderReferenceManager& getFolderReferenceManager() = 0;
};

} // namespace project::management
