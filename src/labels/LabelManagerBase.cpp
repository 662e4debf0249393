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
using ZEPHRA::project::management::CanNotModifyReadOnlyCategory;
using ZEPHRA::project::management::CanNotModifyReadOnlyLabel;
using ZEPHRA::project::management::CategoryDoesNotExist;
using ZEPHRA::project::management::CategoryDoesNotExistsByUUID;
using ZEPHRA::project::management::CategoryExistsByName;
using ZEPHRA::project::management::LabelDoesNotExistsByUUID;
using ZEPHRA::project::management::LabelExistsByName;

namespace {

MetadataPath getCategoriesPath() {
    return MetadataPathBuilder().add(schema::categories::categoriesType, schema::rootLocation).build();
}

MetadataPath getCategoryPath(std::u16string const& uuid) {
    return MetadataPathBuilder().add(getCategoriesPath()).add(schema::categories::categoryType, uuid).build();
}

MetadataPath getLabelPath(CategoryIdentifier const& category, std::u16string const& labelUUID) {
    return MetadataPathBuilder()
        .add(getCategoryPath(category.getUUID()))
        .add(schema::categories::labelType, labelUUID)
        .build();
}

bool isLabelPath(MetadataPath const& path) {
    return path.getLeaf().getType() == schema::categories::labelType;
}

std::u16string boolToFlag(bool value) {
    return value ? schema::categories::flagTrue : schema::categories::flagFalse;
}

// Both writability checks look at what the caller passed and not at the store: the caller's object is the
// caller's word. Clients that manage read-only categories pass a writable definition of the same UUID to
// change one after all.
void requireCategoryWritable(CategoryIdentifier const& category) {
    if (category.isReadOnly()) {
        exception::raise(CanNotModifyReadOnlyCategory());
    }
}

void requireLabelWritable(CategoryIdentifier const& category, LabelIdentifier const& label) {
    auto const state = label.isReadOnly();
    bool const inheritsWritable = state == LabelReadOnlyState::INHERITED && !category.isReadOnly();
    if (state != LabelReadOnlyState::WRITABLE && !inheritsWritable) {
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
    // That the UUID is new is not checked: under the UUID of another category this one replaces it and keeps
    // its labels, the only way to give a category other flags.
    auto const node = std::make_shared<MetadataNodeSpecification>(schema::nodeType);
    node->put(schema::categories::categoryReadOnlyKey, boolToFlag(category.isReadOnly()));
    node->put(schema::categories::categorySingleValuedKey, boolToFlag(category.isSingleValued()));
    node->put(schema::categories::categoryNameKey, category.getName());
    node->put(schema::categories::categoryDataTypeKey, category.getDataType());
    write(getCategoryPath(category.getUUID()), node);
}

CategoryIdentifier LabelManagerBase::getCategoryByUUID(std::u16string const& uuid) {
    auto const guard = metadataManager_->acquireReadLock();
    auto const path = getCategoryPath(uuid);
    if (!isCategoryPath(path)) {
        exception::raise(CategoryDoesNotExistsByUUID(uuid));
    }
    return readCategory(path);
}

void LabelManagerBase::deleteCategory(CategoryIdentifier const& category) {
    auto const guard = metadataManager_->acquireWriteLock();
    requireCategoryWritable(category);
    fileManager_->removeCategory(fileManager_->getProjectFiles(), category);
    remove(getCategoryPath(category.getUUID())); // its labels lie below and go with it
}

void LabelManagerBase::renameCategory(CategoryIdentifier const& category, std::u16string const& newName) {
    auto const guard = metadataManager_->acquireWriteLock();
    requireCategoryWritable(category);
    auto const path = getCategoryPath(category.getUUID());
    auto const stored = metadataManager_->getNode(path);
    if (!stored) {
        return;
    }
    // The name is not checked, unlike in createCategory: files refer to the category by UUID, and clients
    // that exchange the names of two categories pass through a state in which both have the same one.
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
    // Read-only categories take new labels too: being read-only guards what is there.
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
    requireCategoryPath(category);
    auto const path = getLabelPath(category, uuid);
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
    return path.getLeaf().getType() == schema::categories::categoryType && metadataManager_->hasNode(path);
}

CategoryIdentifier LabelManagerBase::readCategory(MetadataPath const& path) {
    auto const node = metadataManager_->getNode(path);
    CategoryDefinition category(node->get(schema::categories::categoryNameKey), path.getLeaf().getLocation());
    category.setIsReadOnly(node->get(schema::categories::categoryReadOnlyKey) == schema::categories::flagTrue)
        .setIsSingleValued(node->get(schema::categories::categorySingleValuedKey) ==
                           schema::categories::flagTrue)
        .setDataType(node->get(schema::categories::categoryDataTypeKey));
    return category;
}

LabelIdentifier LabelManagerBase::readLabel(MetadataPath const& path) {
    std::unique_ptr<MetadataNode const> node = metadataManager_->getNode(path);
    if (!node) {
        // An address may exist without a node, and getLabelByUUID asks for no more: it reads as an empty one.
        node = std::make_unique<MetadataNodeSpecification>(schema::nodeType);
    }
    LabelDefinition label(node->get(schema::categories::labelNameKey), path.getLeaf().getLocation());
    label.setIsReadOnly(getLabelStateFromName(node->get(schema::categories::labelReadOnlyKey)));
    return label;
}

/// The address of a category that has one, with a node or not: labels that lie below an address without a
/// node stay within reach, while getCategoryByUUID has nothing to read there and answers that it is gone.
MetadataPath LabelManagerBase::requireCategoryPath(CategoryIdentifier const& category) {
    auto path = getCategoryPath(category.getUUID());
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
