#include "checks/StatusScan.hpp"

#include <system_error>

namespace projectctl {

using project::stores::Child;

namespace {

using Listed = project::stores::Children::const_iterator;
using Found = std::vector<DiskEntry>::const_iterator;

/// Compares the next names of two sorted lists: less than 0 if the first list has the smaller one, greater
/// than 0 if the second has, 0 if they are equal.
int orderOf(Listed file, Listed lastFile, Found entry, Found lastEntry) {
    if (file == lastFile || entry == lastEntry) {
        return file == lastFile ? 1 : -1;
    }
    return file->element.getLocation().compare(entry->name);
}

} // namespace

StatusScan::StatusScan(OpenProject& project) : root_(project.root()), list_(project) {
}

void StatusScan::run(Progress& progress) {
    auto const address = list_.addressOf(root_);
    compare(root_, address, list_.level(address).files, progress);
}

void StatusScan::compare(Path const& folder, Address const& address, project::stores::Children const& listed,
                         Progress& progress) {
    std::vector<DiskEntry> onDisk;
    try {
        onDisk = readDiskFolder(folder);
    } catch (std::system_error const& error) {
        unreadable_.emplace_back(error.what());
    }
    auto file = listed.cbegin();
    auto entry = onDisk.cbegin();
    while (file != listed.end() || entry != onDisk.end()) { // both are sorted by name
        progress.reach(++seen_);
        auto const order = orderOf(file, listed.end(), entry, onDisk.end());
        if (order < 0) {
            lookFor(folder, address, *file);
        } else if (order > 0 || !file->node) {
            takeAdded(folder, *entry);
        } else if (entry->kind == Kind::Folder) {
            auto const below = address.child(file->element);
            compare(folder / Path(entry->name), below, list_.level(below).files, progress);
        } else {
            compareListed(folder / Path(entry->name), address.child(file->element));
        }
        file += order <= 0 ? 1 : 0;
        entry += order >= 0 ? 1 : 0;
    }
}

void StatusScan::compareListed(Path const& path, Address const& address) {
    for (auto const& file : list_.level(address).files) {
        lookFor(path, address, file);
    }
}

void StatusScan::lookFor(Path const& folder, Address const& address, Child const& file) {
    auto const& name = file.element.getLocation();
    auto const path = folder / Path(name);
    if (!file.node) {
        return; // it is not in the project
    }
    if (isOnDisk(folder, name)) {
        compareListed(path, address.child(file.element)); // scans leave out its kind, but a user added it
    } else {
        takeGone(path);
    }
}

void StatusScan::takeAdded(Path const& folder, DiskEntry const& entry) {
    if (folder != root_ || !entry.name.starts_with(u"..")) { // such names cannot be added
        added_.push_back({folder / Path(entry.name), entry.kind});
    }
}

void StatusScan::takeGone(Path const& path) {
    list_.visit(path, [this](FileList::File const& file) {
        gone_.push_back({root_ / Path(file.path), file.kind});
    });
}

} // namespace projectctl
