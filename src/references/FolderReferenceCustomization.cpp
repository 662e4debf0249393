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

ProjectPathFolderReferenceCustomization::ProjectPathFolderReferenceCustomization(Path const& projectRoot) {
    // There is no reader for absolute references, because the project path must be valid on other machines
    // too. An absolute reference that is added is stored, never listed, and therefore never a duplicate.
    readers_.push_back(std::make_unique<RelativeFolderReferenceReader>(projectRoot));
}

void ProjectPathFolderReferenceCustomization::validateReference(FolderReference const& /*reference*/) const {
    // Every reference is accepted, also an absolute one.
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
