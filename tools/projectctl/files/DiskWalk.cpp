#include "files/DiskWalk.hpp"

#include <system_error>
#include <utility>

#include "files/DiskFolder.hpp"
#include "output/Kind.hpp"

namespace projectctl {

struct DiskWalk::Open {
    Path folder;
    std::vector<DiskEntry> entries;
    std::size_t next;
};

DiskWalk::DiskWalk(Path root, Progress& progress) : root_(std::move(root)), progress_(progress) {
}

void DiskWalk::enter(Path const& folder) {
    std::vector<Open> openFolders; // not recursively: folders can be nested very deeply
    open(folder, openFolders);
    while (!openFolders.empty()) {
        auto& here = openFolders.back();
        if (here.next == here.entries.size()) {
            openFolders.pop_back();
            continue;
        }
        auto const& entry = here.entries[here.next++];
        auto path = here.folder / Path(entry.name);
        if (here.folder == root_ && entry.name.starts_with(u"..")) {
            unaddable_.push_back(std::move(path));
            continue;
        }
        found_.push_back(path);
        progress_.reach(found_.size());
        if (entry.kind == Kind::Folder) {
            open(std::move(path), openFolders);
        }
    }
}

void DiskWalk::open(Path folder, std::vector<Open>& openFolders) {
    try {
        auto entries = readDiskFolder(folder);
        openFolders.push_back({std::move(folder), std::move(entries), 0});
    } catch (std::system_error const& error) {
        if (error.code() !=
            std::errc::no_such_file_or_directory) { // otherwise it was deleted since it was listed
            unreadable_.push_back({std::move(folder), error.what()});
        }
    }
}

} // namespace projectctl
