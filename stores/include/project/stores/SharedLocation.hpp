#pragma once

#include <optional>
#include <string>

#include "project/stores/Change.hpp"
#include "project/stores/Disk.hpp"
#include "project/stores/Export.hpp"

namespace project::stores {

/// Where the definition of a shared project is stored: the content of the file `store.json` in the folder in
/// which other projects have their text. The file is committed to source control. It contains no secret.
struct PROJECT_STORES_EXPORT SharedLocation {
    /// The name of the file.
    static char16_t const* const fileName;

    /// The name of the folder beside the file in which a client keeps the last state.
    static char16_t const* const cacheName;

    std::string kind;    ///< of the server, for example "postgresql"
    std::string service; ///< the name of the service in the configuration of the server's client library
    std::string project; ///< the project's UUID

    friend bool operator==(SharedLocation const&, SharedLocation const&) = default;
};

/// A new random UUID for a project.
PROJECT_STORES_EXPORT std::string newSharedProjectId();

/// Reads the location of the project in a folder. If a copy to another store was interrupted between its last
/// steps, finishes it first; see StoreCopy.hpp.
/// @param disk the store's folder.
/// @return nothing if the project is not a shared one.
/// @throws StoreError with the kind Damaged if the file is unreadable or of another format, or if there is a
///         text beside it that no copy has left, so that it is not clear which of them is the definition.
PROJECT_STORES_EXPORT std::optional<SharedLocation> readSharedLocation(Disk& disk);

/// Creates the file, and the folder with the files for source control.
/// @return the files that were created.
/// @throws StoreError with the kind Refused if there is a project in the folder already.
PROJECT_STORES_EXPORT FileChanges createSharedLocation(Disk& disk, SharedLocation const& location);

} // namespace project::stores
