#include "writing/NewStore.hpp"

#include <utility>

#include "project/stores/StoreError.hpp"
#include "text/ProjectText.hpp"
#include "writing/Leftovers.hpp"
#include "writing/StoreFiles.hpp"

namespace project::stores {

void NewStore::makeFolder() {
    madeFolder_ = disk_.makeFolder() || madeFolder_;
}

FileChanges NewStore::makeFiles() {
    FileChanges changes;
    place(StoreFiles::attributes, StoreFiles::attributesContent, changes);
    place(StoreFiles::ignored, StoreFiles::ignoredContent, changes);
    auto text = ProjectText::empty();
    place(StoreFiles::text, text.body(), changes);
    if (made_.empty() || made_.back().name != StoreFiles::text) {
        throw StoreError(StoreError::Kind::Busy, disk_.folder() + "/" + StoreFiles::text, 0,
                         "was made by another program at this moment, and the batch is not in the project",
                         "Try again.");
    }
    seen_.replaced(std::move(text), made_.back().file);
    disk_.syncFolder();
    return changes;
}

/// Makes one file, whole from the start, unless something has its name already.
void NewStore::place(char const* name, std::string_view content, FileChanges& changes) {
    auto const temporary = StoreFiles::newTemporary();
    auto const file = disk_.create(temporary, content, std::nullopt);
    bool isPlaced = false;
    try {
        disk_.sync();
        isPlaced = disk_.renameToFree(temporary, name);
    } catch (StoreError const&) {
        removeLeftovers(disk_);
        throw;
    }
    if (!isPlaced) {
        disk_.remove(temporary);
        return;
    }
    made_.push_back({name, file});
    // A new name changes one of the file's times.
    auto const now = disk_.identify(name);
    bool const isKnown = now && now->isSameState(file.identity);
    made_.back().file = {isKnown ? *now : file.identity, isKnown && file.isStamped};
    changes.added.push_back(fl::filesystem::fromSystem(disk_.folder()) /
                            fl::filesystem::fromSystem(std::string(name)));
}

bool NewStore::takeBack() noexcept {
    bool isFolderGone = false;
    try {
        isFolderGone = removeMade() && madeFolder_;
        if (isFolderGone) {
            disk_.removeFolder();
        }
    } catch (...) {
        // what is left is a store without nodes
    }
    stand();
    return isFolderGone;
}

/// @return false when somebody has changed the text, so that everything stays.
bool NewStore::removeMade() {
    if (!made_.empty() && made_.back().name == StoreFiles::text) {
        if (!isTextAsMade()) {
            return false;
        }
        disk_.remove(StoreFiles::text);
        seen_.forget();
        made_.pop_back();
    }
    for (auto const& made : made_) {
        auto const there = disk_.identify(made.name);
        if (there && there->isSameState(made.file.identity)) {
            disk_.remove(made.name);
        }
    }
    return true;
}

/// True also after a text without the batch was written to a new file.
bool NewStore::isTextAsMade() const {
    auto const there = disk_.identify(StoreFiles::text);
    return there && seen_.exists() && there->isSameState(seen_.identity()) &&
           seen_.text().hasSameBytes(ProjectText::empty().body());
}

} // namespace project::stores
