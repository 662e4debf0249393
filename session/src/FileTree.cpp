#include "FileTree.hpp"

#include <utility>
#include <vector>

#include "project/metadata/MetadataFunctions.hpp"
#include "project/metadata/TreeSchema.hpp"

namespace project::session {

namespace fileSchema = metadata::schema::files;

using metadata::MetadataPath;
using metadata::PathElement;
using stores::LoadedChild;

namespace {

/// Collects the entries of one address.
class LevelReader : public stores::ChildSink {
public:
    void add(LoadedChild const& child) override {
        if (child.type == fileSchema::markerType) {
            level_.kind = FileKind::Folder;
        } else if (child.type == fileSchema::fileType) {
            if (level_.files.empty()) {
                level_.files.reserve(usualFiles);
                level_.names.reserve(usualFiles * usualName);
            }
            level_.files.push_back(
                {level_.names.size(), child.location.size(), child.node, child.hasChildren});
            level_.names += child.location;
        }
    }

    FileLevel take() { return std::move(level_); }

private:
    static constexpr std::size_t usualFiles = 16;
    static constexpr std::size_t usualName = 16;

    FileLevel level_;
};

} // namespace

/// A folder that is being visited.
struct FileTree::Open {
    MetadataPath address;
    FileLevel level;
    std::size_t next;
    std::size_t pathLength; ///< of the folder, including the separator
};

MetadataPath FileTree::addressOf(Path const& path) const {
    auto result = MetadataPath::root().child(PathElement(fileSchema::filesType, fileSchema::fileListScope));
    std::u16string const relative = metadata::getRelativePath(root_, path);
    for (std::u16string_view rest = relative; !rest.empty(); rest = fl::filesystem::detail::move_down(rest)) {
        result = below(result, fl::filesystem::detail::extract_first_element(rest));
    }
    return result;
}

MetadataPath FileTree::below(MetadataPath const& address, std::u16string_view name) {
    return address.child(PathElement(fileSchema::fileType, std::u16string(name)));
}

FileLevel FileTree::level(MetadataPath const& address) const {
    LevelReader reader;
    store_.loadChildren(address, reader);
    return reader.take();
}

void FileTree::visit(Path const& path, FileVisitor const& visitor) const {
    auto const address = addressOf(path);
    if (path == root_) {
        visitBelow(address, level(address), {}, 0, visitor);
        return;
    }
    auto const node = store_.getNode(address);
    if (!node) {
        return; // it is not in the project
    }
    std::u16string const relative = metadata::getRelativePath(root_, path);
    auto here = level(address);
    visitor({relative, 0, here.kind, *node});
    visitBelow(address, std::move(here), relative + u'/', 1, visitor);
}

void FileTree::visitBelow(MetadataPath start, FileLevel level, std::u16string path, std::size_t depth,
                          FileVisitor const& visitor) const {
    // Not recursive: a text from another source may contain a tree of any depth.
    std::vector<Open> open;
    open.push_back({std::move(start), std::move(level), 0, path.size()});
    while (!open.empty()) {
        auto& folder = open.back();
        path.resize(folder.pathLength);
        if (folder.next == folder.level.files.size()) {
            open.pop_back();
            continue;
        }
        auto const& file = folder.level.files[folder.next++];
        if (!file.node) {
            continue;
        }
        auto const name = folder.level.nameOf(file);
        path += name;
        if (!file.hasChildren) {
            visitor({path, depth + open.size() - 1, FileKind::File, *file.node});
            continue;
        }
        auto address = below(folder.address, name);
        auto content = this->level(address);
        visitor({path, depth + open.size() - 1, content.kind, *file.node});
        path += u'/';
        open.push_back({std::move(address), std::move(content), 0, path.size()});
    }
}

} // namespace project::session
