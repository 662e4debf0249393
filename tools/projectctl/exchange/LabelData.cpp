#include "exchange/LabelData.hpp"

#include <algorithm>
#include <utility>

#include "project/metadata/MetadataNodeSpecification.hpp"
#include "project/metadata/TreeSchema.hpp"

namespace projectctl {

namespace treeSchema = project::metadata::schema;

using project::metadata::MetadataNode;
using project::metadata::MetadataPath;

namespace {

/// @return null if there is none.
MetadataNode* recordOf(MetadataNode const& node, std::u16string const& labelUUID) {
    auto const& records = node.getChildren();
    auto const found = std::ranges::find_if(records, [&labelUUID](auto const& record) {
        return record->get(treeSchema::files::recordUUIDKey) == labelUUID;
    });
    return found != records.end() ? found->get() : nullptr;
}

} // namespace

std::u16string LabelData::of(Path const& file, std::u16string const& labelUUID) const {
    auto const node = nodeOf(addressOf(file));
    auto const* const record = node ? recordOf(*node, labelUUID) : nullptr;
    return record != nullptr ? record->get(treeSchema::files::recordValueKey) : std::u16string();
}

void LabelData::set(Path const& file, std::u16string const& labelUUID, std::u16string const& data) {
    auto const address = addressOf(file);
    auto const changed = changed_.find(address);
    auto node = changed != changed_.end() ? changed->second : nodeOf(address);
    if (!node) {
        node = std::make_shared<project::metadata::MetadataNodeSpecification>(treeSchema::nodeType);
    }
    auto* record = recordOf(*node, labelUUID);
    if (record != nullptr && record->get(treeSchema::files::recordValueKey) == data) {
        return;
    }
    if (record == nullptr) {
        record = node->addChild(treeSchema::files::labelType);
        record->put(treeSchema::files::recordUUIDKey, labelUUID);
    }
    record->put(treeSchema::files::recordValueKey, data);
    changed_.insert_or_assign(address, std::move(node));
}

void LabelData::write() {
    if (!changed_.empty()) {
        project_.store().setNodes(changed_);
        changed_.clear();
    }
}

MetadataPath LabelData::addressOf(Path const& file) const {
    return files_.addressOf(file).child(project::metadata::PathElement(treeSchema::files::labelDataType,
                                                                       treeSchema::files::labelDataLocation));
}

LabelData::Node LabelData::nodeOf(MetadataPath const& address) const {
    return project_.store().pathExists(address) ? Node(project_.store().getNode(address)) : nullptr;
}

} // namespace projectctl
