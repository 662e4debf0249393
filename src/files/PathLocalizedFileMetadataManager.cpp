#include "files/PathLocalizedFileMetadataManager.hpp"

#include <atomic>
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

    /// The address of a file. @param names its path relative to the root.
    MetadataPath withNames(std::u16string_view names) {
        if (isInUse_.exchange(true, std::memory_order_acquire)) {
            return append(head_, names); // by another thread
        }
        Using const mark(isInUse_);
        auto const depth = takeSharedNames(names);
        auto near = address_;
        while (near.depth() > depth) {
            near = near.parent();
        }
        address_ = append(std::move(near), names);
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

    /// Removes the first names that are also those of the address. @return their depth.
    std::size_t takeSharedNames(std::u16string_view& names) {
        address_.listSteps(steps_);
        auto depth = head_.depth();
        while (depth < steps_.size() && !names.empty() &&
               steps_[depth]->getLocation() == fl::filesystem::detail::extract_first_element(names)) {
            names = fl::filesystem::detail::move_down(names);
            ++depth;
        }
        return depth;
    }

    static MetadataPath append(MetadataPath address, std::u16string_view names) {
        for (; !names.empty(); names = fl::filesystem::detail::move_down(names)) {
            auto const name = fl::filesystem::detail::extract_first_element(names);
            address = address.child(PathElement(schema::files::fileType, std::u16string(name)));
        }
        return address;
    }

    MetadataPath const head_;
    std::atomic<bool> isInUse_ = false;
    MetadataPath address_;                  ///< the last one
    std::vector<PathElement const*> steps_; ///< of it
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
    std::u16string const relative = file == root_ ? u"" : metadata::getRelativePath(root_, file);
    return lastAddress_->withNames(relative);
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
