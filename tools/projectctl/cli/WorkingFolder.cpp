#include "cli/WorkingFolder.hpp"

#include <filesystem>
#include <system_error>

#include "output/Failure.hpp"

namespace projectctl {

fl::filesystem::Path workingFolder() {
    std::error_code error;
    auto const folder = std::filesystem::current_path(error);
    if (error) {
        throw Failure(Message("WorkingFolderMissing", error.message()));
    }
    return fl::filesystem::fromSystem(folder);
}

void enterFolder(std::string const& folder) {
    if (folder.empty()) {
        return;
    }
    std::error_code error;
    std::filesystem::current_path(folder, error);
    if (error) {
        throw Failure(Message("FolderNotEntered", folder, error.message()));
    }
}

} // namespace projectctl
