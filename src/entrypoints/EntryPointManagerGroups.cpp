// The group operations of EntryPointManagerBase.

#include <algorithm>
#include <utility>

#include "entrypoints/EntryPointGroupBase.hpp"
#include "entrypoints/EntryPointManagerBase.hpp"
#include "project/metadata/Messages.hpp"
#include "project/metadata/MetadataNodeSpecification.hpp"
#include "project/metadata/MetadataPathBuilder.hpp"
#include "project/metadata/ProjectException.hpp"
#include "project/metadata/TreeSchema.hpp"

namespace project::management {

namespace schema = metadata::schema;

using metadata::MetadataNodeSpecification;
using metadata::MetadataPath;
using metadata::MetadataPathBuilder;
using ZEPHRA::project::management::EntryPointGroupNameDefined;
using ZEPHRA::project::management::EntryPointGroupUUIDDefined;

namespace {

MetadataPath groupsHead() {
    return MetadataPathBuilder().add(schema::entrypoints::groupsType, schema::rootLocation).build();
}

MetadataPath groupPath(std::u16string const& uuid) {
    return MetadataPathBuilder().add(groupsHead()).add(schema::entrypoints::groupType, uuid).build();
}

} // namespace

std::vector<std::unique_ptr<EntryPointGroup>> EntryPointManagerBase::getEntryPointGroups() {
    auto const guard = metadataManager_->acquireReadLock();
    std::vector<std::unique_ptr<EntryPointGroup>> result;
    result.push_back(getDefaultGroup());
    MetadataPath const head = groupsHead();
    if (!metadataManager_->pathExists(head)) {
        return result;
    }
    for (auto const& path : metadataManager_->getChildNodes(head)) {
        metadata::PathElement const leaf = path.getLeaf();
        if (leaf.getType() != schema::entrypoints::groupType) {
            continue;
        }
        if (auto const node = metadataManager_->getNode(path)) {
            std::u16string const& name = node->get(schema::entrypoints::groupNameKey);
            result.push_back(std::make_unique<EntryPointGroupBase>(name, leaf.getLocation()));
        }
    }
    return result;
}

void EntryPointManagerBase::deleteEntryPointGroup(EntryPointGroup const& group) {
    auto const guard = metadataManager_->acquireWriteLock();
    std::u16string const uuid = group.getUUID();
    std::vector<MetadataPath> found;
    for (auto const& path : metadataManager_->getChildNodes(groupsHead())) {
        metadata::PathElement const leaf = path.getLeaf();
        if (leaf.getType() == schema::entrypoints::groupType && leaf.getLocation() == uuid) {
            found.push_back(path);
        }
    }
    metadataManager_->removeNodes(found);
}

void EntryPointManagerBase::createEntryPointGroup(EntryPointGroup const& group) {
    auto const guard = metadataManager_->acquireWriteLock();
    checkNewGroup(group);
    EntryPointGroupDefinition stored(group);
    stored.generateUUIDIfNotSet();
    writeGroup(stored);
}

void EntryPointManagerBase::renameEntryPointGroup(EntryPointGroup const& group,
                                                  std::u16string const& newName) {
    auto const guard = metadataManager_->acquireWriteLock();
    std::u16string const uuid = group.getUUID();
    if (uuid.empty() || hasGroup(uuid, newName)) {
        return;
    }
    for (auto const& listed : getEntryPointGroups()) {
        if (listed->getName() == newName) {
            exception::raise(EntryPointGroupNameDefined(newName));
        }
    }
    // The group does not have to be stored: the default group, which has no node, gets a name of its own
    // here.
    writeGroup(EntryPointGroupBase(newName, uuid));
}

EntryPointManagerBase::GroupMap EntryPointManagerBase::getGroupMap() {
    GroupMap result;
    for (auto& group : getEntryPointGroups()) {
        // The last group with a UUID counts: after the default group was renamed it is listed twice, and
        // entry points show its new name.
        std::u16string uuid = group->getUUID();
        result.insert_or_assign(std::move(uuid), std::move(group));
    }
    return result;
}

bool EntryPointManagerBase::hasGroup(std::u16string const& uuid, std::u16string const& name) {
    auto const groups = getEntryPointGroups();
    return std::any_of(groups.begin(), groups.end(), [&](auto const& group) {
        return group->getUUID() == uuid && group->getName() == name;
    });
}

void EntryPointManagerBase::checkNewGroup(EntryPointGroup const& group) {
    std::u16string const name = group.getName();
    std::u16string const uuid = group.getUUID();
    // The default group's name is in use even if a subclass lists the groups without it.
    if (std::u16string const defaultName = getDefaultGroup()->getName(); name == defaultName) {
        exception::raise(EntryPointGroupNameDefined(defaultName));
    }
    for (auto const& listed : getEntryPointGroups()) {
        if (listed->getName() == name) {
            exception::raise(EntryPointGroupNameDefined(name));
        }
        if (listed->getUUID() == uuid) {
            exception::raise(EntryPointGroupUUIDDefined(uuid));
        }
    }
}

void EntryPointManagerBase::writeGroup(EntryPointGroup const& group) {
    auto const node = std::make_shared<MetadataNodeSpecification>(schema::nodeType);
    node->put(schema::entrypoints::groupNameKey, group.getName());
    write(groupPath(group.getUUID()), node);
}

} // namespace project::management
