#include "project/decorators/ProjectManagerDecorator.hpp"

#include <utility>

namespace project::management {

ProjectManagerDecorator::ProjectManagerDecorator(std::unique_ptr<ProjectManager> inner)
    : inner_(std::move(inner)) {
}

ProjectManagerDecorator::~ProjectManagerDecorator() = default;

EntryPointManager& ProjectManagerDecorator::getEntryPointManager() {
    return inner_->getEntryPointManager();
}

FileManager& ProjectManagerDecorator::getFileManager() {
    return inner_->getFileManager();
}

LabelManager& ProjectManagerDecorator::getLabelManager() {
    return inner_->getLabelManager();
}

ProjectReferenceManager& ProjectManagerDecorator::getProjectReferenceManager() {
    return inner_->getProjectReferenceManager();
}

ProjectPathManager& ProjectManagerDecorator::getProjectPathManager() {
    return inner_->getProjectPathManager();
}

void ProjectManagerDecorator::setName(std::u16string const& name) {
    inner_->setName(name);
}

std::u16string ProjectManagerDecorator::getName() const {
    return inner_->getName();
}

std::u16string ProjectManagerDecorator::getDescription() const {
    return inner_->getDescription();
}

void ProjectManagerDecorator::setDescription(std::u16string const& description) {
    inner_->setDescription(description);
}

void ProjectManagerDecorator::subscribe(std::weak_ptr<metadata::FileChangeRequestListener> listener) {
    inner_->subscribe(std::move(listener));
}

void ProjectManagerDecorator::create(std::u16string const& name) {
    inner_->create(name);
}

} // namespace project::management
