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

MetadataPath entryPointsHead() {
    return MetadataPathBuilder().add(schema::entrypoints::entryPointsType, schema::rootLocation).build();
}

MetadataPath entryPointPath(std::u16string const& uuid) {
    return MetadataPathBuilder()
        .add(entryPointsHead())
        .add(schema::entrypoints::entryPointType, uuid)
        .build();
}

std::unique_ptr<EntryPointGroup>
findGroup(std::map<std::u16string, std::unique_ptr<EntryPointGroup>> const& groups,
          std::u16string const& storedUUID) {
    auto const found = groups.find(storedUUID.empty() ? schema::entrypoints::defaultGroupUUID : storedUUID);
    if (found == groups.end()) {
        // The group was deleted, or comes with another branch that is yet to be merged. The entry point goes
        // without until then; its stored UUID stays.
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
        auto* const child = node.addChild(schema::entrypoints::extensionType);
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
    auto const groups = getGroupMap();
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
    auto const uuid = findUUIDForFile(file);
    if (uuid.empty()) {
        // For any file, also for one outside the project: the caller edits what it gets and sets it, and only
        // setting it requires the file to be in the project.
        return std::make_unique<EntryPointDefinition>(file);
    }
    return readEntryPoint(entryPointPath(uuid), getGroupMap());
}

void EntryPointManagerBase::removeEntryPoint(Path file) {
    auto const guard = metadataManager_->acquireWriteLock();
    requireInProject(file);
    auto const storedFile = getStoredFile(file);
    std::vector<MetadataPath> found;
    for (auto const& path : getEntryPointNodes()) {
        auto const node = metadataManager_->getNode(path);
        if (node && node->get(schema::entrypoints::fileKey) == storedFile) {
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

std::u16string EntryPointManagerBase::getStoredFile(Path const& file) const {
    auto result = metadata::getRelativePath(projectRoot_, file);
    // One spelling on every system that opens the project, since entry points are found by this text. A name
    // that holds a backslash itself pays for it: its entry point leads elsewhere when it is read.
    std::replace(result.begin(), result.end(), u'\\', u'/');
    return result;
}

std::vector<MetadataPath> EntryPointManagerBase::getEntryPointNodes() const {
    auto const head = entryPointsHead();
    if (!metadataManager_->pathExists(head)) {
        return {};
    }
    return metadataManager_->getChildNodes(head);
}

std::u16string EntryPointManagerBase::findUUIDForFile(Path const& file) const {
    auto const storedFile = getStoredFile(file);
    for (auto const& path : getEntryPointNodes()) {
        auto const node = metadataManager_->getNode(path);
        if (node && node->get(schema::entrypoints::fileKey) == storedFile) {
            return path.getLeaf().getLocation();
        }
    }
    return {};
}

std::u16string EntryPointManagerBase::getUUIDToWrite(EntryPoint const& entryPoint) const {
    // A UUID that is given is taken without a look at other nodes: an entry point that was read and edited
    // goes back to its own node, also when it stands on another file by now.
    if (auto uuid = entryPoint.getUUID(); !uuid.empty()) {
        return uuid;
    }
    if (auto uuid = findUUIDForFile(entryPoint.getFile()); !uuid.empty()) {
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
    auto file = projectRoot_ / node->get(schema::entrypoints::fileKey);
    // Asked before anything else is read, so that a damaged entry of a file that has left the project does
    // not spoil the whole list.
    if (!fileManager_->isFileInProject(file)) {
        return nullptr;
    }
    return std::make_unique<EntryPointBase>(
        std::move(file), getFromName(node->get(schema::entrypoints::typeKey)),
        node->get(schema::entrypoints::nameKey), path.getLeaf().getLocation(),
        node->get(schema::entrypoints::visibleKey) != schema::entrypoints::hidden,
        findGroup(groups, node->get(schema::entrypoints::groupUUIDKey)), readExtensionData(*node));
}

void EntryPointManagerBase::writeEntryPoint(EntryPoint const& entryPoint) {
    auto const uuid = getUUIDToWrite(entryPoint);
    auto const node = std::make_shared<MetadataNodeSpecification>(schema::nodeType);
    node->put(schema::entrypoints::fileKey, getStoredFile(entryPoint.getFile()));
    node->put(schema::entrypoints::nameKey, entryPoint.getName());
    node->put(schema::entrypoints::typeKey, toString(entryPoint.getType()));
    node->put(schema::entrypoints::visibleKey,
              entryPoint.isVisible() ? schema::entrypoints::visible : schema::entrypoints::hidden);
    // Without a group nothing is stored, which reads as the default group: writing back an entry point whose
    // group was deleted brings it there.
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
