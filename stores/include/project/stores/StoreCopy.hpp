#pragma once

#include <string>
#include <string_view>

#include "project/stores/Change.hpp"
#include "project/stores/Disk.hpp"
#include "project/stores/Export.hpp"
#include "project/stores/SharedLocation.hpp"

namespace project::stores {

// The steps with which a project moves from a text to a server, and from a server to a text. The file that
// leads to the old store is set aside beside the new one, under its own name with ".old". After a crash or a
// power failure at any moment, the folder leads to the old store or to the new one, or it contains both
// files: readSharedLocation then finishes the copy.
//
// All functions throw StoreError. With the kind OutcomeUnknown, the folder may lead to the new store. With
// any other kind, it leads to the old one.

/// The definition in the text of a folder, in canonical form. Hold a write guard of the text's store, so that
/// no other process writes it.
/// @param disk the store's folder.
/// @throws StoreError if the text is incomplete, damaged or contains conflict markers.
PROJECT_STORES_EXPORT std::string canonicalText(Disk& disk);

/// Lets a folder that contains a text lead to a shared project, which contains the same definition already.
/// Hold a write guard as above.
/// @return the files for source control.
PROJECT_STORES_EXPORT FileChanges replaceTextByLocation(Disk& disk, SharedLocation const& location);

/// Lets a folder that leads to a shared project contain a text. The project stays on the server.
/// @return the files for source control.
PROJECT_STORES_EXPORT FileChanges replaceLocationByText(Disk& disk, std::string_view text);

} // namespace project::stores
