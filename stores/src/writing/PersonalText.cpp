#include "project/stores/PersonalText.hpp"

#include <algorithm>
#include <array>
#include <string>
#include <string_view>

#include "project/stores/StoreError.hpp"
#include "project/stores/SystemDisk.hpp"
#include "texts/ErrorTexts.hpp"
#include "writing/StoreFiles.hpp"

namespace project::stores {

char16_t const* const PersonalText::folderName = u"local";

Path PersonalText::folder(Path const& projectRoot) {
    return projectRoot / TextBackend::folderName / folderName;
}

Path PersonalText::path(Path const& projectRoot) {
    return folder(projectRoot) / TextBackend::textName;
}

std::unique_ptr<TextBackend> PersonalText::open(Path const& projectRoot) {
    TextBackend::Options options;
    options.isPersonal = true;
    return std::make_unique<TextBackend>(makeSystemDisk(projectRoot / TextBackend::folderName, folderName),
                                         options);
}

namespace {

/// The lines by which git ignores the folder.
constexpr std::array<std::string_view, 4> ignoringLines{"/local/", "local/", "/local", "local"};

bool hasIgnoringLine(std::string_view content) {
    while (!content.empty()) {
        std::size_t const end = std::min(content.find('\n'), content.size());
        std::string_view line = content.substr(0, end);
        if (line.ends_with('\r')) {
            line.remove_suffix(1);
        }
        if (std::ranges::find(ignoringLines, line) != ignoringLines.end()) {
            return true;
        }
        content.remove_prefix(std::min(end + 1, content.size()));
    }
    return false;
}

/// @return false if another program has changed the file since it was read.
bool tryToIgnore(Disk& disk) {
    auto const now = disk.read(StoreFiles::ignored, 0);
    if (!now) {
        disk.create(StoreFiles::ignored, StoreFiles::ignoredPersonal, std::nullopt);
        disk.sync();
        disk.syncFolder();
        return true;
    }
    if (hasIgnoringLine(now->bytes)) {
        return true;
    }
    bool const isLineOpen = !now->bytes.empty() && !now->bytes.ends_with('\n');
    std::string const line = (isLineOpen ? "\n" : "") + std::string(StoreFiles::ignoredPersonal);
    bool const isAppended = disk.append(StoreFiles::ignored, now->identity, line).has_value();
    if (isAppended) {
        disk.sync();
    }
    return isAppended;
}

} // namespace

void ignorePersonalText(Disk& disk) {
    constexpr int attempts = 10;
    for (int attempt = 0; attempt < attempts; ++attempt) {
        if (!disk.openFolder() || tryToIgnore(disk)) {
            return;
        }
    }
    throw StoreError(StoreError::Kind::Busy, disk.folder() + '/' + StoreFiles::ignored, 0,
                     errorTexts.get("ChangedByProgram"), errorTexts.get("TryAgain"));
}

} // namespace project::stores
