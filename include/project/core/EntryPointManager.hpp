#pragma once

#include <memory>
#include <string>
#include <vector>

#include "project/core/Export.hpp"
#include "project/metadata/MetadataManager.hpp"

namespace project::management {

using metadata::Path;

class EntryPoint;
class EntryPointGroup;

/// The entry points of a project, which are files that users start from, and the groups that list them.
///
/// Paths are absolute and in the form of the project's root. A query holds the store's read lock for the
/// whole operation, a change its write lock.
class PROJECT_MANAGEMENT_EXPORT EntryPointManager {
public:
    virtual ~EntryPointManager();

    /// Stores an entry point and replaces all that was stored under its UUID. An entry point without a UUID
    /// is stored under the UUID of its file's entry point, or under a new one if the file has none.
    /// @throws FileNotInProject if its file is not in the project.
    virtual void setEntryPoint(EntryPoint& entryPoint) = 0;

    /// Returns the entry points whose file is in the project, sorted by UUID. Entry points of other files
    /// stay stored and are left out.
    /// @throws EntryPointTypeUndefined if one of them has an unknown type.
    virtual std::vector<std::unique_ptr<EntryPoint>> getEntryPoints() = 0;

    /// Returns the entry point of a file. For a file without one the result is an EntryPointDefinition with
    /// defaults and without a UUID, also if the file is not in the project: a caller edits it and passes it
    /// to setEntryPoint. The result is null if an entry point is stored and its file is not in the project.
    /// @throws EntryPointTypeUndefined if the stored type is unknown.
    virtual std::unique_ptr<EntryPoint> getEntryPoint(Path file) = 0;

    /// Removes all entry points of a file. Does nothing for a file without one.
    /// @throws FileNotInProject if the file is not in the project.
    virtual void removeEntryPoint(Path file) = 0;

    /// Returns the default group, then the stored groups, sorted by UUID.
    virtual std::vector<std::unique_ptr<EntryPointGroup>> getEntryPointGroups() = 0;

    /// Removes the stored group with this UUID, if there is one. Its entry points stay and have no group.
    virtual void deleteEntryPointGroup(EntryPointGroup const& group) = 0;

    /// Stores a group under its UUID, or under a new one if its UUID is empty.
    /// @throws EntryPointGroupNameDefined if a group has this name.
    /// @throws EntryPointGroupUUIDDefined if a group has this UUID.
    virtual void createEntryPointGroup(EntryPointGroup const& group) = 0;

    /// Stores a new name for the group with this UUID, also if the group was not stored: the default group
    /// gets a name of its own this way. Does nothing if the UUID is empty or the group has this name already.
    /// @throws EntryPointGroupNameDefined if another group has this name.
    virtual void renameEntryPointGroup(EntryPointGroup const& group, std::u16string const& newName) = 0;
};

} // namespace project::management
