#include "project/LabelsOnFile.hpp"

#include <set>

#include "project/metadata/TreeSchema.hpp"

namespace projectctl {

namespace fileSchema = project::metadata::schema::files;

LabelsOnFile labelsOn(project::metadata::MetadataNode const& node) {
    LabelsOnFile result;
    std::set<LabelUUIDs> seen;
    for (auto const& category : node.getChildren()) {
        for (auto const& label : category->getChildren()) {
            LabelUUIDs uuids(category->get(fileSchema::categoryUUIDKey),
                             label->get(fileSchema::labelUUIDKey));
            bool const isLabel =
                category->getType() == fileSchema::categoryType && label->getType() == fileSchema::labelType;
            if (isLabel && seen.insert(uuids).second) {
                result.push_back(std::move(uuids));
            }
        }
    }
    return result;
}

} // namespace projectctl
