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
    Path const location = fl::filesystem::canonical(target, Path());
    // Both sides are canonical: with a symbolic link in them, ".." in the text would lead elsewhere.
    std::u16string stored = metadata::getRelativePath(fl::filesystem::canonical(root, Path()), location);
    // Every system that opens the project spells the text the same. The price: a reference to a name that
    // contains a backslash leads elsewhere when it is read.
    std::replace(stored.begin(), stored.end(), u'\\', u'/');
    return FolderReference(location, relativeReferenceType(), stored);
}

FolderReference absoluteFolderReference(Path const& target) {
    // Stored unchanged: an absolute reference names a place, such as a drive or a link that moves with each
    // release, and not its present content.
    return FolderReference(fl::filesystem::canonical(target, Path()), absoluteReferenceType(),
                           target.native());
}

} // namespace project::management
