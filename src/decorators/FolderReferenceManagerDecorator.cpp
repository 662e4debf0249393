#include "project/decorators/FolderReferenceManagerDecorator.hpp"

#include "project/references/FolderReference.hpp"

namespace project::management {

FolderReferenceManagerDecorator::FolderReferenceManagerDecorator(FolderReferenceManager& inner)
    : inner_(inner) {
}

FolderReferenceManagerDecorator::~FolderReferenceManagerDecorator() = default;

std::vector<FolderReference> FolderReferenceManagerDecorator::getReferences() const {
    return inner_.getReferences();
}

void FolderReferenceManagerDecorator::addReferences(std::vector<FolderReference> const& references) {
    inner_.addReferences(references);
}

void FolderReferenceManagerDecorator::removeReferences(std::vector<FolderReference> const& references) {
    inner_.removeReferences(references);
}

bool FolderReferenceManagerDecorator::isReference(Path const& path) const {
    return inner_.isReference(path);
}

std::optional<FolderReference> FolderReferenceManagerDecorator::getRootReferenceFor(Path const& path) const {
    return inner_.getRootReferenceFor(path);
}

} // namespace project::management
