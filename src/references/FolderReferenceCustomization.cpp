#include "references/FolderReferenceCustomization.hpp"

#include "project/metadata/Messages.hpp"
#include "project/metadata/MetadataPathBuilder.hpp"
#include "project/metadata/ProjectException.hpp"
#include "project/metadata/TreeSchema.hpp"

namespace project::management {

namespace schema = metadata::schema;

using ZEPHRA::project::management::DuplicatePathEntryException;
using ZEPHRA::project::management::DuplicateReferenceException;

FolderReferenceCustomization::~FolderReferenceCustomization() = default;

void CustomizationWithReaders::validateReference(FolderReference const& /*reference*/) const {
}

ProjectPathFolderReferenceCustomization::ProjectPathFolderReferenceCustomization(Path const& projectRoot) {
    // There is no reader for absolute references, because the project path must be valid on other machines
    // too. An absolute reference that is added is stored, never listed, and therefore never a duplicate.
    addReader(std::make_unique<RelativeFolderReferenceReader>(projectRoot));
}

metadata::MetadataPath ProjectPathFolderReferenceCustomization::getRootPath() const {
    return metadata::MetadataPathBuilder()
        .add(schema::references::projectPathType, schema::rootLocation)
        .build();
}

void ProjectPathFolderReferenceCustomization::throwDuplicate(Path const& location) const {
    exception::raise(DuplicatePathEntryException(location.native()));
}

ProjectFolderReferenceCustomization::ProjectFolderReferenceCustomization(Path const& projectRoot) {
    addReader(std::make_unique<RelativeFolderReferenceReader>(projectRoot));
    addReader(std::make_unique<AbsoluteFolderReferenceReader>());
}

metadata::MetadataPath ProjectFolderReferenceCustomization::getRootPath() const {
    return metadata::MetadataPathBuilder()
        .add(schema::references::referencesType, schema::rootLocation)
        .build();
}

void ProjectFolderReferenceCustomization::throwDuplicate(Path const& location) const {
    exception::raise(DuplicateReferenceException(location.native()));
}

} // namespace project::management
