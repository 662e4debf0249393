#include "references/FolderReferenceManagerBase.hpp"

#include <algorithm>
#include <iterator>
#include <map>
#include <utility>

#include "project/metadata/MetadataFunctions.hpp"
#include "project/metadata/MetadataNodeSpecification.hpp"
#include "project/metadata/MetadataPathBuilder.hpp"
#include "project/metadata/TreeSchema.hpp"

namespace project::management {

namespace schema = metadata::schema;

using metadata::MetadataNode;
using metadata::MetadataNodeSpecification;
using metadata::MetadataPath;
using metadata::MetadataPathBuilder;

namespace {

std::vector<Path> sortedLocations(std::vector<FolderReference> const& folders) {
    std::vector<Path> result;
    result.reserve(folders.size());
    for (auto const& reference : folders) {
        result.push_back(reference.getLocation());
    }
    std::sort(result.begin(), result.end());
    return result;
}

std::shared_ptr<MetadataNode> makeNode(FolderReference const& reference) {
    auto const node = std::make_shared<MetadataNodeSpecification>(schema::nodeType);
    node->put(schema::references::storedPathKey, reference.getStoredPath());
    node->put(schema::references::typeKey, reference.getType());
    return node;
}

} // namespace

FolderReferenceManagerBase::FolderReferenceManagerBase(
    std::unique_ptr<FolderReferenceCustomization> customization,
    std::shared_ptr<metadata::MetadataManager> metadataManager, Path projectRoot)
    : customization_(std::move(customization)),
      metadataManager_(std::move(metadataManager)),
      projectRoot_(std::move(projectRoot)) {
}

std::vector<FolderReference> FolderReferenceManagerBase::getReferences() const {
    auto const guard = metadataManager_->acquireReadLock();
    MetadataPath const head = customization_->getRootPath();
    if (!metadataManager_->pathExists(head)) {
        return {};
    }
    std::vector<FolderReference> result;
    for (auto const& path : metadataManager_->getChildNodes(head)) {
        if (path.getLeaf().getType() != schema::references::referenceType) {
            continue;
        }
        if (auto reference = readReference(path)) {
            result.push_back(std::move(*reference));
        }
    }
    return result;
}

void FolderReferenceManagerBase::addReferences(std::vector<FolderReference> const& newReferences) {
    auto const guard = metadataManager_->acquireWriteLock();
    checkDuplicates(newReferences);
    std::vector<MetadataPath> head{customization_->getRootPath()};
    metadataManager_->createPaths(head);
    std::map<MetadataPath, std::shared_ptr<MetadataNode>> batch;
    for (auto const& reference : newReferences) {
        customization_->validateReference(reference);
        batch.insert_or_assign(getReferencePath(reference), makeNode(reference));
    }
    metadataManager_->setNodes(batch);
}

void FolderReferenceManagerBase::removeReferences(std::vector<FolderReference> const& oldReferences) {
    auto const guard = metadataManager_->acquireWriteLock();
    std::vector<MetadataPath> stored;
    for (auto const& reference : oldReferences) {
        MetadataPath path = getReferencePath(reference);
        if (metadataManager_->pathExists(path)) {
            stored.push_back(std::move(path));
        }
    }
    metadataManager_->removeNodes(stored);
}

bool FolderReferenceManagerBase::isReference(Path const& path) const {
    auto const guard = metadataManager_->acquireReadLock();
    std::vector<FolderReference> const all = getReferences();
    return std::any_of(all.begin(), all.end(),
                       [&](FolderReference const& reference) { return reference.getLocation() == path; });
}

std::optional<FolderReference> FolderReferenceManagerBase::getRootReferenceFor(Path const& path) const {
    auto const guard = metadataManager_->acquireReadLock();
    // The first reference and not the nearest: all folders below two nested references have the same root
    // reference.
    for (auto const& reference : getReferences()) {
        Path const& location = reference.getLocation();
        if (metadata::isParent(path, location) || location == path) {
            return reference;
        }
    }
    return std::nullopt;
}

MetadataPath FolderReferenceManagerBase::getReferencePath(FolderReference const& reference) const {
    return MetadataPathBuilder()
        .add(customization_->getRootPath())
        .add(schema::references::referenceType, reference.getUUID())
        .build();
}

std::optional<FolderReference> FolderReferenceManagerBase::readReference(MetadataPath const& path) const {
    auto const node = metadataManager_->getNode(path);
    if (!node) {
        return std::nullopt;
    }
    std::u16string const& type = node->get(schema::references::typeKey);
    for (auto const& reader : customization_->getReaders()) {
        if (reader->canRead(type)) {
            return reader->read(node->get(schema::references::storedPathKey), path.getLeaf().getLocation());
        }
    }
    return std::nullopt;
}

void FolderReferenceManagerBase::checkDuplicates(std::vector<FolderReference> const& newReferences) const {
    std::vector<Path> const existing = sortedLocations(getReferences());
    std::vector<Path> const added = sortedLocations(newReferences);
    // Only stored references count: two new references to one folder are both stored, each under its own
    // UUID.
    std::vector<Path> duplicates;
    std::set_intersection(existing.begin(), existing.end(), added.begin(), added.end(),
                          std::back_inserter(duplicates));
    if (!duplicates.empty()) {
        customization_->throwDuplicate(duplicates.front());
    }
}

} // namespace project::management
