#include "journal/CompleteFile.hpp"

#include "fl/filesystem/SystemName.hpp"
#include "project/stores/StoreError.hpp"

namespace project::stores {

bool createComplete(Disk& disk, std::string const& temporary, std::string const& name,
                    std::string_view content) {
    disk.remove(temporary);
    disk.create(temporary, content, std::nullopt);
    bool isCreated = false;
    try {
        disk.sync();
        isCreated = disk.renameToFree(temporary, name);
    } catch (StoreError const&) {
        disk.remove(temporary);
        throw;
    }
    if (!isCreated) {
        disk.remove(temporary);
    }
    return isCreated;
}

fl::filesystem::Path pathIn(Disk const& disk, std::string const& name) {
    return fl::filesystem::fromSystem(disk.folder()) / fl::filesystem::fromSystem(name);
}

} // namespace project::stores
