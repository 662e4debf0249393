#include "references/FolderReferenceCustomization.hpp"

namespace project::management {

FolderReferenceCustomization::~FolderReferenceCustomization() = default;

} // namespace project::management
