#include "exchange/FileRow.hpp"

#include "output/Failure.hpp"
#include "output/NameForms.hpp"

namespace projectctl {

ImportedItem itemOf(FileRow const& row, std::size_t line, Path const& root) {
    auto const path = pathFromRoot(root, row.path);
    if (!path) {
        throw Failure(Message("NotAPath", row.path));
    }
    bool const hasLabel = !row.category.empty() || !row.label.empty();
    if (!hasLabel && !row.data.empty()) {
        throw Failure(Message("DataWithoutLabel"));
    }
    ImportedItem result{line, *path};
    if (hasLabel) {
        result.label = ImportedLabel{row.category, row.label, row.data};
    }
    return result;
}

} // namespace projectctl
