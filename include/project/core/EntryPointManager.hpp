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

/// The entry points of a project: files with a role in its life, and the groups that they stand in.
///
/// Queries take the store's read lock, changes its write lock, each for the whole operation.
class PROJECT_MANAGEMENT_EXPORT EntryPointManager {
public:
    virtual ~EntryPointManager();

    /// Writes an entry point whole: under its UUID, else under that of its file's entry, else under a new
    /// one.
    /// @throws FileNotInProject
    virtual void setEntryPoint(EntryPoint& entryPoint) = 0;

    /// All entry points whose file is in the project, in the store's order.
    /// @throws EntryPointTypeUndefined
    virtual std::vector<std::unique_ptr<EntryPoint>> getEntryPoints() = 0;

    /// The entry point of a file; a definition with defaults and without a UUID when there is none; null when
    /// there is one and its file is not in the project.
    /// @throws EntryPointTypeUndefined
    virtual std::unique_ptr<EntryPoint> getEntryPoint(Path file) = 0;

    /// Removes every entry point of a file; none is no error.
    /// @throws FileNotInProject
    virtual void removeEntryPoint(Path file) = 0;

    /// The default group first, then the stored ones in the store's order.
    virtual std::vector<std::unique_ptr<EntryPointGroup>> getEntryPointGroups() = 0;

    /// Removes the stored group with this UUID; none is no error. Its entry points stay, without a group.
    virtual void deleteEntryPointGroup(EntryPointGroup const& group) = 0;

    /// Stores a group, under a new UUID if it carries none.
    /// @throws EntryPointGroupNameDefined, EntryPointGroupUUIDDefined
    virtual void createEntryPointGroup(EntryPointGroup const& group) = 0;

    /// Names the group with this UUID, which is stored if it was not.
    /// @throws EntryPointGroupNameDefined when another group has that name.
    virtual void renameEntryPointGroup(EntryPointGroup const& group, std::u16string const& newName) = 0;
};

} // namespace project::management
