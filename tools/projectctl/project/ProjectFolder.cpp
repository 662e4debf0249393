#include "project/ProjectFolder.hpp"

#include <cerrno>
#include <filesystem>
#include <memory>
#include <optional>
#include <system_error>
#include <utility>

#include <sys/stat.h>

#include "fl/filesystem/SystemName.hpp"
#include "output/Failure.hpp"
#include "output/NameForms.hpp"
#include "project/metadata/MetadataFunctions.hpp"
#include "project/stores/SharedLocation.hpp"
#include "project/stores/StoreError.hpp"
#include "project/stores/SystemDisk.hpp"
#include "project/stores/TextBackend.hpp"
#include "project/stores/TreeMetadataManager.hpp"

namespace projectctl {

using fl::filesystem::SystemName;
using project::stores::SharedLocation;
using project::stores::StoreError;
using project::stores::TextBackend;
using project::stores::TreeMetadataManager;

namespace {

/// The kind of the entry at a path; links are not followed.
/// @return empty when there is none, or it cannot be read; errno contains the reason.
std::optional<mode_t> kindOf(Path const& path) {
    SystemName const name(path);

    struct stat status {};

    errno = ENAMETOOLONG;
    if (name.get() == nullptr || lstat(name.get(), &status) != 0) {
        return std::nullopt;
    }
    return status.st_mode & S_IFMT;
}

bool isEmptyFolder(Path const& folder) {
    std::error_code error;
    return std::filesystem::is_empty(fl::filesystem::toSystem(folder), error) && !error;
}

} // namespace

ProjectTrace findProjectIn(Path const& folder) {
    auto const store = folder / TextBackend::folderName;
    auto const kind = kindOf(store);
    if (kind == S_IFLNK) {
        return ProjectTrace::Text; // the store refuses it, with the reason
    }
    if (kind != S_IFDIR) {
        return ProjectTrace::None;
    }
    for (auto const* file : {TextBackend::textName, SharedLocation::fileName}) {
        if (kindOf(store / file) || errno != ENOENT) {
            return ProjectTrace::Text;
        }
    }
    return isEmptyFolder(store) ? ProjectTrace::None : ProjectTrace::TextMissing;
}

bool isShared(Path const& root) {
    auto const disk = project::stores::makeSystemDisk(root, TextBackend::folderName);
    return project::stores::readSharedLocation(*disk).has_value();
}

ProjectTrace findFinishedProjectIn(Path const& folder) {
    auto disk = project::stores::makeSystemDisk(folder, TextBackend::folderName);
    TreeMetadataManager store(std::make_unique<TextBackend>(std::move(disk)),
                              folder / TextBackend::folderName);
    auto const guard = store.acquireWriteLock();
    return findProjectIn(folder);
}

Path findProjectRoot(Path const& folder) {
    for (auto here = folder;;) {
        auto const trace = findProjectIn(here);
        if (trace == ProjectTrace::Text) {
            return here;
        }
        if (trace == ProjectTrace::TextMissing) {
            throw StoreError(StoreError::Kind::Damaged, shown(TextBackend::textPath(here)), 0,
                             Message("TextMissing").text(), Message("TextMissingAdvice").text());
        }
        auto above = project::metadata::getParentFolder(here);
        if (above == here) {
            throw Failure(Message("ProjectMissing", shown(folder)));
        }
        here = std::move(above);
    }
}

} // namespace projectctl
