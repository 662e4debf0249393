#include "project/LabelLayer.hpp"

#include <algorithm>

#include "output/NameForms.hpp"
#include "project/stores/TreeMetadataManager.hpp"

namespace projectctl {

using project::management::CategoryIdentifier;

project::management::LabelManager& LabelLayer::labels() const {
    return isPersonal_ ? project_->personal().getLabelManager() : project_->manager().getLabelManager();
}

project::management::FileManager& LabelLayer::files() const {
    return isPersonal_ ? project_->personal().getFileManager() : project_->files();
}

bool LabelLayer::hasCategory(std::string const& name) const {
    std::u16string const wanted = textOf(name);
    return std::ranges::any_of(labels().getAllCategories(), [&wanted](CategoryIdentifier const& category) {
        return category.getName() == wanted || category.getUUID() == wanted;
    });
}

/// A personal change needs no write lock of the project, which may be locked, or not writable.
LabelLayer::Guard::Guard(LabelLayer const& layer)
    : project_(layer.isPersonal_ ? layer.project_->store().acquireReadLock()
                                 : layer.project_->store().acquireWriteLock()) {
    if (layer.isPersonal_) {
        personal_ = layer.project_->access().personalStore().acquireWriteLock();
    }
}

} // namespace projectctl
