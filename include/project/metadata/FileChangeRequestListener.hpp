#pragma once

#include <vector>

#include "fl/filesystem/Path.hpp"
#include "project/metadata/Export.hpp"

namespace project::metadata {

using fl::filesystem::Path;

class MetadataManager;

/// Receives the files on disk that the store's own writes create or delete.
///
/// The store calls its listeners on the writing thread, which holds the write lock, before it commits the
/// write. An exception thrown by a listener rolls the write back and propagates to the caller. A listener
/// must not write to the store.
class PROJECT_METADATA_EXPORT FileChangeRequestListener {
public:
    virtual ~FileChangeRequestListener();

    /// Called with the files, possibly none, that a write deletes.
    /// @param metadataRoot the folder that contains the store's own files, absolute.
    /// @param files absolute paths.
    virtual void fileRemovalRequested(MetadataManager& store, Path const& metadataRoot,
                                      std::vector<Path> const& files) = 0;

    /// Called with the files, possibly none, that a write creates.
    /// @param files absolute paths.
    virtual void fileAdditionRequested(MetadataManager& store, std::vector<Path> const& files) = 0;

    /// Returns whether the store calls this listener. The store asks before each call.
    virtual bool acceptsFileChangeRequests() = 0;
};

} // namespace project::metadata
