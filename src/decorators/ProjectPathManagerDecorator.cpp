#include "project/decorators/ProjectPathManagerDecorator.hpp"

namespace project::management {

ProjectPathManagerDecorator::ProjectPathManagerDecorator(ProjectPathManager& inner) : inner_(inner) {
}

ProjectPathManagerDecorator::~ProjectPathManagerDecorator() = default;

FolderReferenceManager& ProjectPathManagerDecorator::getFolderReferenceManager() {
    return inner_.getFolderReferenceManager();
}

} // namespace project::management
