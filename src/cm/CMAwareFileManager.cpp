#include "cm/CMAwareFileManager.hpp"

namespace project::management {

CMAwareFileManager::CMAwareFileManager(FileManager& inner, CMProjectFileEventHandler& handler)
    : FileManagerDecorator(inner), handler_(handler) {
}

void CMAwareFileManager::add(std::vector<Path> const& files) {
    handler_.noteAddition(files);
    FileManagerDecorator::add(files);
}

std::vector<Path> CMAwareFileManager::remove(std::vector<Path> const& files) {
    handler_.noteRemoval(files);
    return FileManagerDecorator::remove(files);
}

} // namespace project::management
