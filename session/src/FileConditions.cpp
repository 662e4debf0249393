#include "FileConditions.hpp"

#include <algorithm>

#include "project/metadata/TreeSchema.hpp"

namespace project::session {

namespace fileSchema = metadata::schema::files;
namespace entrySchema = metadata::schema::entrypoints;

using metadata::MetadataNode;
using metadata::MetadataPath;
using metadata::PathElement;

namespace {

/// Collects the files of entry points.
class EntryPointFiles : public stores::ChildSink {
public:
    void add(stores::LoadedChild const& child) override {
        if (child.type == entrySchema::entryPointType && child.node) {
            files_.insert(child.node->get(entrySchema::fileKey));
        }
    }

    std::set<std::u16string, std::less<>> take() { return std::move(files_); }

private:
    std::set<std::u16string, std::less<>> files_;
};

/// @param choice null for any label.
bool isChosen(MetadataNode const& category, MetadataNode const& label, LabelChoice const* choice) {
    auto const& uuid = label.get(fileSchema::labelUUIDKey);
    if (label.getType() != fileSchema::labelType || uuid.empty()) {
        return false;
    }
    return choice == nullptr || (category.get(fileSchema::categoryUUIDKey) == choice->categoryUUID &&
                                 (choice->labelUUID.empty() || choice->labelUUID == uuid));
}

bool hasLabel(MetadataNode const& file, LabelChoice const* choice) {
    return std::ranges::any_of(file.getChildren(), [choice](auto const& category) {
        return category->getType() == fileSchema::categoryType &&
               std::ranges::any_of(category->getChildren(), [choice, &category](auto const& label) {
                   return isChosen(*category, *label, choice);
               });
    });
}

} // namespace

FileConditions::FileConditions(Query const& query, stores::TreeMetadataManager& store)
    : query_(query),
      hasLabelConditions_(!query.labels.empty() || !query.absentLabels.empty() || query.isUnlabelled) {
    if (query.glob) {
        glob_.emplace(*query.glob);
    }
    if (query.isEntryPoint) {
        EntryPointFiles files;
        store.loadChildren(MetadataPath::root().child(
                               PathElement(entrySchema::entryPointsType, metadata::schema::rootLocation)),
                           files);
        entryPoints_ = files.take();
    }
}

bool FileConditions::hold(VisitedFile const& file) const {
    return (!query_.kind || *query_.kind == file.kind) &&
           (!query_.isEntryPoint || entryPoints_.contains(file.path)) &&
           (!hasLabelConditions_ || holdForLabels(file.node)) && (!glob_ || glob_->isMatch(file.path));
}

bool FileConditions::holdForLabels(MetadataNode const& node) const {
    auto const has = [&node](LabelChoice const& choice) { return hasLabel(node, &choice); };
    return std::ranges::all_of(query_.labels, has) && std::ranges::none_of(query_.absentLabels, has) &&
           (!query_.isUnlabelled || !hasLabel(node, nullptr));
}

} // namespace project::session
