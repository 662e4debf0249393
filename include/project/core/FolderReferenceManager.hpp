#pragma once

#include <optional>
#include <vector>

#include "project/core/Export.hpp"
#include "project/metadata/MetadataManager.hpp"

namespace project::management {

using metadata::Path;

class FolderReference;

/// A list of folders that a project points to.
///
/// Queries take the store's read lock, changes its write lock, each for the whole operation.
class PROJECT_MANAGEMENT_EXPORT FolderReferenceManager {
public:
    virtual ~FolderReferenceManager();

    /// All references that can be read, in the store's order.
    virtual std::vector<FolderReference> getReferences() const = 0;

    /// Stores the references in one batch.
    /// @throws DuplicatePathEntryException or DuplicateReferenceException, by the list, for the first
    ///         location in Path order that is referenced already; nothing is stored then.
    virtual void addReferences(std::vector<FolderReference> const& references) = 0;

    /// Removes the references with these UUIDs in one batch; those that are not stored are passed over.
    virtual void removeReferences(std::vector<FolderReference> const& references) = 0;

    /// True when a reference's location has exactly this text.
    virtual bool isReference(Path const& path) const = 0;

    /// The first reference whose location is the path or lies above it; empty when there is none.
    virtual std::optional<FolderReference> getRootReferenceFor(Path const& path) const = 0;
};

} // namespace project::management
