#include "files/PathLocalizedFileMetadataManager.hpp"

#include <algorithm>
#include <atomic>
#include <cstddef>
#include <string_view>
#include <utility>
#include <vector>

#include "fl/filesystem/CommonLength.hpp"
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

/// The path of a name in a folder.
Path pathBelow(Path const& folder, std::u16string const& name) {
    std::u16string text;
    text.reserve(folder.native().size() + 1 + name.size());
    text = folder.native();
    return fl::filesystem::detail::concatenate_pathname(std::move(text), name);
}

} // namespace

FileMetadataManager::~FileMetadataManager() = default;

class PathLocalizedFileMetadataManager::LastAddress {
public:
    explicit LastAddress(MetadataPath head) : head_(std::move(head)), address_(head_) {}

    /// The address of a file. @param path its path relative to the root, with single separators.
    MetadataPath withNames(std::u16string_view path) {
        if (isInUse_.exchange(true, std::memory_order_acquire)) {
            return LastAddress(head_).withNames(path); // it is in use by another thread
        }
        Using const mark(isInUse_);
        keepSharedNames(path);
        auto const shared = ends_.size();
        path_.clear(); // shares no name with the next path, should this throw
        splitFurtherNames(path);
        address_.replaceSteps(headDepth + shared, schema::files::fileType, further_);
        path_ = path;
        return address_;
    }

private:
    /// Ends the use of the address.
    class Using {
    public:
        explicit Using(std::atomic<bool>& mark) : mark_(mark) {}

        ~Using() { mark_.store(false, std::memory_order_release); }

        Using(Using const&) = delete;
        Using& operator=(Using const&) = delete;

    private:
        std::atomic<bool>& mark_;
    };

    /// Drops the ends of the last path's names from the first one on that the new path does not have.
    void keepSharedNames(std::u16string_view path) {
        auto const same = fl::filesystem::commonLength(path_, path);
        auto const isShared = [&](std::size_t end) {
            return end < same || (end == same && (end == path.size() || path[end] == u'/'));
        };
        while (!ends_.empty() && !isShared(ends_.back())) {
            ends_.pop_back();
        }
    }

    /// Lists the names behind the shared ones, and adds their ends.
    void splitFurtherNames(std::u16string_view path) {
        further_.clear();
        for (std::size_t begin = ends_.empty() ? 0 : ends_.back() + 1; begin < path.size();) {
            std::size_t const end = std::min(path.find(u'/', begin), path.size());
            further_.push_back(path.substr(begin, end - begin));
            ends_.push_back(end);
            begin = end + 1;
        }
    }

    MetadataPath const head_;
    std::atomic<bool> isInUse_ = false;
    MetadataPath address_;          ///< the last one
    std::u16string path_;           ///< the path with this address
    std::vector<std::size_t> ends_; ///< of its names

    // Of the last call, and a member only because it keeps its memory.
    std::vector<std::u16string_view> further_;
};

PathLocalizedFileMetadataManager::PathLocalizedFileMetadataManager(
    Path root, std::shared_ptr<metadata::MetadataManager> metadataManager, std::u16string scope)
    : root_(std::move(root)),
      metadataManager_(std::move(metadataManager)),
      scope_(std::move(scope)),
      lastAddress_(std::make_unique<LastAddress>(
          MetadataPath::root().child(PathElement(schema::files::filesType, scope_)))) {
}

PathLocalizedFileMetadataManager::~PathLocalizedFileMetadataManager() = default;

void PathLocalizedFileMetadataManager::setFileNodes(std::map<Path, std::shared_ptr<MetadataNode>> files) {
    auto const guard = metadataManager_->acquireWriteLock();
    std::map<MetadataPath, std::shared_ptr<MetadataNode>> batch;
    while (!files.empty()) { // each is released at once: there may be millions
        auto file = files.extract(files.begin());
        addFileNode(file.key(), std::move(file.mapped()), batch);
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
    return isFile(file);
}

bool PathLocalizedFileMetadataManager::isFile(Path const& path) {
    auto const guard = metadataManager_->acquireReadLock();
    return isFileMetadataPath(toMetadataPath(path));
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
    return childFiles(file);
}

std::vector<Path> PathLocalizedFileMetadataManager::childFiles(Path const& file) {
    auto const guard = metadataManager_->acquireReadLock();
    std::vector<Path> result;
    auto const address = toMetadataPath(file);
    auto const children = metadataManager_->getChildNodes(address);
    if (children.empty()) {
        return result;
    }
    Path const folder = toFilePath(address);
    result.reserve(children.size());
    for (auto const& child : children) {
        if (isFileMetadataPath(child)) {
            result.push_back(pathBelow(folder, child.leaf().getLocation()));
        }
    }
    return result;
}

MetadataPath PathLocalizedFileMetadataManager::toMetadataPath(Path const& file) const {
    if (file == root_) {
        return lastAddress_->withNames({});
    }
    auto const below = metadata::textBelow(root_, file);
    return lastAddress_->withNames(below ? *below : metadata::getRelativePath(root_, file));
}

Path PathLocalizedFileMetadataManager::toFilePath(MetadataPath const& path) const {
    std::vector<PathElement const*> steps;
    path.listSteps(steps);
    std::size_t length = root_.native().size();
    for (std::size_t index = headDepth; index < steps.size(); ++index) {
        length += steps[index]->getLocation().size() + 1;
    }
    std::u16string text;
    text.reserve(length);
    text = root_.native();
    for (std::size_t index = headDepth; index < steps.size(); ++index) {
        text = fl::filesystem::detail::concatenate_pathname(std::move(text), steps[index]->getLocation());
    }
    return text;
}

bool PathLocalizedFileMetadataManager::isFileMetadataPath(MetadataPath const& path) {
    auto const guard = metadataManager_->acquireReadLock();
    if (!metadataManager_->hasNode(path)) {
        return false;
    }
    std::u16string const& type = path.leaf().getType();
    return type == schema::files::fileType || type == schema::files::filesType;
}

void PathLocalizedFileMetadataManager::addFileNode(
    Path const& file, std::shared_ptr<MetadataNode> node,
    std::map<MetadataPath, std::shared_ptr<MetadataNode>>& batch) {
    auto const guard = metadataManager_->acquireWriteLock();
    // The files are in Path order, which is the order of their addresses, so the end is the best hint.
    MetadataPath const path = toMetadataPath(file);
    batch.insert_or_assign(batch.end(), path, std::move(node));
    if (metadata::is_directory(file)) {
        MetadataPath marker =
            path.child(PathElement(schema::files::markerType, schema::files::markerLocation));
        batch.insert_or_assign(batch.end(), std::move(marker),
                               std::make_shared<MetadataNodeSpecification>(schema::nodeType));
    }
}

} // namespace project::management
