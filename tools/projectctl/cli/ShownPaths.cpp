#include "cli/ShownPaths.hpp"

#include <utility>

#include "cli/Settings.hpp"
#include "cli/WorkingFolder.hpp"
#include "project/metadata/MetadataFunctions.hpp"

namespace projectctl {

using fl::filesystem::Path;

ShownPaths::ShownPaths(Path root) : ShownPaths(root, settings().showsFullNames ? root : workingFolder()) {
}

ShownPaths::ShownPaths(Path root, Path from)
    : root_(std::move(root)), from_(std::move(from)), isFromRoot_(from_ == root_) {
}

ShownPaths ShownPaths::fromRoot(Path root) {
    auto from = root;
    return {std::move(root), std::move(from)};
}

std::u16string_view ShownPaths::of(std::u16string_view path) {
    if (path.starts_with(u'/') || (isFromRoot_ && !path.empty())) {
        return path;
    }
    return ofAbsolute(root_ / Path(std::u16string(path)));
}

std::u16string_view ShownPaths::ofAbsolute(Path const& path) {
    shown_ = project::metadata::getRelativePath(from_, path);
    return shown_.empty() ? std::u16string_view(u".") : std::u16string_view(shown_);
}

} // namespace projectctl
