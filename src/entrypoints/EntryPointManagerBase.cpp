#include "entrypoints/EntryPointManagerBase.hpp"

#include <algorithm>
#include <utility>

#include "entrypoints/EntryPointBase.hpp"
#include "entrypoints/EntryPointGroupBase.hpp"
#include "project/metadata/Messages.hpp"
#include "project/metadata/MetadataFunctions.hpp"
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
using ZEPHRA::project::management::FileNotInProject;

namespace {

MetadataPath const& entryPointsHead() {
    static MetadataPath const head =
        MetadataPathBuilder().add(schema::entrypoints::entryPointsType, schema::rootLocation).build();
    return head;
}

MetadataPath entryPointPath(std::u16string const& uuid) {
    return entryPointsHead().child(metadata::PathElement(schema::entrypoints::entryPointType, uuid));
}

std::unique_ptr<EntryPointGroup>
findGroup(std::map<std::u16string, std::unique_ptr<EntryPointGroup>> const& groups,
          std::u16string const& storedUUID) {
    auto const found = groups.find(storedUUID.empty() ? schema::entrypoints::defaultGroupUUID : storedUUID);
    if (found == groups.end()) {
        // The group was deleted, or is on a branch that is not merged yet. The entry point has no group until
        // then, and the UUID stays stored.
        return nullptr;
    }
    return std::make_unique<EntryPointGroupBase>(found->second->getName(), found->second->getUUID());
}

std::map<std::u16string, std::u16string> readExtensionData(MetadataNode const& node) {
    std::map<std::u16string, std::u16string> result;
    for (auto const& child : node.getChildren()) {
        if (child->getType() == schema::entrypoints::extensionType) {
            result[child->get(schema::entrypoints::extensionNameKey)] =
                child->get(schema::entrypoints::extensionValueKey);
        }
    }
    return result;
}

void addExtensionData(MetadataNode& node, EntryPoint const& entryPoint) {
    for (auto const& key : entryPoint.getExtensionKeys()) {
        MetadataNode* const child = node.addChild(schema::entrypoints::extensionType);
        child->put(schema::entrypoints::extensionNameKey, key);
        if (auto const value = entryPoint.getExtensionData(key)) {
            child->put(schema::entrypoints::extensionValueKey, *value);
        }
    }
}

} // namespace

EntryPointManagerBase::EntryPointManagerBase(std::shared_ptr<metadata::MetadataManager> metadataManager,
                                             FileManager* fileManager, Path projectRoot)
    : metadataManager_(std::move(metadataManager)),
      fileManager_(fileManager),
      projectRoot_(std::move(projectRoot)) {
}

void EntryPointManagerBase::setEntryPoint(EntryPoint& entryPoint) {
    auto const guard = metadataManager_->acquireWriteLock();
    requireInProject(entryPoint.getFile());
    writeEntryPoint(entryPoint);
}

std::vector<std::unique_ptr<EntryPoint>> EntryPointManagerBase::getEntryPoints() {
    auto const guard = metadataManager_->acquireReadLock();
    GroupMap const groups = getGroupMap();
    std::vector<std::unique_ptr<EntryPoint>> result;
    for (auto const& path : getEntryPointNodes()) {
        if (auto entryPoint = readEntryPoint(path, groups)) {
            result.push_back(std::move(entryPoint));
        }
    }
    return result;
}

std::unique_ptr<EntryPoint> EntryPointManagerBase::getEntryPoint(Path file) {
    auto const guard = metadataManager_->acquireReadLock();
    std::u16string const uuid = findUUIDForFile(file);
    if (uuid.empty()) {
        // For any file, also for one outside the project: the caller edits the definition and stores it, and
        // only setEntryPoint requires the file to be in the project.
        return std::make_unique<EntryPointDefinition>(file);
    }
    return readEntryPoint(entryPointPath(uuid), getGroupMap());
}

void EntryPointManagerBase::removeEntryPoint(Path file) {
    auto const guard = metadataManager_->acquireWriteLock();
    requireInProject(file);
    std::u16string const stored = storedFile(file);
    std::vector<MetadataPath> found;
    for (auto const& path : getEntryPointNodes()) {
        auto const node = metadataManager_->getNode(path);
        if (node && node->get(schema::entrypoints::fileKey) == stored) {
            found.push_back(path);
        }
    }
    if (!found.empty()) {
        metadataManager_->removeNodes(found);
    }
}

