#include "files/DiskFolder.hpp"

#include <algorithm>
#include <array>
#include <cerrno>
#include <memory>
#include <optional>
#include <string_view>
#include <system_error>

#include <dirent.h>
#include <fcntl.h>
#include <sys/stat.h>

#include "fl/filesystem/SystemName.hpp"
#include "output/NameForms.hpp"

namespace projectctl {

using fl::filesystem::SystemName;

namespace {

struct CloseFolder {
    void operator()(DIR* folder) const noexcept { closedir(folder); }
};

using FolderHandle = std::unique_ptr<DIR, CloseFolder>;

/// Folders with these names belong to source control or to a project store.
constexpr std::array<std::string_view, 8> foreignFolders{".git",   ".hg", ".svn", ".bzr",
                                                         "_darcs", "CVS", ".jj",  ".projectdata"};

/// The kind of an entry as the file system returned it with the name, or else as fstatat returns it.
unsigned char typeOf(DIR* folder, dirent const& entry) {
    struct stat status {};

    if (entry.d_type != DT_UNKNOWN) {
        return entry.d_type;
    }
    if (fstatat(dirfd(folder), &entry.d_name[0], &status, AT_SYMLINK_NOFOLLOW) != 0) {
        return DT_UNKNOWN;
    }
    return static_cast<unsigned char>(IFTODT(status.st_mode));
}

/// @return empty for an entry that a project does not contain.
std::optional<Kind> kindOf(std::string_view name, unsigned char type) {
    bool const isForeign = std::ranges::find(foreignFolders, name) != foreignFolders.end();
    switch (type) {
    case DT_DIR:
        return name == "." || name == ".." || isForeign ? std::nullopt : std::optional(Kind::Folder);
    case DT_REG: // in a linked working tree or a submodule, .git is a file
        return name == ".git" ? std::nullopt : std::optional(Kind::File);
    case DT_LNK:
        return Kind::File;
    default:
        return std::nullopt;
    }
}

std::u16string toText(std::string_view name) {
    if (std::ranges::all_of(name, [](char byte) { return static_cast<unsigned char>(byte) < 0x80; })) {
        return {name.begin(), name.end()};
    }
    return fl::filesystem::fromSystem(std::filesystem::path(name)).native();
}

[[noreturn]] void fail(Path const& folder, int error) {
    throw std::system_error(error, std::generic_category(),
                            Message("FolderUnreadable", shown(folder)).text());
}

} // namespace

std::vector<DiskEntry> readDiskFolder(Path const& folder) {
    SystemName const name(folder);
    FolderHandle const handle(name.get() != nullptr ? opendir(name.get()) : nullptr);
    if (!handle) {
        fail(folder, name.get() != nullptr ? errno : ENAMETOOLONG);
    }
    std::vector<DiskEntry> result;
    errno = 0;
    while (auto const* entry = readdir(handle.get())) { // NOLINT(concurrency-mt-unsafe): own handle
        std::string_view const found = &entry->d_name[0];
        if (auto const kind = kindOf(found, typeOf(handle.get(), *entry))) {
            result.push_back({toText(found), *kind});
        }
        errno = 0;
    }
    if (errno != 0) {
        fail(folder, errno);
    }
    std::ranges::sort(result, {}, &DiskEntry::name);
    return result;
}

bool isOnDisk(Path const& path) {
    SystemName const name(path);

    struct stat status {};

    return name.get() != nullptr && (lstat(name.get(), &status) == 0 ||
                                     (errno != ENOENT && errno != ENOTDIR && errno != ENAMETOOLONG));
}

bool isOnDisk(Path const& folder, std::u16string const& name) {
    bool const leadsElsewhere =
        name.empty() || name == u"." || name == u".." || name.find(u'/') != std::u16string::npos;
    return !leadsElsewhere && isOnDisk(folder / Path(name));
}

bool isFolderItself(Path const& path) {
    SystemName const name(path);

    struct stat status {};

    return name.get() != nullptr && lstat(name.get(), &status) == 0 && S_ISDIR(status.st_mode);
}

} // namespace projectctl
