#pragma once

#include <memory>
#include <optional>
#include <vector>

#include "project/core/FolderReferenceManager.hpp"
#include "project/metadata/MetadataManager.hpp"
#include "project/references/FolderReference.hpp"
#include "references/FolderReferenceCustomization.hpp"

namespace project::management {

/// A list of folder references over a metadata store. It keeps nothing in memory: each query reads all
/// references and determines their locations again.
///
/// A reference is stored under its UUID. A reference of a type that the list's readers do not read stays
/// stored and is left out of every result.
class FolderReferenceManagerBase : public FolderReferenceManager {
public:
    FolderReferenceManagerBase(std::unique_ptr<FolderReferenceCustomization> customization,
                               std::shared_ptr<metadata::MetadataManager> metadataManager, Path projectRoot);

    std::vector<FolderReference> getReferences() const override;
    void addReferences(std::vector<FolderReference> const& references) override;
    void removeReferences(std::vector<FolderReference> const& references) override;
    bool isReference(Path const& path) const override;
    std::optional<FolderReference> getRootReferenceFor(Path const& path) const override;

private:
    metadata::MetadataPath getReferencePath(FolderReference const& reference) const;
    std::optional<FolderReference> readReference(metadata::MetadataPath const& path) const;
    void checkDuplicates(std::vector<FolderReference> const& newReferences) const;

    std::unique_ptr<FolderReferenceCustomization> customization_;
    std::shared_ptr<metadata::MetadataManager> metadataManager_;
    Path projectRoot_;
};

} // namespace project::management
