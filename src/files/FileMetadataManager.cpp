#include "project/files/FileMetadataManager.hpp"

namespace project::management {

FileMetadataManager::~FileMetadataManager() = default;

} // namespace project::management
