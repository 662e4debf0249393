#include "references/FolderReferenceReader.hpp"

#include <utility>

#include "project/metadata/TreeSchema.hpp"

namespace project::management {

namespace schema = metadata::schema;

namespace {

Path canonicalIfPossible(Path path) {
    try {
        return fl::filesystem::canonical(path, Path());
    } catch (...) {
        // A folder that cannot be accessed must not prevent the other references from being read.
        return path;
    }
}

} // namespace

std::u16string const& absoluteReferenceType() {
    static std::u16string const type = schema::references::absolute;
    return type;
}

std::u16string const& relativeReferenceType() {
    static std::u16string const type = schema::references::relative;
    return type;
}

FolderReferenceReader::~FolderReferenceReader() = default;

bool AbsoluteFolderReferenceReader::canRead(std::u16string const& type) const {
    return type == absoluteReferenceType();
}

FolderReference AbsoluteFolderReferenceReader::read(std::u16string const& storedPath,
                                                    std::u16string const& uuid) const {
    // The access mounts a folder that is mounted on demand. Its result is not used: the location stays the
    // text that the user chose, by which isReference and users find the reference.
    [[maybe_unused]] Path const found = canonicalIfPossible(Path(storedPath));
    return FolderReference(Path(storedPath), absoluteReferenceType(), storedPath, uuid);
}

RelativeFolderReferenceReader::RelativeFolderReferenceReader(Path root) : root_(std::move(root)) {
}

bool RelativeFolderReferenceReader::canRead(std::u16string const& type) const {
    return type == relativeReferenceType();
}

FolderReference RelativeFolderReferenceReader::read(std::u16string const& storedPath,
                                                    std::u16string const& uuid) const {
    return FolderReference(canonicalIfPossible(root_ / storedPath), relativeReferenceType(), storedPath,
                           uuid);
}

} // namespace project::management
