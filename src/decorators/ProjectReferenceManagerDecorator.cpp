#include "project/decorators/ProjectReferenceManagerDecorator.hpp"

namespace project::management {

ProjectReferenceManagerDecorator::ProjectReferenceManagerDecorator(ProjectReferenceManager& inner)
    : inner_(inner) {
}

ProjectReferenceManagerDecorator::~ProjectReferenceManagerDecorator() = default;

FolderReferenceManager& ProjectReferenceManagerDecorator::getFolderReferenceManager() {
    return inner_.getFolderReferenceManager();
}

} // namespace project::management
