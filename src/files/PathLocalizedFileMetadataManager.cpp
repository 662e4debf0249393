#include "files/PathLocalizedFileMetadataManager.hpp"

#include <algorithm>
#include <atomic>
#include <iterator>
#include <span>
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

class PathLocalizedFileMetadataManager::LastAddress {
public:
    explicit LastAddress(MetadataPath head) : head_(std::move(head)), address_(head_) {}

    /// The address of a file. @param path its path relative to the root, with single separators.
    MetadataPath withNames(std::u16string_view path) {
        if (isInUse_.exchange(true, std::memory_order_acquire)) {
            return LastAddress(head_).withNames(path); // it is in use by another thread
        }
        Using const mark(isInUse_);
        splitNames(path);
        auto const shared = countSharedNames();
        address_.replaceSteps(headDepth + shared, schema::files::fileType, std::span(names_).subspan(shared));
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

    void splitNames(std::u16string_view path) {
        names_.clear();
        while (!path.empty()) {
            auto const name = path.substr(0, path.find(u'/'));
            names_.push_back(name);
            path.remove_prefix(std::min(name.size() + 1, path.size()));
        }
    }

    /// The number of first names that are also those of the last address.
    std::size_t countSharedNames() {
        address_.listSteps(steps_);
        auto const& names = names_;
        auto const isShared = [](PathElement const* step, std::u16string_view name) {
            return step->getLocation() == name;
        };
        auto const different = std::mismatch(std::next(steps_.begin(), headDepth), steps_.end(),
                                             names.begin(), names.end(), isShared);
        return static_cast<std::size_t>(different.second - names.begin());
    }

    MetadataPath const head_;
    std::atomic<bool> isInUse_ = false;
    MetadataPath address_; ///< the last one

    // Of the last call, and members only because they keep their memory.
    std::vector<std::u16string_view> names_;
    std::vector<PathElement const*> steps_;
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
    if (file == root_) {
        return lastAddress_->withNames({});
    }
    auto const below = metadata::textBelow(root_, file);
    return lastAddress_->withNames(below ? *below : metadata::getRelativePath(root_, file));
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
