#include "DiskComparison.hpp"

#include <cstddef>
#include <string>
#include <system_error>

namespace project::session {

namespace {

/// Compares the next names of two sorted lists, of which one may be at its end: less than 0 if the list of
/// the project has the smaller one, greater than 0 if the disk has, 0 if they are equal.
int orderOf(FileLevel const& listed, std::size_t file, std::vector<DiskEntry> const& onDisk,
            std::size_t entry) {
    if (file == listed.files.size() || entry == onDisk.size()) {
        return file == listed.files.size() ? 1 : -1;
    }
    return listed.nameOf(listed.files[file]).compare(onDisk[entry].name);
}

} // namespace

void DiskComparison::run(Path const& folder, DiskProgress const& progress) {
    auto const address = list_.addressOf(folder);
    compare(folder, address, list_.level(address), progress);
}

void DiskComparison::compare(Path const& folder, Address const& address, FileLevel const& listed,
                             DiskProgress const& progress) {
    std::vector<DiskEntry> onDisk;
    try {
        onDisk = readDiskFolder(folder);
    } catch (std::system_error const& error) {
        found_.unreadable.push_back({folder, error.code()});
    }
    std::size_t nextFile = 0;
    std::size_t nextEntry = 0;
    while (nextFile < listed.files.size() || nextEntry < onDisk.size()) { // both are sorted by name
        ++seen_;
        if (progress) {
            progress(seen_);
        }
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

void DiskComparison::compareBoth(Path const& folder, Address const& address, Entry const& file,
                                 DiskEntry const& entry, DiskProgress const& progress) {
    if (entry.kind == FileKind::Folder) {
        auto const below = FileTree::below(address, entry.name);
        compare(folder / Path(entry.name), below, list_.level(below), progress);
    } else if (file.hasChildren) {
        compareListed(folder / Path(entry.name), FileTree::below(address, entry.name));
    }
}

void DiskComparison::compareListed(Path const& path, Address const& address) {
    auto const listed = list_.level(address);
    for (auto const& file : listed.files) {
        lookFor(path, address, listed, file);
    }
}

void DiskComparison::lookFor(Path const& folder, Address const& address, FileLevel const& listed,
                             Entry const& file) {
    if (!file.node) {
        return; // it is not in the project
    }
    std::u16string const name(listed.nameOf(file));
    auto const path = folder / Path(name);
    if (isOnDisk(folder, name)) {
        compareListed(path, FileTree::below(address, name)); // scans leave out its kind, but a user added it
    } else {
        takeGone(path);
    }
}

void DiskComparison::takeAdded(Path const& folder, DiskEntry const& entry) {
    if (folder != root_ || !entry.name.starts_with(u"..")) { // such names cannot be added
        found_.added.push_back({folder / Path(entry.name), entry.kind});
    }
}

void DiskComparison::takeGone(Path const& folder) {
    list_.visit(folder, [this](VisitedFile const& file) {
        found_.gone.push_back({root_ / Path(file.path), file.kind});
    });
}

} // namespace project::session
