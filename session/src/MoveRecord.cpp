#include "MoveRecord.hpp"

#include <cstddef>
#include <utility>

#include <fcntl.h>
#include <sys/stat.h>

#include "fl/filesystem/SystemName.hpp"
#include "project/metadata/MetadataFunctions.hpp"
#include "project/stores/SystemDisk.hpp"

namespace project::session {

namespace {

// The record is a sequence of texts, each followed by a zero byte, which no path contains: the title, the
// identity of the project's folder, the states of the definition and of git's index, the moves with an
// empty text after each group, and the end.
constexpr std::string_view title = "moves 1";
constexpr std::string_view end = "end";
constexpr char const* temporary = "moves.tmp";
constexpr char const* ignoreFile = ".gitignore";
constexpr std::string_view ignoredContent = "*\n"; // also in projects that ignore no such folder

void append(std::string& bytes, std::string_view text) {
    bytes += text;
    bytes += '\0';
}

std::vector<std::string> textsOf(std::string_view bytes) {
    std::vector<std::string> result;
    for (auto zero = bytes.find('\0'); zero != std::string_view::npos; zero = bytes.find('\0')) {
        result.emplace_back(bytes.substr(0, zero));
        bytes.remove_prefix(zero + 1);
    }
    return result;
}

/// Whether a relative path leads to a place inside its folder.
bool staysInside(std::string_view path) {
    std::string const inSlashes = '/' + std::string(path) + '/';
    return !path.empty() && path.front() != '/' && inSlashes.find("/../") == std::string::npos;
}

} // namespace

MoveRecord::MoveRecord(Path const& root, Path const& storeFolder)
    : root_(root), storeFolder_(storeFolder), disk_(stores::makeSystemDisk(storeFolder, Path(folderName))) {
}

bool MoveRecord::exists() const {
    return metadata::exists(storeFolder_ / Path(folderName) / fl::filesystem::fromSystem(name));
}

void MoveRecord::write(RecordedMoves const& moves) {
    std::string bytes;
    append(bytes, title);
    append(bytes, identity());
    append(bytes, moves.definition);
    append(bytes, moves.index);
    for (auto const& group : moves.groups) {
        for (auto const& move : group) {
            for (auto const& path : {move.from, move.to}) {
                append(bytes, fl::filesystem::toSystem(metadata::getRelativePath(root_, path)).native());
            }
        }
        append(bytes, "");
    }
    append(bytes, end);
    disk_->makeFolder();
    if (!disk_->identify(ignoreFile)) {
        replace(ignoreFile, ignoredContent);
    }
    replace(name, bytes);
    disk_->syncFolder();
}

/// Writes a file that is complete as soon as it has its name.
void MoveRecord::replace(char const* file, std::string_view content) {
    disk_->remove(temporary);
    disk_->create(temporary, content, std::nullopt);
    disk_->sync();
    disk_->rename(temporary, file);
}

std::optional<RecordedMoves> MoveRecord::read() const {
    auto const content = disk_->openFolder() ? disk_->read(name, 0) : std::nullopt;
    if (!content) {
        return std::nullopt;
    }
    auto const texts = textsOf(content->bytes);
    if (texts.size() < 5 || texts[0] != title || texts[1] != identity() || texts.back() != end) {
        return RecordedMoves();
    }
    RecordedMoves result{texts[2], texts[3], {}};
    std::vector<Move> group;
    for (std::size_t index = 4; index + 1 < texts.size();) {
        if (texts[index].empty()) {
            result.groups.push_back(std::exchange(group, {}));
            ++index;
        } else if (staysInside(texts[index]) && staysInside(texts[index + 1])) {
            group.push_back({root_ / fl::filesystem::fromSystem(texts[index]),
                             root_ / fl::filesystem::fromSystem(texts[index + 1])});
            index += 2;
        } else {
            return RecordedMoves();
        }
    }
    return result;
}

void MoveRecord::remove() {
    if (!disk_->openFolder()) {
        return;
    }
    disk_->remove(name);
    disk_->remove(temporary);
    if (disk_->list() == std::vector<std::string>{ignoreFile}) {
        disk_->remove(ignoreFile);
    }
    disk_->removeFolder(); // unless something is in it
}

/// Distinguishes the project's folder from any copy of it: a record that somebody has committed, or copied
/// with the folder, moves no file.
std::string MoveRecord::identity() const {
    fl::filesystem::SystemName const folder(storeFolder_);

    struct statx found {};

    if (::statx(AT_FDCWD, folder.get(), AT_SYMLINK_NOFOLLOW, STATX_INO | STATX_BTIME, &found) != 0) {
        return {};
    }
    bool const hasBirth = (found.stx_mask & STATX_BTIME) != 0;
    return std::to_string(found.stx_ino) + (hasBirth ? ' ' + std::to_string(found.stx_btime.tv_sec) + ' ' +
                                                           std::to_string(found.stx_btime.tv_nsec)
                                                     : "");
}

} // namespace project::session
