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
        // One folder that the disk can't tell about must not keep all the other references from being read.
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
    // Only looked up, which has a folder that is mounted on demand come into being. The location stays the
    // text that somebody chose, by which callers find an absolute reference again in isReference and on
    // screen.
    [[maybe_unused]] auto const found = canonicalIfPossible(Path(storedPath));
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
