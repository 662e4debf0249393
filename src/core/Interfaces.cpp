#include "project/core/EntryPointManager.hpp"
#include "project/core/FileManager.hpp"
#include "project/core/FolderReferenceManager.hpp"
#include "project/core/LabelManager.hpp"
#include "project/core/ProjectManager.hpp"
#include "project/core/ProjectPathManager.hpp"
#include "project/core/ProjectReferenceManager.hpp"
#include "project/core/Unique.hpp"

// The destructors of the interfaces are defined here so that their type information exists in one library
// only and objects can be cast across libraries.

namespace project::management {

Unique::~Unique() = default;
ProjectManager::~ProjectManager() = default;
FileManager::~FileManager() = default;
LabelManager::~LabelManager() = default;
EntryPointManager::~EntryPointManager() = default;
FolderReferenceManager::~FolderReferenceManager() = default;
ProjectPathManager::~ProjectPathManager() = default;
ProjectReferenceManager::~ProjectReferenceManager() = default;

} // namespace project::management
