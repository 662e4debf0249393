#include "references/ProjectPathFolderReferenceCustomization.hpp"

#include "project/metadata/Messages.hpp"
#include "project/metadata/MetadataPathBuilder.hpp"
#include "project/metadata/ProjectException.hpp"
#include "project/metadata/TreeSchema.hpp"

namespace project::management {

namespace schema = metadata::schema;

using ZEPHRA::project::management::DuplicatePathEntryException;

ProjectPathFolderReferenceCustomization::ProjectPathFolderReferenceCustomization(Path const& projectRoot) {
    // No reader for absolute references: the project path goes with the project to other machines. One that
    // is added all the same is stored, never listed, and thus never a duplicate.
    readers_.push_back(std::make_unique<RelativeFolderReferenceReader>(projectRoot));
}

void ProjectPathFolderReferenceCustomization::validateReference(FolderReference const& /*reference*/) const {
    // Nothing is asked of a reference, not even that it is relative.
}

metadata::MetadataPath ProjectPathFolderReferenceCustomization::getRootPath() const {
    return metadata::MetadataPathBuilder()
        .add(schema::references::projectPathType, schema::rootLocation)
        .build();
}

void ProjectPathFolderReferenceCustomization::throwDuplicate(Path const& location) const {
    exception::raise(DuplicatePathEntryException(location.native()));
}

std::vector<std::unique_ptr<FolderReferenceReader>> const&
ProjectPathFolderReferenceCustomization::getReaders() const {
    return readers_;
}

} // namespace project::management
