#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <vector>

#include "fl/filesystem/Path.hpp"

namespace projectctl {

using fl::filesystem::Path;

/// A label by its names, with its data on a file.
struct ImportedLabel {
    std::u16string category;
    std::u16string label;
    std::u16string data; ///< empty for none
};

/// A file or folder that should be in the project, perhaps with a label.
struct ImportedItem {
    std::size_t line; ///< of the source, from 1; 0 if it has none
    Path path;        ///< absolute
    std::optional<ImportedLabel> label = {};
};

using ImportedItems = std::vector<ImportedItem>;

/// The path for a text relative to the root; empty if it cannot be one: an absolute path, or one with "." or
/// "..".
std::optional<Path> pathFromRoot(Path const& root, std::u16string const& text);

} // namespace projectctl
