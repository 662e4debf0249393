#include "StagingFileManager.hpp"

#include "project/files/FileLabel.hpp"

namespace project::session {

StagingFileManager::StagingFileManager(management::FileManager& inner, DefinitionStager& stager)
    : FileManagerDecorator(inner), stager_(stager) {
}

void StagingFileManager::add(std::vector<management::Path> const& files) {
    stager_.after([&] {
        FileManagerDecorator::add(files);
        stager_.stageReturned(files);
    });
}

std::vector<management::Path> StagingFileManager::remove(std::vector<management::Path> const& files) {
    return stager_.after([&] { return FileManagerDecorator::remove(files); });
}

std::vector<management::FileLabel>
StagingFileManager::addLabels(std::vector<management::Path> const& files,
                              std::vector<management::Label> const& labels) {
    return stager_.after([&] { return FileManagerDecorator::addLabels(files, labels); });
}

void StagingFileManager::removeLabels(std::vector<management::Path> const& files,
                                      std::vector<management::Label> const& labels) {
    stager_.after([&] { FileManagerDecorator::removeLabels(files, labels); });
}

void StagingFileManager::removeCategory(std::vector<management::Path> const& files,
                                        management::CategoryIdentifier const& category) {
    stager_.after([&] { FileManagerDecorator::removeCategory(files, category); });
}

} // namespace project::session
