#pragma once

#include <string>

#include "exchange/ImportedItem.hpp"

namespace projectctl {

/// A file with at most one label, as a row of a table. A row without a category and a label has no label.
struct FileRow {
    std::u16string path; ///< relative to the root
    std::u16string category;
    std::u16string label;
    std::u16string data;
};

/// The item for a row.
/// @throws Failure if its path is not one below the root, or if it has data without a label.
ImportedItem itemOf(FileRow const& row, std::size_t line, Path const& root);

} // namespace projectctl
