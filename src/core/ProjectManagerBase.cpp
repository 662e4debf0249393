#include "project/core/ProjectManagerBase.hpp"

#include <utility>

#include "entrypoints/EntryPointManagerBase.hpp"
#include "files/FileManagerBase.hpp"
#include "labels/LabelManagerBase.hpp"
#include "project/metadata/MetadataNodeSpecification.hpp"
#include "project/metadata/MetadataPathBuilder.hpp"
#include "project/metadata/TreeSchema.hpp"
#include "references/ReferenceLists.hpp"

namespace project::management {

namespace schema = metadata::schema;

using metadata::MetadataNodeSpecification;
using metadata::MetadataPath;
using metadata::MetadataPathBuilder;

std::u16string const ProjectManagerBase::NAME_FIELD = schema::information::nameKey;
std::u16string const ProjectManagerBase::DESCRIPTION_FIELD = schema::information::descriptionKey;
std::u16string const ProjectManagerBase::ROOT_METADATA = schema::information::nameLocation;
std::u16string const ProjectManagerBase::ROOT_EXTENSTION = schema::information::extensionsLocation;
std::u16string const ProjectManagerBase::TYPE_EXTENSTION = schema::information::descriptionType;
std::u16string const ProjectManagerBase::INFORMATION = schema::information::descriptionLocation;

ProjectManagerBase::ProjectManagerBase(Path projectRoot,
                                       std::shared_ptr<metadata::MetadataManager> metadataManager)
    : metadataManager_(std::move(metadataManager)),
      projectRoot_(std::move(projectRoot)),
      fileManager_(std::make_unique<FileManagerBase>(projectRoot_, metadataManager_)),
      labelManager_(std::make_unique<LabelManagerBase>(metadataManager_, fileManager_.get())),
      entryPointManager_(
          std::make_unique<EntryPointManagerBase>(metadataManager_, fileManager_.get(), projectRoot_)),
      projectReferenceManager_(std::make_unique<ProjectReferenceManagerBase>(metadataManager_, projectRoot_)),
      projectPathManager_(std::make_unique<ProjectPathManagerBase>(metadataManager_, projectRoot_)) {
    auto& files = dynamic_cast<FileManagerBase&>(*fileManager_);
    files.setEntryPointManager(entryPointManager_.get());
    files.setLabelManager(labelManager_.get());
}

ProjectManagerBase::~ProjectManagerBase() = default;

EntryPointManager& ProjectManagerBase::getEntryPointManager() {
    return *entryPointManager_;
}

FileManager& ProjectManagerBase::getFileManager() {
    return *fileManager_;
}

LabelManager& ProjectManagerBase::getLabelManager() {
    return *labelManager_;
}

ProjectReferenceManager& ProjectManagerBase::getProjectReferenceManager() {
    return *projectReferenceManager_;
}

ProjectPathManager& ProjectManagerBase::getProjectPathManager() {
    return *projectPathManager_;
}

void ProjectManagerBase::setName(std::u16string const& name) {
    write(getRootNodePath(), NAME_FIELD, name);
}

std::u16string ProjectManagerBase::getName() const {
    return read(getRootNodePath(), NAME_FIELD);
}

std::u16string ProjectManagerBase::getDescription() const {
    return read(getDescriptionNodePath(), DESCRIPTION_FIELD);
}

void ProjectManagerBase::setDescription(std::u16string const& description) {
    write(getDescriptionNodePath(), DESCRIPTION_FIELD, description);
}

void ProjectManagerBase::subscribe(std::weak_ptr<metadata::FileChangeRequestListener> listener) {
    metadataManager_->subscribe(std::move(listener));
}

void ProjectManagerBase::create(std::u16string const& name) {
    setName(name);
}

MetadataPath ProjectManagerBase::getRootNodePath() {
    return MetadataPathBuilder().add(schema::information::nameType, ROOT_METADATA).build();
}

MetadataPath ProjectManagerBase::getDescriptionNodePath() {
    return MetadataPathBuilder()
        .add(schema::information::extensionsType, ROOT_EXTENSTION)
        .add(TYPE_EXTENSTION, INFORMATION)
        .build();
}

std::u16string ProjectManagerBase::read(MetadataPath const& path, std::u16string const& key) const {
    auto const guard = metadataManager_->acquireReadLock();
    if (!metadataManager_->hasNode(path)) {
        return {};
    }
    auto const node = metadataManager_->getNode(path);
    return node ? node->get(key) : std::u16string();
}

void ProjectManagerBase::write(MetadataPath const& path, std::u16string const& key,
                               std::u16string const& value) {
    auto const guard = metadataManager_->acquireWriteLock();
    auto const node = std::make_shared<MetadataNodeSpecification>();
    node->put(key, value);
    std::map<MetadataPath, std::shared_ptr<metadata::MetadataNode>> batch{{path, node}};
    metadataManager_->setNodes(batch);
}

} // namespace project::management
