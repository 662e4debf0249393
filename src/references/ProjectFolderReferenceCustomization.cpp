#include "references/ProjectFolderReferenceCustomization.hpp"

#include "project/metadata/Messages.hpp"
#include "project/metadata/MetadataPathBuilder.hpp"
#include "project/metadata/ProjectException.hpp"
#include "project/metadata/TreeSchema.hpp"

namespace project::management {

namespace schema = metadata::schema;

using ZEPHRA::project::management::DuplicateReferenceException;

ProjectFolderReferenceCustomization::ProjectFolderReferenceCustomization(Path const& projectRoot) {
    readers_.push_back(std::make_unique<RelativeFolderReferenceReader>(projectRoot));
    readers_.push_back(std::make_unique<AbsoluteFolderReferenceReader>());
}

void ProjectFolderReferenceCustomization::validateReference(FolderReference const& /*reference*/) const {
}

metadata::MetadataPath ProjectFolderReferenceCustomization::getRootPath() const {
    return metadata::MetadataPathBuilder()
        .add(schema::references::referencesType, schema::rootLocation)
        .build();
}

void ProjectFolderReferenceCustomization::throwDuplicate(Path const& location) const {
    exception::raise(DuplicateReferenceException(location.native()));
}

std::vector<std::unique_ptr<FolderReferenceReader>> const&
ProjectFolderReferenceCustomization::getReaders() const {
    return readers_;
}

} // namespace project::management
