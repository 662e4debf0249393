#include "StagingLabelManager.hpp"

namespace project::session {

StagingLabelManager::StagingLabelManager(management::LabelManager& inner, DefinitionStager& stager)
    : LabelManagerDecorator(inner), stager_(stager) {
}

void StagingLabelManager::createCategory(management::CategoryIdentifier const& category) {
    stager_.after([&] { LabelManagerDecorator::createCategory(category); });
}

void StagingLabelManager::deleteCategory(management::CategoryIdentifier const& category) {
    stager_.after([&] { LabelManagerDecorator::deleteCategory(category); });
}

void StagingLabelManager::renameCategory(management::CategoryIdentifier const& category,
                                         std::u16string const& newName) {
    stager_.after([&] { LabelManagerDecorator::renameCategory(category, newName); });
}

void StagingLabelManager::createLabel(management::CategoryIdentifier const& category,
                                      management::LabelIdentifier const& label) {
    stager_.after([&] { LabelManagerDecorator::createLabel(category, label); });
}

void StagingLabelManager::deleteLabel(management::CategoryIdentifier const& category,
                                      management::LabelIdentifier const& label) {
    stager_.after([&] { LabelManagerDecorator::deleteLabel(category, label); });
}

} // namespace project::session
