#include "project/session/DiskFolder.hpp"

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
#include "fl/i18n/Utf8.hpp"
#include "project/metadata/MetadataFunctions.hpp"
#include "texts/ErrorTexts.hpp"

namespace project::session {

using fl::filesystem::SystemName;

namespace {

struct CloseFolder {
    void operator()(DIR* folder) const noexcept { closedir(folder); }
};

using FolderHandle = std::unique_ptr<DIR, CloseFolder>;

/// Folders with these names belong to source control or to a project store.
constexpr std::array<std::string_view, 8> foreignFolders{".git",   ".hg", ".svn", ".bzr",
                                                         "_darcs", "CVS", ".jj",  ".projectdata"};

/// Whether a name is one element of a path and does not lead elsewhere.
bool isElement(std::u16string_view name) {
    return !name.empty() && name != u"." && name != u".." && name.find(u'/') == std::u16string_view::npos;
}

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
std::optional<FileKind> kindOf(std::string_view name, unsigned char type) {
    bool const isForeign = std::ranges::find(foreignFolders, name) != foreignFolders.end();
    switch (type) {
    case DT_DIR:
        return name == "." || name == ".." || isForeign ? std::nullopt : std::optional(FileKind::Folder);
    case DT_REG: // in a linked working tree or a submodule, .git is a file
        return name == ".git" ? std::nullopt : std::optional(FileKind::File);
    case DT_LNK:
        return FileKind::File;
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
                            errorTexts.get("FolderUnreadable", fl::i18n::toUtf8(folder.native())));
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
    return isElement(name) && isOnDisk(folder / Path(name));
}

bool canBeInProject(std::u16string_view name) {
    auto const isName = [name](std::string_view foreign) { return std::ranges::equal(foreign, name); };
    return isElement(name) && std::ranges::none_of(foreignFolders, isName);
}

bool isFolderItself(Path const& path) {
    SystemName const name(path);

    struct stat status {};

    return name.get() != nullptr && lstat(name.get(), &status) == 0 && S_ISDIR(status.st_mode);
}

bool isFolderWithin(Path const& root, Path const& folder) {
    if (folder == root) {
        return isFolderItself(root);
    }
    auto const path = metadata::getRelativePath(root, folder);
    for (std::size_t begin = 0, end = 0; end < path.size(); begin = end + 1) {
        end = std::min(path.find(u'/', begin), path.size());
        if (!canBeInProject(std::u16string_view(path).substr(begin, end - begin)) ||
            !isFolderItself(root / Path(path.substr(0, end)))) {
            return false;
        }
    }
    return !metadata::leadsUpward(root, folder);
}

} // namespace project::session