void EntryPointManagerBase::requireInProject(Path const& file) const {
    if (!fileManager_->isFileInProject(file)) {
        exception::raise(FileNotInProject(file.native()));
    }
}

std::u16string EntryPointManagerBase::storedFile(Path const& file) const {
    std::u16string result = metadata::getRelativePath(projectRoot_, file);
    // Entry points are found by this text, so every system that opens the project must spell it the same. The
    // price: the entry point of a name that contains a backslash is read with another path.
    std::replace(result.begin(), result.end(), u'\\', u'/');
    return result;
}

std::vector<MetadataPath> EntryPointManagerBase::getEntryPointNodes() const {
    MetadataPath const& head = entryPointsHead();
    if (!metadataManager_->pathExists(head)) {
        return {};
    }
    return metadataManager_->getChildNodes(head);
}

std::u16string EntryPointManagerBase::findUUIDForFile(Path const& file) const {
    std::u16string const stored = storedFile(file);
    for (auto const& path : getEntryPointNodes()) {
        auto const node = metadataManager_->getNode(path);
        if (node && node->get(schema::entrypoints::fileKey) == stored) {
            return path.leaf().getLocation();
        }
    }
    return {};
}

std::u16string EntryPointManagerBase::uuidToWrite(EntryPoint const& entryPoint) const {
    // A given UUID is used without a check of other nodes: an entry point that was read and edited replaces
    // its own node, also if its file has changed since.
    if (std::u16string uuid = entryPoint.getUUID(); !uuid.empty()) {
        return uuid;
    }
    if (std::u16string uuid = findUUIDForFile(entryPoint.getFile()); !uuid.empty()) {
        return uuid;
    }
    return EntryPointDefinition(entryPoint).generateUUIDIfNotSpecified().getUUID();
}

std::unique_ptr<EntryPoint> EntryPointManagerBase::readEntryPoint(MetadataPath const& path,
                                                                  GroupMap const& groups) const {
    auto const node = metadataManager_->getNode(path);
    if (!node) {
        return nullptr;
    }
    Path file = projectRoot_ / node->get(schema::entrypoints::fileKey);
    // Checked before anything else is read, so that an unreadable entry point of a file outside the project
    // does not make the whole list fail.
    if (!fileManager_->isFileInProject(file)) {
        return nullptr;
    }
    return std::make_unique<EntryPointBase>(
        std::move(file), getFromName(node->get(schema::entrypoints::typeKey)),
        node->get(schema::entrypoints::nameKey), path.leaf().getLocation(),
        node->get(schema::entrypoints::visibleKey) != schema::entrypoints::hidden,
        findGroup(groups, node->get(schema::entrypoints::groupUUIDKey)), readExtensionData(*node));
}

void EntryPointManagerBase::writeEntryPoint(EntryPoint const& entryPoint) {
    std::u16string const uuid = uuidToWrite(entryPoint);
    auto const node = std::make_shared<MetadataNodeSpecification>(schema::nodeType);
    node->put(schema::entrypoints::fileKey, storedFile(entryPoint.getFile()));
    node->put(schema::entrypoints::nameKey, entryPoint.getName());
    node->put(schema::entrypoints::typeKey, toString(entryPoint.getType()));
    node->put(schema::entrypoints::visibleKey,
              entryPoint.isVisible() ? schema::entrypoints::visible : schema::entrypoints::hidden);
    // Without a group nothing is stored, which reads as the default group: an entry point whose group was
    // deleted moves there when it is written again.
    if (auto const group = entryPoint.getGroup()) {
        node->put(schema::entrypoints::groupUUIDKey, group->getUUID());
    }
    addExtensionData(*node, entryPoint);
    write(entryPointPath(uuid), node);
}

void EntryPointManagerBase::write(MetadataPath const& path, std::shared_ptr<MetadataNode> node) {
    std::map<MetadataPath, std::shared_ptr<MetadataNode>> batch{{path, std::move(node)}};
    metadataManager_->setNodes(batch);
}

} // namespace project::management
