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
    auto const head = groupsHead();
    if (!metadataManager_->pathExists(head)) {
        return result;
    }
    for (auto const& path : metadataManager_->getChildNodes(head)) {
        auto const leaf = path.getLeaf();
        if (leaf.getType() != schema::entrypoints::groupType) {
            continue;
        }
        if (auto const node = metadataManager_->getNode(path)) {
            auto const& name = node->get(schema::entrypoints::groupNameKey);
            result.push_back(std::make_unique<EntryPointGroupBase>(name, leaf.getLocation()));
        }
    }
    return result;
}

void EntryPointManagerBase::deleteEntryPointGroup(EntryPointGroup const& group) {
    auto const guard = metadataManager_->acquireWriteLock();
    auto const uuid = group.getUUID();
    std::vector<MetadataPath> found;
    for (auto const& path : metadataManager_->getChildNodes(groupsHead())) {
        auto const leaf = path.getLeaf();
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
    auto const uuid = group.getUUID();
    if (uuid.empty() || hasGroup(uuid, newName)) {
        return;
    }
    for (auto const& listed : getEntryPointGroups()) {
        if (listed->getName() == newName) {
            exception::raise(EntryPointGroupNameDefined(newName));
        }
    }
    // Whether the group is stored is not asked: this is how the default group, which has no node, gets a name
    // of its own.
    writeGroup(EntryPointGroupBase(newName, uuid));
}

EntryPointManagerBase::GroupMap EntryPointManagerBase::getGroupMap() {
    GroupMap result;
    for (auto& group : getEntryPointGroups()) {
        // The later one of a UUID counts: once the default group was renamed it is listed twice, and entry
        // points show the name that it was given.
        auto uuid = group->getUUID();
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
    auto const name = group.getName();
    auto const uuid = group.getUUID();
    // Also when a subclass lists groups without it, the default group's name is taken.
    if (auto const defaultName = getDefaultGroup()->getName(); name == defaultName) {
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
