#pragma once

#include <memory>
#include <vector>

#include "project/metadata/MetadataPath.hpp"
#include "references/FolderReferenceReader.hpp"

namespace project::management {

/// What tells one list of folder references from another.
///
/// Customizations are immutable and may be used by several threads at once.
class FolderReferenceCustomization {
public:
    virtual ~FolderReferenceCustomization();

    /// Called for each reference that is about to be stored; what it throws ends the whole addition.
    virtual void validateReference(FolderReference const& reference) const = 0;

    /// The address below which the list is stored.
    virtual metadata::MetadataPath getRootPath() const = 0;

    /// Throws the error that tells that a folder is in the list already; never returns.
    [[noreturn]] virtual void throwDuplicate(Path const& location) const = 0;

    /// The readers to ask, in this order. They live as long as this object.
    virtual std::vector<std::unique_ptr<FolderReferenceReader>> const& getReaders() const = 0;
};

} // namespace project::management
