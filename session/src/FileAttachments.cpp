#include "FileAttachments.hpp"

#include "project/metadata/TreeSchema.hpp"

namespace project::session {

namespace fileSchema = metadata::schema::files;
namespace entrySchema = metadata::schema::entrypoints;

using metadata::MetadataPath;
using metadata::PathElement;

namespace {

/// Collects entry points.
class EntryPointReader : public stores::ChildSink {
public:
    void add(stores::LoadedChild const& child) override {
        if (child.type == entrySchema::entryPointType && child.node) {
            names_.emplace(child.node->get(entrySchema::fileKey), child.node->get(entrySchema::nameKey));
        }
    }

    EntryPointNames take() { return std::move(names_); }

private:
    EntryPointNames names_;
};

} // namespace

std::vector<LabelChoice> labelsOn(metadata::MetadataNode const& file) {
    std::vector<LabelChoice> result;
    for (auto const& category : file.getChildren()) {
        if (category->getType() != fileSchema::categoryType) {
            continue;
        }
        for (auto const& label : category->getChildren()) {
            auto const& uuid = label->get(fileSchema::labelUUIDKey);
            if (label->getType() == fileSchema::labelType && !uuid.empty()) {
                result.push_back({category->get(fileSchema::categoryUUIDKey), uuid});
            }
        }
    }
    return result;
}

EntryPointNames entryPointNames(stores::TreeMetadataManager& store) {
    EntryPointReader reader;
    store.loadChildren(
        MetadataPath::root().child(PathElement(entrySchema::entryPointsType, metadata::schema::rootLocation)),
        reader);
    return reader.take();
}

} // namespace project::session
