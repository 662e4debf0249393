#pragma once

#include <functional>

#include "exchange/FileRow.hpp"
#include "exchange/Unmapped.hpp"
#include "output/Kind.hpp"
#include "project/OpenProject.hpp"

namespace projectctl {

using RowVisitor = std::function<void(FileRow const& row, Kind kind)>;

/// Visits the files and folders of a project in the order of `list`: each once for every label, or once
/// without one.
/// @param unmapped gets the labels that no row can name: those that were deleted, and those without any name.
void visitRows(OpenProject& project, Unmapped& unmapped, RowVisitor const& visitor);

} // namespace projectctl
