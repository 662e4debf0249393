#include "StatusScan.hpp"

#include <system_error>
#include <utility>

#include "DiskFolder.hpp"

namespace projectctl {

StatusScan::StatusScan(OpenProject& project, Progress& progress)
    : root_(project.root()), list_(project), progress_(progress) {
}

void StatusScan::run() {
    auto const address = list_.addressOf(root_);
    compare(root_, address, list_.level(address).files);
}

void StatusScan::compare(Path const& folder, Address const& address,
                         std::vector<FileList::File> const& listed) {
    std::vector<DiskEntry> onDisk;
    try {
        onDisk = readDiskFolder(folder);
    } catch (std::system_error const& error) {
        unreadable_.emplace_back(error.what());
    }
    auto file = listed.begin();
    auto entry = onDisk.begin();
    while (file != listed.end() || entry != onDisk.end()) { // both are sorted by name
        progress_.reach(++seen_);
        if (entry == onDisk.end() || (file != listed.end() && file->name < entry->name)) {
            if (file->isInProject) {
                lookFor(folder / Path(file->name), FileList::below(address, file->name));
            }
            ++file;
            continue;
        }
        bool const sameName = file != listed.end() && file->name == entry->name;
        if (sameName && file->isInProject) {
            if (entry->kind == Kind::Folder) {
                auto const below = FileList::below(address, file->name);
                compare(folder / Path(entry->name), below, list_.level(below).files);
            } else if (file->hasBelow) {
                compareListed(folder / Path(entry->name), FileList::below(address, file->name));
            }
        } else if (folder != root_ || !entry->name.starts_with(u"..")) { // those cannot be added
            added_.push_back({folder / Path(entry->name), entry->kind});
        }
        file += sameName ? 1 : 0;
        ++entry;
    }
}

void StatusScan::compareListed(Path const& path, Address const& address) {
    for (auto const& file : list_.level(address).files) {
        if (file.isInProject) {
            lookFor(path / Path(file.name), FileList::below(address, file.name));
        }
    }
}

void StatusScan::lookFor(Path const& path, Address const& address) {
    if (isOnDisk(path)) {
        compareListed(path, address); // it is of a kind that is left out on disk, but somebody added it
    } else {
        takeGone(path);
    }
}

void StatusScan::takeGone(Path const& path) {
    list_.visit(path, [this](std::u16string const& relative, std::size_t, Kind kind) {
        gone_.push_back({root_ / Path(relative), kind});
    });
}

} // namespace projectctl
