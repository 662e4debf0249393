#pragma once

#include "references/FolderReferenceCustomization.hpp"

namespace project::management {

/// The list of the project path, which only relative references can be read from.
class ProjectPathFolderReferenceCustomization : public FolderReferenceCustomization {
public:
    explicit ProjectPathFolderReferenceCustomization(Path const& projectRoot);

    void validateReference(FolderReference const& reference) const override;
    metadata::MetadataPath getRootPath() const override;
    [[noreturn]] void throwDuplicate(Path const& location) const override;
    std::vector<std::unique_ptr<FolderReferenceReader>> const& getReaders() const override;

private:
    std::vector<std::unique_ptr<FolderReferenceReader>> readers_;
};

} // namespace project::management
