#include "NewSharedProject.hpp"

#include <filesystem>
#include <system_error>

#include "fl/i18n/Utf8.hpp"
#include "project/stores/SharedLocation.hpp"
#include "project/stores/SystemDisk.hpp"
#include "project/stores/TextBackend.hpp"

namespace project::session {

NewSharedProject::NewSharedProject(Path const& root, std::u16string const& name, SharedStore const& shared)
    : server_(stores::connectTo(shared.kind, shared.service)), id_(stores::newSharedProjectId()) {
    auto const folder =
        stores::makeSystemDisk(fl::filesystem::canonical(root, Path()), stores::TextBackend::folderName);
    files_ = stores::createSharedLocation(*folder, {shared.kind, shared.service, id_}).added;
    try {
        server_->create({id_, fl::i18n::toUtf8(name), 0, shared.reader, shared.writer, true});
    } catch (...) {
        remove();
        throw;
    }
}

NewSharedProject::~NewSharedProject() {
    if (!isKept_) {
        remove();
    }
}

/// What cannot be deleted stays: an empty project on the server, or a file that leads to it.
void NewSharedProject::remove() const noexcept {
    try {
        std::error_code ignored;
        for (auto const& file : files_) {
            std::filesystem::remove(fl::filesystem::toSystem(file), ignored);
        }
        server_->remove(id_);
    } catch (...) { // the error that the caller gets is the one that led here
    }
}

} // namespace project::session
