#include "project/ProjectFolder.hpp"

#include <cerrno>
#include <filesystem>
#include <optional>
#include <system_error>

#include <sys/stat.h>

#include "fl/filesystem/SystemName.hpp"
#include "output/Failure.hpp"
#include "output/NameForms.hpp"
#include "project/metadata/MetadataFunctions.hpp"
#include "project/stores/TextBackend.hpp"

namespace projectctl {

using fl::filesystem::SystemName;
using project::stores::TextBackend;

namespace {

/// The kind of what is at a path, no link followed.
/// @return empty when nothing can be seen there; errno tells why.
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

ProjectTrace lookForProject(Path const& folder) {
    auto const store = folder / TextBackend::folderName;
    auto const kind = kindOf(store);
    if (kind == S_IFLNK) {
        return ProjectTrace::Text; // the store says why it does not open this
    }
    if (kind != S_IFDIR) {
        return ProjectTrace::None;
    }
    if (kindOf(store / TextBackend::textName) || errno != ENOENT) {
        return ProjectTrace::Text;
    }
    return isEmptyFolder(store) ? ProjectTrace::None : ProjectTrace::TextMissing;
}

Path findProjectRoot(Path const& folder) {
    for (auto here = folder;;) {
        auto const trace = lookForProject(here);
        if (trace == ProjectTrace::Text) {
            return here;
        }
        if (trace == ProjectTrace::TextMissing) {
            throw Failure(shown(TextBackend::textPath(here)) +
                          ": the project's text is missing. Bring it back, for instance from source control; "
                          "or remove the folder it was in to start anew.");
        }
        auto above = project::metadata::getParentFolder(here);
        if (above == here) {
            throw Failure("no project in \"" + shown(folder) +
                          "\" or a folder above it. Make one with 'projectctl init'.");
        }
        here = std::move(above);
    }
}

} // namespace projectctl
