#pragma once

#include <optional>
#include <vector>

#include "project/core/Export.hpp"
#include "project/metadata/MetadataManager.hpp"

namespace project::management {

using metadata::Path;

class FolderReference;

/// A list of folders that a project refers to.
///
/// A query holds the store's read lock for the whole operation, a change its write lock.
class PROJECT_MANAGEMENT_EXPORT FolderReferenceManager {
public:
    virtual ~FolderReferenceManager();

    /// Returns all references of a known type, sorted by UUID.
    virtual std::vector<FolderReference> getReferences() const = 0;

    /// Stores the references under their UUIDs, in one batch. Two new references to the same folder are both
    /// stored.
    /// @throws DuplicatePathEntryException (project path) or DuplicateReferenceException (other projects) for
    ///         the first location in Path order that a stored reference has already. Nothing is stored then.
    virtual void addReferences(std::vector<FolderReference> const& references) = 0;

    /// Removes the references with these UUIDs, in one batch. References that are not stored are skipped.
    virtual void removeReferences(std::vector<FolderReference> const& references) = 0;

    /// Returns true if the location of a reference has exactly this text.
    virtual bool isReference(Path const& path) const = 0;

    /// Returns the first reference, in the order of getReferences, whose location is the path or a folder
    /// above it; nothing if there is none. The first one and not the nearest, deliberately: all folders below
    /// two nested references have the same root reference.
    virtual std::optional<FolderReference> getRootReferenceFor(Path const& path) const = 0;
};

} // namespace project::management
