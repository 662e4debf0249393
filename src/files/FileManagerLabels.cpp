// The label operations of FileManagerBase.

#include <algorithm>
#include <iterator>
#include <utility>

#include "files/FileManagerBase.hpp"
#include "project/files/FileLabel.hpp"
#include "project/files/LabelIDSet.hpp"
#include "project/metadata/MetadataNodeSpecification.hpp"
#include "project/metadata/ProjectException.hpp"
#include "project/metadata/TreeSchema.hpp"

namespace project::management {

namespace schema = metadata::schema;

using metadata::MetadataNode;
using metadata::MetadataNodeSpecification;
using metadata::MetadataPath;
using metadata::PathElement;

namespace {

/// A copy of the list of nested nodes, so that a loop over it may remove them.
std::vector<MetadataNode*> childrenOf(MetadataNode const& node) {
    std::vector<MetadataNode*> result;
    result.reserve(node.getChildren().size());
    for (auto const& child : node.getChildren()) {
        result.push_back(child.get());
    }
    return result;
}

/// The first nested node of a type whose key has a value; null if there is none.
MetadataNode* findChild(MetadataNode const& node, std::u16string_view type, std::u16string const& key,
                        std::u16string const& value) {
    for (auto const& child : node.getChildren()) {
        if (child->getType() == type && child->get(key) == value) {
            return child.get();
        }
    }
    return nullptr;
}

MetadataNode* findCategory(MetadataNode const& fileNode, std::u16string const& uuid) {
    return findChild(fileNode, schema::files::categoryType, schema::files::categoryUUIDKey, uuid);
}

/// @return true if the label had data.
bool removeLabelData(MetadataNode& dataNode, Label const& label) {
    bool hasData = false;
    for (auto* const record : childrenOf(dataNode)) {
        if (record->get(schema::files::recordUUIDKey) == label.getUUID()) {
            dataNode.removeChild(record);
            hasData = true;
        }
    }
    return hasData;
}

/// Removes a label and its data from a file's nodes. For a label that the file does not have, its data stays
/// too.
/// @return true if the label had data.
bool removeLabel(MetadataNode& fileNode, MetadataNode& dataNode, Label const& label) {
    MetadataNode* const categoryNode = findCategory(fileNode, label.getCategory().getUUID());
    if (categoryNode == nullptr) {
        return false;
    }
    MetadataNode* const labelNode =
        findChild(*categoryNode, schema::files::labelType, schema::files::labelUUIDKey, label.getUUID());
    if (labelNode == nullptr) {
        return false;
    }
    categoryNode->removeChild(labelNode);
    if (categoryNode->getChildren().empty()) {
        fileNode.removeChild(categoryNode);
    }
    return removeLabelData(dataNode, label);
}

void appendLabelIDSets(MetadataNode const& categoryNode, std::vector<LabelIDSet>& result) {
    std::u16string const& categoryUUID = categoryNode.get(schema::files::categoryUUIDKey);
    if (categoryUUID.empty()) {
        return;
    }
    for (auto const& child : categoryNode.getChildren()) {
        std::u16string const& labelUUID = child->get(schema::files::labelUUIDKey);
        if (child->getType() == schema::files::labelType && !labelUUID.empty()) {
            result.emplace_back(categoryUUID, labelUUID);
        }
    }
}

} // namespace

std::vector<FileLabel> FileManagerBase::addLabels(std::vector<Path> const& files,
                                                  std::vector<Label> const& labels) {
    auto const guard = metadataManager_->acquireWriteLock();
    std::vector<FileLabel> displaced;
    FileNodes batch;
    for (auto const& file : files) {
        if (!isFileInProject(file) || isMetadataFile(file)) {
            continue;
        }
        std::shared_ptr<MetadataNode> node = fileStore_->getFileNode(file);
        for (auto const& label : labels) {
            if (!hasLabel(file, label)) {
                std::ranges::move(addLabelToNode(*node, label, file), std::back_inserter(displaced));
            }
        }
        batch.insert_or_assign(batch.end(), file, std::move(node)); // most lists are sorted
    }
    if (!batch.empty()) {
        fileStore_->setFileNodes(std::move(batch));
    }
    return displaced;
}

bool FileManagerBase::hasLabel(Path const& path, Label const& label) {
    // The label's UUID is first here and the category's is first in the pairs of getLabelIDSets, so this is
    // true only for a label and a category with the same UUID. addLabels depends on the result false: adding
    // a label that the file has replaces it and returns its data, or in a multi-valued category adds it once
    // more.
    LabelIDSet const pair(label.getUUID(), label.getCategory().getUUID());
    auto const pairs = getLabelIDSets(path);
    return std::ranges::find(pairs, pair) != pairs.end();
}

std::vector<FileLabel> FileManagerBase::addLabelToNode(MetadataNode& node, Label const& label,
                                                       Path const& path) {
    std::vector<FileLabel> displaced;
    CategoryIdentifier const& category = label.getCategory();
    MetadataNode* categoryNode = findCategory(node, category.getUUID());
    if (categoryNode == nullptr) {
        categoryNode = node.addChild(schema::files::categoryType);
        categoryNode->put(schema::files::categoryUUIDKey, category.getUUID());
    } else if (category.isSingleValued()) {
        displaced = takeCategoryLabels(category, path, *categoryNode);
    }
    categoryNode->addChild(schema::files::labelType)->put(schema::files::labelUUIDKey, label.getUUID());
    return displaced;
}

std::vector<FileLabel> FileManagerBase::takeCategoryLabels(CategoryIdentifier const& category,
                                                           Path const& path, MetadataNode& categoryNode) {
    std::vector<FileLabel> taken;
    for (auto* const child : childrenOf(categoryNode)) {
        std::u16string const uuid = child->get(schema::files::labelUUIDKey);
        try {
            taken.emplace_back(category, labelManager_->getLabelByUUID(category, uuid), path,
                               child->get(schema::files::labelValueKey));
        } catch (exception::ProjectException const&) {
            // A deleted label cannot be returned, and must not prevent other labels from being added.
        }
        categoryNode.removeChild(child);
    }
    return taken;
}

void FileManagerBase::removeLabels(std::vector<Path> const& files, std::vector<Label> const& labels) {
    auto const guard = metadataManager_->acquireWriteLock();
    FileNodes batch;
    FileNodes dataBatch;
    bool hasRemovedData = false;
    for (auto const& file : files) {
        std::shared_ptr<MetadataNode> node = fileStore_->getFileNode(file);
        std::shared_ptr<MetadataNode> dataNode = getLabelDataNode(file);
        for (auto const& label : labels) {
            hasRemovedData |= removeLabel(*node, *dataNode, label);
        }
        batch.insert_or_assign(batch.end(), file, std::move(node)); // most lists are sorted
        dataBatch.insert_or_assign(dataBatch.end(), file, std::move(dataNode));
    }
    fileStore_->setFileNodes(std::move(batch));
    if (hasRemovedData) {
        writeLabelDataNodes(dataBatch);
    }
}

std::vector<LabelIDSet> FileManagerBase::getLabelIDSets(Path const& path) {
    auto const guard = metadataManager_->acquireReadLock();
    std::vector<LabelIDSet> result;
    auto const node = fileStore_->getFileNode(path);
    for (auto const& child : node->getChildren()) {
        if (child->getType() == schema::files::categoryType) {
            appendLabelIDSets(*child, result);
        }
    }
    return result;
}

std::vector<FileLabel> FileManagerBase::getLabels(Path const& path) {
    auto const guard = metadataManager_->acquireReadLock();
    std::vector<FileLabel> result;
    auto const dataNode = getLabelDataNode(path);
    auto const& records = dataNode->getChildren();
    auto const pairs = getLabelIDSets(path);
    result.reserve(pairs.size());
    for (auto const& pair : pairs) {
        CategoryIdentifier const category = labelManager_->getCategoryByUUID(pair.getCategoryUUID());
        LabelIdentifier const label = labelManager_->getLabelByUUID(category, pair.getLabelUUID());
        auto const record = std::ranges::find_if(records, [&](auto const& candidate) {
            return candidate->get(schema::files::recordUUIDKey) == pair.getLabelUUID();
        });
        if (record != records.end()) {
            result.emplace_back(category, label, path, (*record)->get(schema::files::recordValueKey));
        }
        // Once more without data, with or without a record: every label of the file has an entry without
        // data, by which callers count labels. Callers that need the data use the first entry.
        result.emplace_back(category, label, path);
    }
    return result;
}

void FileManagerBase::removeCategory(std::vector<Path> const& files, CategoryIdentifier const& category) {
    auto const guard = metadataManager_->acquireWriteLock();
    std::u16string const uuid = category.getUUID();
    FileNodes batch;
    for (auto const& file : files) {
        std::shared_ptr<MetadataNode> node = fileStore_->getFileNode(file);
        if (MetadataNode* const categoryNode = findCategory(*node, uuid)) {
            node->removeChild(categoryNode);
        }
        batch.insert_or_assign(batch.end(), file, std::move(node)); // most lists are sorted
    }
    fileStore_->setFileNodes(std::move(batch));
}

MetadataPath FileManagerBase::getLabelDataPath(Path const& path) const {
    return fileStore_->toMetadataPath(path).child(
        PathElement(schema::files::labelDataType, schema::files::labelDataLocation));
}

std::unique_ptr<MetadataNode> FileManagerBase::getLabelDataNode(Path const& path) const {
    MetadataPath const address = getLabelDataPath(path);
    auto node = metadataManager_->pathExists(address) ? metadataManager_->getNode(address) : nullptr;
    return node ? std::move(node) : std::make_unique<MetadataNodeSpecification>(schema::nodeType);
}

void FileManagerBase::writeLabelDataNodes(FileNodes const& nodes) {
    auto const guard = metadataManager_->acquireWriteLock();
    std::map<MetadataPath, std::shared_ptr<MetadataNode>> batch;
    for (auto const& [file, node] : nodes) {
        batch.insert_or_assign(batch.end(), getLabelDataPath(file), node);
    }
    metadataManager_->setNodes(batch);
}

} // namespace project::management
