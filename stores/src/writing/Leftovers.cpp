#include "writing/Leftovers.hpp"

#include <vector>

#include "project/stores/StoreError.hpp"
#include "writing/StoreFiles.hpp"

namespace project::stores {

namespace {

void settleStranger(Disk& disk, std::string const& name, StoreFiles::Swap const& swap) {
    auto const text = disk.identify(StoreFiles::text);
    if (text && swap.isNew(*text) && disk.exchange(name, StoreFiles::text)) {
        disk.syncFolder();
        disk.remove(name); // the dead writer's own text, of a batch that it never called kept
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
        // Nothing that a writer of ours has made; or the old text, as a power cut left it after the new one
        // was durable, or as an editor wrote into it. The new one may hold batches that were kept, so it
        // stays.
        setAside(disk, name);
    } else {
        settleStranger(disk, name, *swap);
    }
}

} // namespace

void removeLeftovers(Disk& disk) {
    auto names = disk.list();
    std::erase_if(names, [](auto const& name) { return !StoreFiles::isTemporary(name); });
    if (names.empty()) {
        return;
    }
    // First, as long as they tell of it: batches are going to be appended to what has the text's name now.
    disk.syncFolder();
    for (auto const& name : names) {
        try {
            removeLeftover(disk, name);
        } catch (StoreError const&) {
            // The next writer tries again; nothing that is left stands in the way of this one.
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
