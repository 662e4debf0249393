#include "NewSharedProject.hpp"

#include <filesystem>
#include <system_error>

#include "fl/i18n/Utf8.hpp"
#include "project/stores/SharedLocation.hpp"
#include "project/stores/SystemDisk.hpp"
#include "project/stores/TextBackend.hpp"

namespace project::session {

using stores::SharedLocation;

NewSharedProject::NewSharedProject(Path const& root, std::u16string const& name, SharedStore const& shared)
    : server_(stores::connectTo(shared.kind, shared.service)),
      id_(stores::newSharedProjectId()),
      folder_(fl::filesystem::canonical(root, Path()) / stores::TextBackend::folderName) {
    auto const disk =
        stores::makeSystemDisk(fl::filesystem::canonical(root, Path()), stores::TextBackend::folderName);
    files_ = stores::createSharedLocation(*disk, {shared.kind, shared.service, id_}).added;
    try {
        server_->create({id_, fl::i18n::toUtf8(name), 0, shared.reader, shared.writer, true});
    } catch (...) {
        removeFiles();
        throw;
    }
}

NewSharedProject::~NewSharedProject() {
    if (isKept_) {
        return;
    }
    removeFiles();
    try {
        server_->remove(id_);
    } catch (...) { // an empty project stays on the server; the caller gets the error that led here
    }
}

/// Files that cannot be deleted stay. The folder stays if it contains something else.
void NewSharedProject::removeFiles() const noexcept {
    try {
        std::error_code ignored;
        auto const folder = fl::filesystem::toSystem(folder_);
        std::filesystem::remove_all(folder / SharedLocation::cacheName, ignored);
        for (auto const& file : files_) {
            std::filesystem::remove(fl::filesystem::toSystem(file), ignored);
        }
        std::filesystem::remove(folder, ignored);
    } catch (...) { // without memory
    }
}

} // namespace project::session
