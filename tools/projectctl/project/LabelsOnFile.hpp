#pragma once

#include <string>
#include <utility>
#include <vector>

#include "project/metadata/MetadataNode.hpp"

namespace projectctl {

/// The UUIDs of a category and of a label of it.
using LabelUUIDs = std::pair<std::u16string, std::u16string>;

/// The labels on a file, each once, in the order in which they are stored. The labels and their categories
/// may have been deleted.
using LabelsOnFile = std::vector<LabelUUIDs>;

/// The labels that the node of a file has.
LabelsOnFile labelsOn(project::metadata::MetadataNode const& node);

} // namespace projectctl
