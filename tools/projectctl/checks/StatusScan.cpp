#include "checks/StatusScan.hpp"

#include <cstddef>
#include <string>
#include <system_error>

namespace projectctl {

namespace {

/// Compares the next names of two sorted lists, of which one may be at its end: less than 0 if the list of
/// the project has the smaller one, greater than 0 if the disk has, 0 if they are equal.
int orderOf(FileList::Level const& listed, std::size_t file, std::vector<DiskEntry> const& onDisk,
            std::size_t entry) {
    if (file == listed.files.size() || entry == onDisk.size()) {
        return file == listed.files.size() ? 1 : -1;
    }
    return listed.nameOf(listed.files[file]).compare(onDisk[entry].name);
}

} // namespace

StatusScan::StatusScan(OpenProject& project) : root_(project.root()), list_(project) {
}

void StatusScan::run(Progress& progress) {
    auto const address = list_.addressOf(root_);
    compare(root_, address, list_.level(address), progress);
}

void StatusScan::compare(Path const& folder, Address const& address, FileList::Level const& listed,
                         Progress& progress) {
    std::vector<DiskEntry> onDisk;
    try {
        onDisk = readDiskFolder(folder);
    } catch (std::system_error const& error) {
        unreadable_.emplace_back(error.what());
    }
    std::size_t nextFile = 0;
    std::size_t nextEntry = 0;
    while (nextFile < listed.files.size() || nextEntry < onDisk.size()) { // both are sorted by name
        progress.reach(++seen_);
        auto const order = orderOf(listed, nextFile, onDisk, nextEntry);
        if (order < 0) {
            lookFor(folder, address, listed, listed.files[nextFile]);
        } else if (order > 0 || !listed.files[nextFile].node) {
            takeAdded(folder, onDisk[nextEntry]);
        } else {
            compareBoth(folder, address, listed.files[nextFile], onDisk[nextEntry], progress);
        }
        nextFile += order <= 0 ? 1 : 0;
        nextEntry += order >= 0 ? 1 : 0;
    }
}

void StatusScan::compareBoth(Path const& folder, Address const& address, FileList::Entry const& file,
                             DiskEntry const& entry, Progress& progress) {
    if (entry.kind == Kind::Folder) {
        auto const below = FileList::below(address, entry.name);
        compare(folder / Path(entry.name), below, list_.level(below), progress);
    } else if (file.hasChildren) {
        compareListed(folder / Path(entry.name), FileList::below(address, entry.name));
    }
}

void StatusScan::compareListed(Path const& path, Address const& address) {
    auto const listed = list_.level(address);
    for (auto const& file : listed.files) {
        lookFor(path, address, listed, file);
    }
}

void StatusScan::lookFor(Path const& folder, Address const& address, FileList::Level const& listed,
                         FileList::Entry const& file) {
    if (!file.node) {
        return; // it is not in the project
    }
    std::u16string const name(listed.nameOf(file));
    auto const path = folder / Path(name);
    if (isOnDisk(folder, name)) {
        compareListed(path, FileList::below(address, name)); // scans leave out its kind, but a user added it
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
