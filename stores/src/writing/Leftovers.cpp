#include "writing/Leftovers.hpp"

#include <vector>

#include "project/stores/StoreError.hpp"
#include "writing/StoreFiles.hpp"

namespace project::stores {

namespace {

void restoreOrSetAside(Disk& disk, std::string const& name, StoreFiles::Swap const& swap) {
    auto const text = disk.identify(StoreFiles::text);
    if (text && swap.isNew(*text) && disk.exchange(name, StoreFiles::text)) {
        disk.syncFolder();
        disk.remove(name); // the dead writer's text, whose batch it did not commit
    } else {
        setAside(disk, name);
    }
}

void removeLeftover(Disk& disk, std::string const& name) {
    auto const file = disk.identify(name);
    if (!file) {
        return;
    }
    auto const swap = StoreFiles::parseSwapping(name);
    bool const isOurs = swap ? swap->isOld(*file) || swap->isNew(*file) : file->isRegular;
    if (isOurs) {
        disk.remove(name);
    } else if (!swap || swap->isOldFile(*file)) {
        // Not a file of the store; or the old text, changed by an editor, or by a power failure after the new
        // text was durable. The new text may contain committed batches, so it stays.
        setAside(disk, name);
    } else {
        restoreOrSetAside(disk, name, *swap);
    }
}

} // namespace

void removeLeftovers(Disk& disk) {
    auto names = disk.list();
    std::erase_if(names, [](auto const& name) { return !StoreFiles::isTemporary(name); });
    if (names.empty()) {
        return;
    }
    // First, while these files show that it is necessary: batches will be appended to the file that has the
    // text's name now.
    disk.syncFolder();
    for (auto const& name : names) {
        try {
            removeLeftover(disk, name);
        } catch (StoreError const&) {
            // The next writer tries again; no leftover hinders this one.
        }
    }
}

std::string setAside(Disk& disk, std::string const& name) {
    for (;;) {
        auto aside = StoreFiles::newDisplaced();
        if (disk.renameToFree(name, aside)) {
            return aside;
        }
    }
}

} // namespace project::stores
