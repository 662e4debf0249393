#pragma once

#include <functional>
#include <map>
#include <string>
#include <vector>

#include "project/metadata/MetadataNode.hpp"
#include "project/session/Query.hpp"
#include "project/stores/TreeMetadataManager.hpp"

namespace project::session {

/// The labels on a file, in the order in which they are stored. @param file the node of the file.
std::vector<LabelChoice> labelsOn(metadata::MetadataNode const& file);

/// The names of entry points, by the paths of their files relative to the root.
using EntryPointNames = std::multimap<std::u16string, std::u16string, std::less<>>;

/// The entry points of a project. The caller holds a guard of the store.
EntryPointNames entryPointNames(stores::TreeMetadataManager& store);

} // namespace project::session
