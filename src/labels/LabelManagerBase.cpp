#include "labels/LabelManagerBase.hpp"

#include <utility>

#include "project/files/FileLabel.hpp"
#include "project/labels/Label.hpp"
#include "project/metadata/Messages.hpp"
#include "project/metadata/MetadataNodeSpecification.hpp"
#include "project/metadata/MetadataPathBuilder.hpp"
#include "project/metadata/ProjectException.hpp"
#include "project/metadata/TreeSchema.hpp"

namespace project::management {

namespace schema = metadata::schema;

using metadata::MetadataNode;
using metadata::MetadataNodeSpecification;
using metadata::MetadataPath;
using metadata::MetadataPathBuilder;
using metadata::PathElement;
using ZEPHRA::project::management::CanNotModifyReadOnlyCategory;
using ZEPHRA::project::management::CanNotModifyReadOnlyLabel;
using ZEPHRA::project::management::CategoryDoesNotExist;
using ZEPHRA::project::management::CategoryDoesNotExistsByUUID;
using ZEPHRA::project::management::CategoryExistsByName;
using ZEPHRA::project::management::LabelDoesNotExistsByUUID;
using ZEPHRA::project::management::LabelExistsByName;

namespace {

MetadataPath const& getCategoriesPath() {
    static MetadataPath const path =
        MetadataPathBuilder().add(schema::categories::categoriesType, schema::rootLocation).build();
    return path;
}

MetadataPath getCategoryPath(std::u16string const& uuid) {
    return getCategoriesPath().child(PathElement(schema::categories::categoryType, uuid));
}

MetadataPath getLabelPath(MetadataPath const& category, std::u16string const& labelUUID) {
    return category.child(PathElement(schema::categories::labelType, labelUUID));
}

MetadataPath getLabelPath(CategoryIdentifier const& category, std::u16string const& labelUUID) {
    return getLabelPath(getCategoryPath(category.getUUID()), labelUUID);
}

bool isLabelPath(MetadataPath const& path) {
    return path.leaf().getType() == schema::categories::labelType;
}

std::u16string boolToFlag(bool value) {
    return value ? schema::categories::flagTrue : schema::categories::flagFalse;
}

// Both checks use the caller's object and not the store: clients that manage read-only categories pass
// a writable definition with the same UUID to change one.
void requireCategoryWritable(CategoryIdentifier const& category) {
    if (category.isReadOnly()) {
        exception::raise(CanNotModifyReadOnlyCategory());
    }
}

void requireLabelWritable(CategoryIdentifier const& category, LabelIdentifier const& label) {
    LabelReadOnlyState const state = label.isReadOnly();
    bool const isInheritedWritable = state == LabelReadOnlyState::INHERITED && !category.isReadOnly();
    if (state != LabelReadOnlyState::WRITABLE && !isInheritedWritable) {
        exception::raise(CanNotModifyReadOnlyLabel());
    }
}

} // namespace

LabelManagerBase::LabelManagerBase(std::shared_ptr<metadata::MetadataManager> metadataManager,
                                   FileManager* fileManager)
    : metadataManager_(std::move(metadataManager)), fileManager_(fileManager) {
}

void LabelManagerBase::createCategory(CategoryIdentifier const& category) {
    auto const guard = metadataManager_->acquireWriteLock();
    requireCategoryNameFree(category.getName());
    // The UUID may be stored already: the category then replaces the stored one and keeps its labels, which
    // is the only way to change the flags of a category.
    auto const node = std::make_shared<MetadataNodeSpecification>(schema::nodeType);
    node->put(schema::categories::categoryReadOnlyKey, boolToFlag(category.isReadOnly()));
    node->put(schema::categories::categorySingleValuedKey, boolToFlag(category.isSingleValued()));
    node->put(schema::categories::categoryNameKey, category.getName());
    node->put(schema::categories::categoryDataTypeKey, category.getDataType());
    write(getCategoryPath(category.getUUID()), node);
}

CategoryIdentifier LabelManagerBase::getCategoryByUUID(std::u16string const& uuid) {
    auto const guard = metadataManager_->acquireReadLock();
    MetadataPath const path = getCategoryPath(uuid);
    if (!isCategoryPath(path)) {
        exception::raise(CategoryDoesNotExistsByUUID(uuid));
    }
    return readCategory(path);
}

void LabelManagerBase::deleteCategory(CategoryIdentifier const& category) {
    auto const guard = metadataManager_->acquireWriteLock();
    requireCategoryWritable(category);
    fileManager_->removeCategory(fileManager_->getProjectFiles(), category);
    remove(getCategoryPath(category.getUUID())); // with its labels, which are below it
}

void LabelManagerBase::renameCategory(CategoryIdentifier const& category, std::u16string const& newName) {
    auto const guard = metadataManager_->acquireWriteLock();
    requireCategoryWritable(category);
    MetadataPath const path = getCategoryPath(category.getUUID());
    auto const stored = metadataManager_->getNode(path);
    if (!stored) {
        return;
    }
    // Unlike in createCategory, another category may have the name: files refer to categories by UUID, and a
    // client that swaps the names of two categories gives both the same name for a moment.
    auto const node = std::make_shared<MetadataNodeSpecification>(*stored);
    node->put(schema::categories::categoryNameKey, newName);
    write(path, node);
}

std::vector<CategoryIdentifier> LabelManagerBase::getAllCategories() {
    auto const guard = metadataManager_->acquireReadLock();
    std::vector<CategoryIdentifier> result;
    for (auto const& child : metadataManager_->getChildNodes(getCategoriesPath())) {
        if (isCategoryPath(child)) {
            result.push_back(readCategory(child));
        }
    }
    return result;
}

void LabelManagerBase::createLabel(CategoryIdentifier const& category, LabelIdentifier const& label) {
    auto const guard = metadataManager_->acquireWriteLock();
    // A read-only category accepts new labels too: only existing labels are protected.
    requireLabelNameFree(category, label.getName());
    auto const node = std::make_shared<MetadataNodeSpecification>(schema::nodeType);
    node->put(schema::categories::labelNameKey, label.getName());
    node->put(schema::categories::labelReadOnlyKey, labelTypeToString(label.isReadOnly()));
    write(getLabelPath(category, label.getUUID()), node);
}

std::vector<LabelIdentifier> LabelManagerBase::getLabels(CategoryIdentifier const& category) {
    auto const guard = metadataManager_->acquireReadLock();
    std::vector<LabelIdentifier> result;
    for (auto const& child : metadataManager_->getChildNodes(requireCategoryPath(category))) {
        if (isLabelPath(child) && metadataManager_->hasNode(child)) {
            result.push_back(readLabel(child));
        }
    }
    return result;
}

LabelIdentifier LabelManagerBase::getLabelByUUID(CategoryIdentifier const& category, std::u16string uuid) {
    auto const guard = metadataManager_->acquireReadLock();
    MetadataPath const path = getLabelPath(requireCategoryPath(category), uuid);
    if (!metadataManager_->pathExists(path)) {
        exception::raise(LabelDoesNotExistsByUUID(uuid));
    }
    return readLabel(path);
}

void LabelManagerBase::deleteLabel(CategoryIdentifier const& category, LabelIdentifier const& label) {
    auto const guard = metadataManager_->acquireWriteLock();
    requireLabelWritable(category, label);
    fileManager_->removeLabels(fileManager_->getProjectFiles(), {Label(category, label)});
    remove(getLabelPath(category, label.getUUID()));
}

bool LabelManagerBase::isCategoryPath(MetadataPath const& path) {
    return path.leaf().getType() == schema::categories::categoryType && metadataManager_->hasNode(path);
}

CategoryIdentifier LabelManagerBase::readCategory(MetadataPath const& path) {
    auto const node = metadataManager_->getNode(path);
    CategoryDefinition category(node->get(schema::categories::categoryNameKey), path.leaf().getLocation());
    category.setIsReadOnly(node->get(schema::categories::categoryReadOnlyKey) == schema::categories::flagTrue)
        .setIsSingleValued(node->get(schema::categories::categorySingleValuedKey) ==
                           schema::categories::flagTrue)
        .setDataType(node->get(schema::categories::categoryDataTypeKey));
    return category;
}

LabelIdentifier LabelManagerBase::readLabel(MetadataPath const& path) {
    std::unique_ptr<MetadataNode const> node = metadataManager_->getNode(path);
    if (!node) {
        // getLabelByUUID requires an address and not a node. An address without a node reads like an empty
        // one.
        node = std::make_unique<MetadataNodeSpecification>(schema::nodeType);
    }
    LabelDefinition label(node->get(schema::categories::labelNameKey), path.leaf().getLocation());
    label.setIsReadOnly(getLabelStateFromName(node->get(schema::categories::labelReadOnlyKey)));
    return label;
}

/// Returns the address of a category, with or without a node: labels below an address without a node can
/// still be read, while getCategoryByUUID throws for it.
MetadataPath LabelManagerBase::requireCategoryPath(CategoryIdentifier const& category) {
    MetadataPath path = getCategoryPath(category.getUUID());
    if (!metadataManager_->pathExists(path)) {
        exception::raise(CategoryDoesNotExist(category.getName()));
    }
    return path;
}

void LabelManagerBase::requireCategoryNameFree(std::u16string const& name) {
    auto const guard = metadataManager_->acquireReadLock();
    for (auto const& category : getAllCategories()) {
        if (category.getName() == name) {
            exception::raise(CategoryExistsByName(name));
        }
    }
}

void LabelManagerBase::requireLabelNameFree(CategoryIdentifier const& category, std::u16string const& name) {
    auto const guard = metadataManager_->acquireReadLock();
    for (auto const& label : getLabels(category)) {
        if (label.getName() == name) {
            exception::raise(LabelExistsByName(category.getName(), name));
        }
    }
}

void LabelManagerBase::write(MetadataPath const& path, std::shared_ptr<MetadataNode> node) {
    std::map<MetadataPath, std::shared_ptr<MetadataNode>> batch{{path, std::move(node)}};
    metadataManager_->setNodes(batch);
}

void LabelManagerBase::remove(MetadataPath const& path) {
    std::vector<MetadataPath> paths{path};
    metadataManager_->removeNodes(paths);
}

} // namespace project::management
