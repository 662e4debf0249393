#include "files/FileManagerBase.hpp"

#include <algorithm>
#include <set>
#include <utility>

#include "files/PathSets.hpp"
#include "project/entrypoints/EntryPoint.hpp"
#include "project/metadata/Messages.hpp"
#include "project/metadata/MetadataFunctions.hpp"
#include "project/metadata/MetadataNodeSpecification.hpp"
#include "project/metadata/ProjectException.hpp"
#include "project/metadata/TreeSchema.hpp"

namespace project::management {

namespace schema = metadata::schema;

using metadata::MetadataNodeSpecification;
using metadata::MetadataPath;
using ZEPHRA::project::management::FileDoesNotExistError;
using ZEPHRA::project::management::FileIsMetadataError;
using ZEPHRA::project::management::FileNotInProject;
using ZEPHRA::project::management::FileNotInProjectRoot;
using ZEPHRA::project::management::RootFolderNotRemoveable;

FileManagerBase::FileManagerBase(Path projectRoot, std::shared_ptr<metadata::MetadataManager> metadataManager)
    : projectRoot_(std::move(projectRoot)),
      metadataManager_(std::move(metadataManager)),
      fileStore_(std::make_unique<PathLocalizedFileMetadataManager>(projectRoot_, metadataManager_,
                                                                    schema::files::fileListScope)) {
}

FileManagerBase::~FileManagerBase() = default;

void FileManagerBase::setEntryPointManager(EntryPointManager* entryPointManager) {
    entryPointManager_ = entryPointManager;
}

void FileManagerBase::setLabelManager(LabelManager* labelManager) {
    labelManager_ = labelManager;
}

Path FileManagerBase::getProjectRoot() {
    return projectRoot_;
}

std::unique_ptr<FileMetadataManager> FileManagerBase::getFileMetadataManagerFor(std::u16string const& scope) {
    return std::make_unique<PathLocalizedFileMetadataManager>(projectRoot_, metadataManager_, scope);
}

void FileManagerBase::add(std::vector<Path> const& files) {
    auto const guard = metadataManager_->acquireWriteLock();
    FileNodes batch;
    for (auto& path : withParentFolders(files, projectRoot_)) {
        requireAddable(path);
        // A new empty node also for a file that is in the project already: adding it again drops its labels,
        // and those of the folders above it. Callers rely on a file that was just added having no labels.
        batch.emplace_hint(batch.end(), std::move(path),
                           std::make_shared<MetadataNodeSpecification>(schema::nodeType));
    }
    fileStore_->setFileNodes(std::move(batch));
}

void FileManagerBase::requireAddable(Path const& path) const {
    if (isFileInProject(path)) {
        return; // also if it does not exist on disk any more
    }
    if (isMetadataFile(path)) {
        exception::raise(FileIsMetadataError(path.native()));
    }
    if (!isWithinFolder(projectRoot_, path)) {
        exception::raise(FileNotInProjectRoot(path.native(), projectRoot_.native()));
    }
    if (!metadata::exists(path)) {
        exception::raise(FileDoesNotExistError(path.native()));
    }
}

bool FileManagerBase::isMetadataFile(Path const& path) const {
    return isWithinFolder(metadataManager_->getMetadataRoot(), path);
}

bool FileManagerBase::isFileInProject(Path const& path) const {
    auto const guard = metadataManager_->acquireReadLock();
    return path == projectRoot_ || fileStore_->isFile(path);
}

std::vector<Path> FileManagerBase::remove(std::vector<Path> const& files) {
    auto const guard = metadataManager_->acquireWriteLock();
    std::vector<Path> result = withAllDescendants(files);
    requireRemovable(result);
    removeEntryPointsOf(result);
    removeFromEveryScope(files);
    return result;
}

void FileManagerBase::requireRemovable(std::vector<Path> const& files) const {
    for (auto const& path : files) {
        if (!isFileInProject(path)) {
            exception::raise(FileNotInProject(path.native()));
        }
        if (path == projectRoot_) {
            exception::raise(RootFolderNotRemoveable(path.native()));
        }
    }
}

void FileManagerBase::removeEntryPointsOf(std::vector<Path> const& files) {
    std::set<Path> entryPointFiles; // of these files: most of the project's are elsewhere
    for (auto const& entryPoint : entryPointManager_->getEntryPoints()) {
        Path file = entryPoint->getFile();
        if (std::binary_search(files.begin(), files.end(), file)) {
            entryPointFiles.insert(std::move(file));
        }
    }
    for (auto const& path : files) {
        if (entryPointFiles.contains(path)) {
            entryPointManager_->removeEntryPoint(path);
        }
    }
}

void FileManagerBase::removeFromEveryScope(std::vector<Path> const& files) {
    for (auto const& head : metadataManager_->getChildNodes(MetadataPath::root())) {
        metadata::PathElement const leaf = head.getLeaf();
        if (leaf.getType() == schema::files::filesType) {
            getFileMetadataManagerFor(leaf.getLocation())->removeFileNodes(files);
        }
    }
}

std::vector<Path> FileManagerBase::getChildProjectFiles(Path const& path) const {
    auto const guard = metadataManager_->acquireReadLock();
    return fileStore_->childFiles(path);
}

std::vector<Path> FileManagerBase::withAllDescendants(std::vector<Path> const& files) const {
    return withDescendants(files, [this](Path const& path) { return getChildProjectFiles(path); });
}

std::vector<Path> FileManagerBase::getProjectFiles() const {
    if (!isFileInProject(projectRoot_)) {
        return {};
    }
    std::vector<Path> result = withAllDescendants({projectRoot_});
    std::erase(result, projectRoot_);
    return result;
}

} // namespace project::management
