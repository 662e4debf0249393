#include "renames/DiskNames.hpp"

#include <algorithm>
#include <filesystem>
#include <system_error>

#include "project/metadata/MetadataFunctions.hpp"
#include "project/stores/TextBackend.hpp"

namespace projectctl {

namespace files = std::filesystem;

bool isFileOnDisk(Path const& path) {
    std::error_code error;
    auto const status = files::symlink_status(fl::filesystem::toSystem(path), error);
    return status.type() == files::file_type::regular || status.type() == files::file_type::symlink;
}

std::vector<std::u16string> filesOnDisk(Path const& root, std::set<std::u16string> const& without) {
    std::vector<std::u16string> result;
    auto const folder = fl::filesystem::toSystem(root);
    auto const store = fl::filesystem::toSystem(root / project::stores::TextBackend::folderName);
    std::error_code error;
    auto entry =
        files::recursive_directory_iterator(folder, files::directory_options::skip_permission_denied, error);
    for (; !error && entry != files::recursive_directory_iterator(); entry.increment(error)) {
        if (entry->path() == store || entry->path().filename() == ".git") {
            entry.disable_recursion_pending();
            continue;
        }
        auto const path = fl::filesystem::fromSystem(entry->path());
        auto relative = project::metadata::getRelativePath(root, path);
        if (isFileOnDisk(path) && !without.contains(relative)) {
            result.push_back(std::move(relative));
        }
    }
    std::ranges::sort(result);
    return result;
}

} // namespace projectctl
