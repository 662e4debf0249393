#pragma once

#include <cstddef>
#include <string>
#include <string_view>

#include "cli/ShownPaths.hpp"
#include "project/FileList.hpp"

namespace projectctl {

/// Writes files as a tree to standard output, one name per line, indented by two blanks for each folder. A
/// folder that was not found is shown above the files in it that were.
class FileTreeForm {
public:
    explicit FileTreeForm(ShownPaths shown) : shown_(std::move(shown)) {}

    /// @param file the next one, in the order of the store.
    void write(FileList::File const& file);

private:
    void writeName(std::u16string_view path, std::size_t depth, bool isFolder);

    ShownPaths shown_;
    std::u16string shownBefore_; ///< the path of the previous line, with a separator at its end
};

} // namespace projectctl
