#include "files/DiskFolder.hpp"

#include <system_error>

#include "output/NameForms.hpp"
#include "texts/Message.hpp"

namespace projectctl {

namespace {

std::system_error translated(project::session::UnreadableFolder const& unreadable) {
    return {unreadable.problem, Message("FolderUnreadable", shown(unreadable.folder)).text()};
}

} // namespace

std::string problemOf(project::session::UnreadableFolder const& unreadable) {
    return translated(unreadable).what();
}

std::vector<DiskEntry> readDiskFolder(Path const& folder) {
    try {
        return project::session::readDiskFolder(folder);
    } catch (std::system_error const& error) {
        throw translated({folder, error.code()});
    }
}

} // namespace projectctl
