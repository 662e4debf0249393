#pragma once

#include <memory>
#include <utility>
#include <vector>

#include "fl/filesystem/Path.hpp"
#include "project/metadata/MetadataPath.hpp"
#include "references/FolderReferenceReader.hpp"

namespace project::management {

/// The differences between the two lists of folder references.
///
/// Customizations are immutable. Several threads may use one at the same time.
class FolderReferenceCustomization {
public:
    virtual ~FolderReferenceCustomization();

    /// Called for each reference before any is stored. Throws if the reference must not be stored.
    virtual void validateReference(FolderReference const& reference) const = 0;

    /// Returns the address below which the list is stored.
    virtual metadata::MetadataPath getRootPath() const = 0;

    /// Throws the list's error for a folder that is in the list already.
    [[noreturn]] virtual void throwDuplicate(Path const& location) const = 0;

    /// Returns the readers, in the order in which they are tried. They are valid as long as this object.
    virtual std::vector<std::unique_ptr<FolderReferenceReader>> const& getReaders() const = 0;
};

/// The part that both lists have in common: each has its readers, and accepts every reference.
class CustomizationWithReaders : public FolderReferenceCustomization {
public:
    void validateReference(FolderReference const& reference) const override;

    std::vector<std::unique_ptr<FolderReferenceReader>> const& getReaders() const override {
        return readers_;
    }

protected:
    void addReader(std::unique_ptr<FolderReferenceReader> reader) { readers_.push_back(std::move(reader)); }

private:
    std::vector<std::unique_ptr<FolderReferenceReader>> readers_;
};

/// The list of the project path. Only relative references are read from it.
class ProjectPathFolderReferenceCustomization : public CustomizationWithReaders {
public:
    explicit ProjectPathFolderReferenceCustomization(Path const& projectRoot);

    metadata::MetadataPath getRootPath() const override;
    [[noreturn]] void throwDuplicate(Path const& location) const override;
};

/// The list of references to other projects, which are relative or absolute.
class ProjectFolderReferenceCustomization : public CustomizationWithReaders {
public:
    explicit ProjectFolderReferenceCustomization(Path const& projectRoot);

    metadata::MetadataPath getRootPath() const override;
    [[noreturn]] void throwDuplicate(Path const& location) const override;
};

} // namespace project::management
