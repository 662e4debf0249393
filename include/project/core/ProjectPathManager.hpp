#pragma once

#include "project/core/Export.hpp"

namespace project::management {

class FolderReferenceManager;

/// The project path: a list of folders of this project, stored relative to its root.
///
/// The interface has one getter and no operations of its own deliberately: decorators replace the list by
/// replacing this object.
class PROJECT_MANAGEMENT_EXPORT ProjectPathManager {
public:
    virtual ~ProjectPathManager();

    /// Returns the list. It is the same object at each call, and valid as long as this object.
    virtual FolderReferenceManager& getFolderReferenceManager() = 0;
};

} // namespace project::management
