#include "project/metadata/MetadataManager.hpp"
#include "project/metadata/ProjectException.hpp"

// The destructors of the interfaces are defined here so that their type information exists in one library
// only and objects can be cast and caught across libraries.

namespace project::metadata {

MetadataManager::~MetadataManager() = default;
FileChangeRequestListener::~FileChangeRequestListener() = default;

} // namespace project::metadata

namespace project::exception {

ProjectException::ProjectException() = default;
ProjectException::~ProjectException() = default;

} // namespace project::exception
