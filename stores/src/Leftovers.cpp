#include "Leftovers.hpp"

#include <optional>

#include "StoreFiles.hpp"
#include "project/stores/StoreError.hpp"

namespace project::stores {

namespace {

/// What has a temporary file's name, if it is a regular file. @return nothing when it was set aside.
std::optional<FileIdentity> identifyOrSetAside(Disk& disk, std::string const& name) {
    try {
        return disk.identify(name);
    } catch (StoreError const&) {
        setAside(disk, name);
        return std::nullopt;
    }
}

void settleStranger(Disk& disk, std::string const& name, StoreFiles::Swap const& swap) {
    auto const text = disk.identify(StoreFiles::text);
    if (text && swap.isNew(*text) && disk.exchange(name, StoreFiles::text)) {
        disk.remove(name); // the dead writer's own text, of a batch that it never called kept
        disk.syncFolder();
    } else {
        setAside(disk, name);
    }
}

void removeLeftover(Disk& disk, std::string const& name) {
    auto const file = identifyOrSetAside(disk, name);
    if (!file) {
        return;
    }
    auto const swap = StoreFiles::parseSwapping(name);
    if (!swap || swap->isOld(*file) || swap->isNew(*file)) {
        disk.remove(name);
    } else {
        settleStranger(disk, name, *swap);
    }
}

} // namespace

void removeLeftovers(Disk& disk) {
    try {
        for (auto const& name : disk.list()) {
            if (StoreFiles::isTemporary(name)) {
                removeLeftover(disk, name);
            }
        }
    } catch (StoreError const&) {
        // The next writer tries again; nothing that is left stands in the way of this one.
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
