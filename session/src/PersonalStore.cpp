#include "PersonalStore.hpp"

#include <algorithm>
#include <iterator>
#include <map>
#include <utility>

#include "FileTree.hpp"
#include "project/core/FileManager.hpp"
#include "project/files/FileMetadataManager.hpp"
#include "project/metadata/MetadataFunctions.hpp"
#include "project/metadata/MetadataNodeSpecification.hpp"
#include "project/metadata/TreeSchema.hpp"
#include "project/stores/PersonalText.hpp"
#include "project/stores/SystemDisk.hpp"

namespace project::session {

namespace schema = metadata::schema;

using management::ProjectManagerBase;
using metadata::MetadataNode;
using metadata::MetadataPath;
using stores::PersonalText;
using stores::TextBackend;

namespace {

/// The folder that contains a file. @param file absolute.
Path folderOf(Path const& file) {
    auto const& text = file.native();
    return text.substr(0, std::max<std::size_t>(text.rfind(u'/'), 1));
}

} // namespace

/// Lets source control ignore the personal text when its files are created, in older projects too. If that
/// fails, they are not created.
class PersonalStore::FolderIgnorer : public metadata::FileChangeRequestListener {
public:
    explicit FolderIgnorer(Path root) : root_(std::move(root)) {}

    void fileRemovalRequested(metadata::MetadataManager& /*store*/, Path const& /*metadataRoot*/,
                              std::vector<Path> const& /*files*/) override {}

    void fileAdditionRequested(metadata::MetadataManager& /*store*/,
                               std::vector<Path> const& files) override {
        if (!files.empty()) {
            stores::ignorePersonalText(*stores::makeSystemDisk(root_, TextBackend::folderName));
        }
    }

    bool acceptsFileChangeRequests() override { return true; }

private:
    Path const root_;
};

PersonalStore::PersonalStore(Path root)
    : root_(std::move(root)),
      tree_(std::make_shared<stores::TreeMetadataManager>(makeBackend(), PersonalText::folder(root_))),
      ignorer_(std::make_shared<FolderIgnorer>(root_)),
      steps_(*tree_),
      base_(root_, tree_),
      managers_(std::make_unique<ProjectManagerBase>(root_, tree_), steps_.raised().input()) {
    tree_->subscribe(ignorer_);
}

std::unique_ptr<stores::Backend> PersonalStore::makeBackend() {
    auto backend = PersonalText::open(root_);
    text_ = backend.get();
    return backend;
}

std::vector<Path> PersonalStore::files() {
    return base_.getFileManager().getProjectFiles();
}

bool PersonalStore::contains(Path const& file) {
    return base_.getFileManager().isFileInProject(file);
}

std::vector<Path> PersonalStore::containedIn(std::vector<Path> const& files) {
    auto const guard = tree_->acquireReadLock();
    std::vector<Path> result;
    std::ranges::copy_if(files, std::back_inserter(result),
                         [this](Path const& file) { return file != root_ && contains(file); });
    return result;
}

std::vector<Path> PersonalStore::labelledFiles() {
    auto const guard = tree_->acquireReadLock();
    FileTree const tree(*tree_, root_);
    auto result = files();
    std::erase_if(result, [&](Path const& file) {
        auto const address = tree.addressOf(file);
        bool const hasData =
            tree_->hasNode(address.child({schema::files::labelDataType, schema::files::labelDataLocation}));
        return !hasData && tree_->getNode(address)->getChildren().empty();
    });
    return result;
}

void PersonalStore::add(std::vector<Path> const& files) {
    std::map<Path, std::shared_ptr<MetadataNode>> missing;
    for (auto file : files) {
        for (; file != root_ && !missing.contains(file) && !contains(file); file = folderOf(file)) {
            missing.emplace(file, std::make_shared<metadata::MetadataNodeSpecification>(schema::nodeType));
        }
    }
    base_.getFileManager().getFileMetadataManagerFor(schema::files::fileListScope)->setFileNodes(missing);
}

void PersonalStore::remove(std::vector<Path> const& files) {
    auto const contained = containedIn(files);
    if (contained.empty()) {
        return;
    }
    base_.getFileManager().remove(contained);
    std::vector<Path> folders;
    folders.reserve(contained.size());
    for (auto const& file : contained) {
        folders.push_back(folderOf(file));
    }
    removeUnlabelled(folders);
}

bool PersonalStore::concerns(stores::PathMoves const& moves) {
    return std::ranges::any_of(moves.entries(),
                               [this](auto const& entry) { return contains(root_ / Path(entry.first)); });
}

void PersonalStore::move(stores::PathMoves const& moves) {
    std::map<MetadataPath, std::shared_ptr<MetadataNode>> before;
    for (auto const& head : tree_->getChildNodes(MetadataPath::root())) {
        if (head.leaf().getType() == schema::files::filesType) {
            loadBelow(head, before);
        }
    }
    std::map<MetadataPath, std::shared_ptr<MetadataNode>> after;
    std::vector<MetadataPath> removed;
    std::vector<Path> foldersBefore;
    std::vector<Path> foldersAfter;
    for (auto const& [from, node] : before) {
        if (auto const to = moves.moved(from)) {
            after.insert_or_assign(*to, node);
            removed.insert(removed.end(), {from, *to});
            foldersBefore.push_back(folderOf(pathOf(from)));
            foldersAfter.push_back(folderOf(pathOf(*to)));
        }
    }
    tree_->removeNodes(removed);
    tree_->setNodes(after);
    add(foldersAfter);
    removeUnlabelled(foldersBefore);
}

/// Collects the nodes below an address.
void PersonalStore::loadBelow(MetadataPath const& head,
                              std::map<MetadataPath, std::shared_ptr<MetadataNode>>& nodes) {
    std::vector<MetadataPath> waiting{head};
    while (!waiting.empty()) {
        auto const address = std::move(waiting.back());
        waiting.pop_back();
        if (auto node = tree_->getNode(address)) {
            nodes.emplace(address, std::move(node));
        }
        auto below = tree_->getChildNodes(address);
        std::ranges::move(below, std::back_inserter(waiting));
    }
}

/// The file of an address, or of one that belongs to it.
Path PersonalStore::pathOf(MetadataPath const& address) const {
    Path result = root_;
    for (std::size_t step = 1; step < address.depth(); ++step) {
        if (address[step].getType() == schema::files::fileType) {
            result = result / Path(address[step].getLocation());
        }
    }
    return result;
}

void PersonalStore::removeUnlabelled(std::vector<Path> const& files) {
    FileTree const tree(*tree_, root_);
    for (auto const& start : files) {
        for (auto file = start; file != root_; file = folderOf(file)) {
            auto const address = tree.addressOf(file);
            if (isNeeded(address)) {
                break;
            }
            std::vector<MetadataPath> addresses{address};
            tree_->removeNodes(addresses);
        }
    }
}

/// True if the address has labels or data, or anything but the marker of a folder is below it.
bool PersonalStore::isNeeded(MetadataPath const& address) {
    auto const node = tree_->getNode(address);
    return (node && !node->getChildren().empty()) ||
           std::ranges::any_of(tree_->getChildNodes(address), [](MetadataPath const& below) {
               return below.leaf().getType() != schema::files::markerType;
           });
}

} // namespace project::session
