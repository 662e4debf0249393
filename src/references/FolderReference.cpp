#include "project/references/FolderReference.hpp"

#include <algorithm>
#include <utility>

#include "project/metadata/MetadataFunctions.hpp"
#include "references/FolderReferenceReader.hpp"

namespace project::management {

FolderReference::FolderReference(Path location, std::u16string type, std::u16string storedPath,
                                 std::u16string uuid)
    : location_(std::move(location)),
      type_(std::move(type)),
      storedPath_(std::move(storedPath)),
      uuid_(std::move(uuid)) {
}

FolderReference::FolderReference(Path location, std::u16string type, std::u16string storedPath)
    : FolderReference(std::move(location), std::move(type), std::move(storedPath), metadata::generateUUID()) {
}

std::u16string FolderReference::getUUID() const {
    return uuid_;
}

FolderReference relativeFolderReference(Path const& target, Path const& root) {
    auto const location = fl::filesystem::canonical(target, Path());
    // Both sides without symbolic links, or ".." in the text would lead from somewhere else than it says.
    auto stored = metadata::getRelativePath(fl::filesystem::canonical(root, Path()), location);
    // One spelling on every system that opens the project. A name that holds a backslash itself pays for it:
    // the reference leads elsewhere when it is read.
    std::replace(stored.begin(), stored.end(), u'\\', u'/');
    return FolderReference(location, relativeReferenceType(), stored);
}

FolderReference absoluteFolderReference(Path const& target) {
    // Stored as it was given: an absolute reference is for a place that people name, such as a drive or a
    // link that is moved on with each release, and not for what is there today.
    return FolderReference(fl::filesystem::canonical(target, Path()), absoluteReferenceType(),
                           target.native());
}

} // namespace project::management
