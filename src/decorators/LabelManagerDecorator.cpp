#include "project/decorators/LabelManagerDecorator.hpp"

#include <utility>

#include "project/labels/CategoryIdentifier.hpp"
#include "project/labels/LabelIdentifier.hpp"

namespace project::management {

LabelManagerDecorator::LabelManagerDecorator(LabelManager& inner) : inner_(inner) {
}

LabelManagerDecorator::~LabelManagerDecorator() = default;

void LabelManagerDecorator::createCategory(CategoryIdentifier const& category) {
    inner_.createCategory(category);
}

CategoryIdentifier LabelManagerDecorator::getCategoryByUUID(std::u16string const& uuid) {
    return inner_.getCategoryByUUID(uuid);
}

void LabelManagerDecorator::deleteCategory(CategoryIdentifier const& category) {
    inner_.deleteCategory(category);
}

void LabelManagerDecorator::renameCategory(CategoryIdentifier const& category,
                                           std::u16string const& newName) {
    inner_.renameCategory(category, newName);
}

std::vector<CategoryIdentifier> LabelManagerDecorator::getAllCategories() {
    return inner_.getAllCategories();
}

void LabelManagerDecorator::createLabel(CategoryIdentifier const& category, LabelIdentifier const& label) {
    inner_.createLabel(category, label);
}

std::vector<LabelIdentifier> LabelManagerDecorator::getLabels(CategoryIdentifier const& category) {
    return inner_.getLabels(category);
}

LabelIdentifier LabelManagerDecorator::getLabelByUUID(CategoryIdentifier const& category,
                                                      std::u16string uuid) {
    return inner_.getLabelByUUID(category, std::move(uuid));
}

void LabelManagerDecorator::deleteLabel(CategoryIdentifier const& category, LabelIdentifier const& label) {
    inner_.deleteLabel(category, label);
}

} // namespace project::management
