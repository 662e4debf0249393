#include "files/PathLocalizedFileMetadataManager.hpp"

#include <utility>

#include "project/metadata/Messages.hpp"
#include "project/metadata/MetadataFunctions.hpp"
#include "project/metadata/MetadataNodeSpecification.hpp"
#include "project/metadata/ProjectException.hpp"
#include "project/metadata/TreeSchema.hpp"

namespace project::management {

namespace schema = metadata::schema;

using metadata::MetadataNode;
using metadata::MetadataNodeSpecification;
using metadata::MetadataPath;
using metadata::PathElement;
using ZEPHRA::project::management::FileNotInProject;

namespace {

/// The number of steps of the address of the root folder.
constexpr std::size_t headDepth = 1;

} // namespace

FileMetadataManager::~FileMetadataManager() = default;

PathLocalizedFileMetadataManager::PathLocalizedFileMetadataManager(
    Path root, std::shared_ptr<metadata::MetadataManager> metadataManager, std::u16string scope)
    : root_(std::move(root)), metadataManager_(std::move(metadataManager)), scope_(std::move(scope)) {
}

void PathLocalizedFileMetadataManager::setFileNodes(std::map<Path, std::shared_ptr<MetadataNode>> files) {
    auto const guard = metadataManager_->acquireWriteLock();
    std::map<MetadataPath, std::shared_ptr<MetadataNode>> batch;
    for (auto& [file, node] : files) {
        addFileNode(file, std::move(node), batch);
    }
    metadataManager_->setNodes(batch);
}

std::map<Path, std::unique_ptr<MetadataNode>> PathLocalizedFileMetadataManager::getAllFileNodes() {
    auto const guard = metadataManager_->acquireReadLock();
    std::map<Path, std::unique_ptr<MetadataNode>> result;
    MetadataPath const head = toMetadataPath(root_);
    if (!metadataManager_->pathExists(head)) {
        return result;
    }
    std::vector<MetadataPath> waiting{head};
    while (!waiting.empty()) {
        MetadataPath const path = std::move(waiting.back());
        waiting.pop_back();
        for (auto& child : metadataManager_->getChildNodes(path)) {
            waiting.push_back(std::move(child));
        }
        if (isFileMetadataPath(path)) {
            result.insert_or_assign(toFilePath(path), metadataManager_->getNode(path));
        }
    }
    return result;
}

std::unique_ptr<MetadataNode> PathLocalizedFileMetadataManager::getFileNode(Path file) {
    auto const guard = metadataManager_->acquireReadLock();
    MetadataPath const path = toMetadataPath(file);
    if (!metadataManager_->hasNode(path)) {
        exception::raise(FileNotInProject(file.native()));
    }
    return metadataManager_->getNode(path);
}

bool PathLocalizedFileMetadataManager::hasFileNode(Path file) {
    auto const guard = metadataManager_->acquireReadLock();
    return isFileMetadataPath(toMetadataPath(file));
}

void PathLocalizedFileMetadataManager::removeFileNodes(std::vector<Path> files) {
    auto const guard = metadataManager_->acquireWriteLock();
    std::vector<MetadataPath> paths;
    paths.reserve(files.size());
    for (auto const& file : files) {
        paths.push_back(toMetadataPath(file));
    }
    metadataManager_->removeNodes(paths);
}

std::vector<Path> PathLocalizedFileMetadataManager::getExtraEntries() {
    return {};
}

std::vector<Path> PathLocalizedFileMetadataManager::getChildFiles(Path file) {
    auto const guard = metadataManager_->acquireReadLock();
    std::vector<Path> result;
    auto const children = metadataManager_->getChildNodes(toMetadataPath(file));
    result.reserve(children.size());
    for (auto const& child : children) {
        if (isFileMetadataPath(child)) {
            result.push_back(toFilePath(child));
        }
    }
    return result;
}

MetadataPath PathLocalizedFileMetadataManager::toMetadataPath(Path const& file) const {
    MetadataPath result = MetadataPath::root().child(PathElement(schema::files::filesType, scope_));
    if (file == root_) {
        return result;
    }
    std::u16string const relative = metadata::getRelativePath(root_, file);
    for (std::u16string_view rest = relative; !rest.empty(); rest = fl::filesystem::detail::move_down(rest)) {
        std::u16string_view const element = fl::filesystem::detail::extract_first_element(rest);
        result = result.child(PathElement(schema::files::fileType, std::u16string(element)));
    }
    return result;
}

Path PathLocalizedFileMetadataManager::toFilePath(MetadataPath const& path) const {
    std::size_t length = root_.native().size();
    for (std::size_t index = headDepth; index < path.depth(); ++index) {
        length += path[index].getLocation().size() + 1;
    }
    std::u16string text;
    text.reserve(length);
    text = root_.native();
    for (std::size_t index = headDepth; index < path.depth(); ++index) {
        text = fl::filesystem::detail::concatenate_pathname(std::move(text), path[index].getLocation());
    }
    return text;
}

bool PathLocalizedFileMetadataManager::isFileMetadataPath(MetadataPath const& path) {
    auto const guard = metadataManager_->acquireReadLock();
    if (!metadataManager_->hasNode(path)) {
        return false;
    }
    std::u16string const& type = path.leaf().getType();
    return type == schema::files::filesType || type == schema::files::fileType;
}

void PathLocalizedFileMetadataManager::addFileNode(
    Path const& file, std::shared_ptr<MetadataNode> node,
    std::map<MetadataPath, std::shared_ptr<MetadataNode>>& batch) {
    auto const guard = metadataManager_->acquireWriteLock();
    MetadataPath const path = toMetadataPath(file);
    // The files are in Path order, which is the order of their addresses, so the end is the best hint.
    batch.insert_or_assign(batch.end(), path, std::move(node));
    if (metadata::is_directory(file)) {
        MetadataPath marker =
            path.child(PathElement(schema::files::markerType, schema::files::markerLocation));
        batch.insert_or_assign(batch.end(), std::move(marker),
                               std::make_shared<MetadataNodeSpecification>(schema::nodeType));
    }
}

} // namespace project::management
