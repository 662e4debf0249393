#include "project/FileList.hpp"

#include <string_view>
#include <utility>
#include <vector>

#include "project/metadata/MetadataFunctions.hpp"
#include "project/metadata/TreeSchema.hpp"

namespace projectctl {

namespace treeSchema = project::metadata::schema;

using project::metadata::MetadataPath;
using project::metadata::PathElement;
using project::stores::LoadedChild;

namespace {

/// Collects the entries of one address.
class LevelReader : public project::stores::ChildSink {
public:
    void add(LoadedChild const& child) override {
        if (child.type == treeSchema::files::markerType) {
            level_.kind = Kind::Folder;
        } else if (child.type == treeSchema::files::fileType) {
            if (level_.files.empty()) {
                level_.files.reserve(usualFiles);
                level_.names.reserve(usualFiles * usualName);
            }
            level_.files.push_back(
                {level_.names.size(), child.location.size(), child.node, child.hasChildren});
            level_.names += child.location;
        }
    }

    FileList::Level take() { return std::move(level_); }

private:
    static constexpr std::size_t usualFiles = 16;
    static constexpr std::size_t usualName = 16;

    FileList::Level level_;
};

} // namespace

/// A folder that is being visited.
struct FileList::Open {
    MetadataPath address;
    Level level;
    std::size_t next;
    std::size_t pathLength; ///< of the folder, including the separator
};

FileList::FileList(OpenProject& project) : project_(project), guard_(project.store().acquireReadLock()) {
}

MetadataPath FileList::addressOf(Path const& path) const {
    auto result = MetadataPath::root().child(
        PathElement(treeSchema::files::filesType, treeSchema::files::fileListScope));
    std::u16string const relative = project::metadata::getRelativePath(project_.root(), path);
    for (std::u16string_view rest = relative; !rest.empty(); rest = fl::filesystem::detail::move_down(rest)) {
        auto const name = fl::filesystem::detail::extract_first_element(rest);
        result = below(result, name);
    }
    return result;
}

MetadataPath FileList::below(MetadataPath const& address, std::u16string_view name) {
    return address.child(PathElement(treeSchema::files::fileType, std::u16string(name)));
}

FileList::Level FileList::level(MetadataPath const& address) const {
    LevelReader reader;
    project_.loadChildren(address, reader);
    return reader.take();
}

void FileList::visit(Path const& path, Visitor const& visitor) const {
    auto const address = addressOf(path);
    auto here = level(address);
    if (path == project_.root()) {
        visitBelow(address, std::move(here), {}, 0, visitor);
        return;
    }
    auto const node = project_.store().getNode(address);
    if (!node) {
        return; // it is not in the project
    }
    std::u16string const relative = project::metadata::getRelativePath(project_.root(), path);
    visitor({relative, 0, here.kind, *node});
    visitBelow(address, std::move(here), relative + u'/', 1, visitor);
}

void FileList::visitBelow(MetadataPath start, Level level, std::u16string path, std::size_t depth,
                          Visitor const& visitor) const {
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
            visitor({path, depth + open.size() - 1, Kind::File, *file.node});
            continue;
        }
        auto address = below(folder.address, name);
        auto content = this->level(address);
        visitor({path, depth + open.size() - 1, content.kind, *file.node});
        path += u'/';
        open.push_back({std::move(address), std::move(content), 0, path.size()});
    }
}

} // namespace projectctl
