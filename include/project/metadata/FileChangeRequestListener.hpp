#pragma once

#include <vector>

#include "fl/filesystem/Path.hpp"
#include "project/metadata/Export.hpp"

namespace project::metadata {

using fl::filesystem::Path;

class MetadataManager;

/// Told by the store of the files on disk that its own writes bring into being or take away.
///
/// The calls come on the writing thread, which holds the store's write lock, before the write is final: what
/// a listener throws undoes the write and reaches the caller. A listener must not write into the store.
class PROJECT_METADATA_EXPORT FileChangeRequestListener {
public:
    virtual ~FileChangeRequestListener();

    /// These files go away as part of a write; perhaps none.
    /// @param metadataRoot the folder in which the store keeps its own files.
    virtual void fileRemovalRequested(MetadataManager& store, Path const& metadataRoot,
                                      std::vector<Path> const& files) = 0;

    /// These files come into being as part of a write; perhaps none.
    virtual void fileAdditionRequested(MetadataManager& store, std::vector<Path> const& files) = 0;

    /// A listener that answers false is passed over.
    virtual bool acceptsFileChangeRequests() = 0;
};

} // namespace project::metadata
