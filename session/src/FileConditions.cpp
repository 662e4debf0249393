#include "FileConditions.hpp"

#include <algorithm>

#include "FileTree.hpp"
#include "project/metadata/TreeSchema.hpp"

namespace project::session {

namespace fileSchema = metadata::schema::files;

using metadata::MetadataNode;

namespace {

/// @param choice null for any label.
bool isChosen(MetadataNode const& category, MetadataNode const& label, LabelChoice const* choice) {
    auto const& uuid = label.get(fileSchema::labelUUIDKey);
    if (label.getType() != fileSchema::labelType || uuid.empty()) {
        return false;
    }
    return choice == nullptr || (category.get(fileSchema::categoryUUIDKey) == choice->categoryUUID &&
                                 (choice->labelUUID.empty() || choice->labelUUID == uuid));
}

bool isLabelled(MetadataNode const& file, LabelChoice const* choice) {
    return std::ranges::any_of(file.getChildren(), [choice](auto const& category) {
        return category->getType() == fileSchema::categoryType &&
               std::ranges::any_of(category->getChildren(), [choice, &category](auto const& label) {
                   return isChosen(*category, *label, choice);
               });
    });
}

} // namespace

FileConditions::FileConditions(Query const& query, stores::TreeMetadataManager& store,
                               stores::TreeMetadataManager& personal, fl::filesystem::Path const& root)
    : query_(query),
      hasLabelConditions_(!query.labels.empty() || !query.absentLabels.empty() || query.isUnlabelled) {
    if (query.glob) {
        glob_.emplace(*query.glob);
    }
    if (query.isEntryPoint) {
        entryPoints_ = entryPointNames(store);
    }
    if (hasLabelConditions_ && query.layers != Layers::Project) {
        auto const guard = personal.acquireReadLock();
        FileTree(personal, root).visit(root, [this](VisitedFile const& file) {
            if (!file.node.getChildren().empty()) {
                personal_.emplace(file.path, file.node);
            }
        });
    }
}

bool FileConditions::hold(VisitedFile const& file) const {
    return (!query_.kind || *query_.kind == file.kind) &&
           (!query_.isEntryPoint || entryPoints_.contains(file.path)) &&
           (!hasLabelConditions_ || holdForLabels(file)) && (!glob_ || glob_->isMatch(file.path));
}

bool FileConditions::holdForLabels(VisitedFile const& file) const {
    auto const has = [this, &file](LabelChoice const& choice) { return hasLabel(file, &choice); };
    return std::ranges::all_of(query_.labels, has) && std::ranges::none_of(query_.absentLabels, has) &&
           (!query_.isUnlabelled || !hasLabel(file, nullptr));
}

bool FileConditions::hasLabel(VisitedFile const& file, LabelChoice const* choice) const {
    if (query_.layers != Layers::Personal && isLabelled(file.node, choice)) {
        return true;
    }
    auto const personal = personal_.find(file.path);
    return personal != personal_.end() && isLabelled(personal->second, choice);
}

} // namespace project::session
