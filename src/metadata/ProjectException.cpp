#include "project/metadata/ProjectException.hpp"

namespace project::exception {

ProjectException::ProjectException() = default;

// Stands here so that the class information is in one library only.
ProjectException::~ProjectException() = default;

} // namespace project::exception
