#include "project/decorators/FileManagerDecorator.hpp"

#include "project/files/FileLabel.hpp"
#include "project/files/FileMetadataManager.hpp"
#include "project/files/LabelIDSet.hpp"

namespace project::management {

FileManagerDecorator::FileManagerDecorator(FileManager& inner) : inner_(inner) {
}

FileManagerDecorator::~FileManagerDecorator() = default;

Path FileManagerDecorator::getProjectRoot() {
    return inner_.getProjectRoot();
}

std::unique_ptr<FileMetadataManager>
FileManagerDecorator::getFileMetadataManagerFor(std::u16string const& scope) {
    return inner_.getFileMetadataManagerFor(scope);
}

void FileManagerDecorator::add(std::vector<Path> const& files) {
    inner_.add(files);
}

bool FileManagerDecorator::isFileInProject(Path const& path) const {
    return inner_.isFileInProject(path);
}

std::vector<Path> FileManagerDecorator::remove(std::vector<Path> const& files) {
    return inner_.remove(files);
}

std::vector<Path> FileManagerDecorator::getChildProjectFiles(Path const& path) const {
    return inner_.getChildProjectFiles(path);
}

std::vector<Path> FileManagerDecorator::getProjectFiles() const {
    return inner_.getProjectFiles();
}

std::vector<FileLabel> FileManagerDecorator::addLabels(std::vector<Path> const& files,
                                                       std::vector<Label> const& labels) {
    return inner_.addLabels(files, labels);
}

void FileManagerDecorator::removeLabels(std::vector<Path> const& files, std::vector<Label> const& labels) {
    inner_.removeLabels(files, labels);
}

std::vector<LabelIDSet> FileManagerDecorator::getLabelIDSets(Path const& path) {
    return inner_.getLabelIDSets(path);
}

std::vector<FileLabel> FileManagerDecorator::getLabels(Path const& path) {
    return inner_.getLabels(path);
}

void FileManagerDecorator::removeCategory(std::vector<Path> const& files,
                                          CategoryIdentifier const& category) {
    inner_.removeCategory(files, category);
}

} // namespace project::management
