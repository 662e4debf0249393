#include "project/FileTreeForm.hpp"

#include <algorithm>

#include "output/Kind.hpp"
#include "output/Output.hpp"

namespace projectctl {

/// The elements of the path that belong to the visit are its last ones, one more than its depth.
void FileTreeForm::write(FileList::File const& file) {
    std::u16string_view const path = file.path;
    auto const elements = static_cast<std::size_t>(std::ranges::count(path, u'/')) + 1;
    std::size_t end = 0;
    for (std::size_t element = 0; element + file.depth + 1 < elements; ++element) {
        end = path.find(u'/', end) + 1;
    }
    for (std::size_t depth = 0; depth < file.depth; ++depth) {
        end = path.find(u'/', end) + 1;
        if (!shownBefore_.starts_with(path.substr(0, end))) {
            writeName(path.substr(0, end - 1), depth, true);
        }
    }
    writeName(path, file.depth, file.kind == Kind::Folder);
    shownBefore_ = path;
    shownBefore_ += u'/';
}

void FileTreeForm::writeName(std::u16string_view path, std::size_t depth, bool isFolder) {
    output().text().append(2 * depth, ' ');
    output().name(depth == 0 ? shown_.of(path) : path.substr(path.rfind(u'/') + 1));
    output().text() += isFolder ? "/\n" : "\n";
    output().flushWhenLarge();
}

} // namespace projectctl
