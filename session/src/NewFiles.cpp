#include "NewFiles.hpp"

#include <system_error>
#include <utility>

namespace project::session {

namespace {

void readEntries(Path const& folder, std::vector<FoundFile>& found,
                 std::vector<UnreadableFolder>& unreadable) {
    try {
        for (auto const& entry : readDiskFolder(folder)) {
            found.push_back({folder / Path(entry.name), entry.kind});
        }
    } catch (std::system_error const& error) {
        unreadable.push_back({folder, error.code()});
    }
}

} // namespace

std::vector<FoundFile> filesOf(std::vector<FoundFile> found,
                               std::function<std::vector<FoundFile>(std::vector<FoundFile>)> const& choose,
                               std::vector<UnreadableFolder>& unreadable) {
    std::vector<FoundFile> result;
    while (!found.empty()) {
        std::vector<FoundFile> below;
        for (auto& file : choose(std::move(found))) {
            if (file.kind == FileKind::Folder) {
                readEntries(file.path, below, unreadable);
            } else {
                result.push_back(std::move(file));
            }
        }
        found = std::move(below);
    }
    return result;
}

} // namespace project::session
