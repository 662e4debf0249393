#include "StagingEntryPointManager.hpp"

#include <utility>

namespace project::session {

StagingEntryPointManager::StagingEntryPointManager(management::EntryPointManager& inner,
                                                   DefinitionStager& stager)
    : EntryPointManagerDecorator(inner), stager_(stager) {
}

void StagingEntryPointManager::setEntryPoint(management::EntryPoint& entryPoint) {
    stager_.after([&] { EntryPointManagerDecorator::setEntryPoint(entryPoint); });
}

void StagingEntryPointManager::removeEntryPoint(management::Path file) {
    stager_.after([&] { EntryPointManagerDecorator::removeEntryPoint(std::move(file)); });
}

void StagingEntryPointManager::deleteEntryPointGroup(management::EntryPointGroup const& group) {
    stager_.after([&] { EntryPointManagerDecorator::deleteEntryPointGroup(group); });
}

void StagingEntryPointManager::createEntryPointGroup(management::EntryPointGroup const& group) {
    stager_.after([&] { EntryPointManagerDecorator::createEntryPointGroup(group); });
}

void StagingEntryPointManager::renameEntryPointGroup(management::EntryPointGroup const& group,
                                                     std::u16string const& newName) {
    stager_.after([&] { EntryPointManagerDecorator::renameEntryPointGroup(group, newName); });
}

} // namespace project::session
