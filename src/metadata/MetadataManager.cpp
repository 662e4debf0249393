#include "project/metadata/MetadataManager.hpp"

namespace project::metadata {

// The interfaces' destructors stand here so that their type information has one home, by which they can be
// cast and caught across libraries.
MetadataManager::~MetadataManager() = default;

FileChangeRequestListener::~FileChangeRequestListener() = default;

} // namespace project::metadata
