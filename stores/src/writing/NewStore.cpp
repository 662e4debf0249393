#include "writing/NewStore.hpp"

#include <utility>

#include "project/stores/StoreError.hpp"
#include "text/ProjectText.hpp"
#include "texts/ErrorTexts.hpp"
#include "writing/Leftovers.hpp"
#include "writing/StoreFiles.hpp"

namespace project::stores {

void NewStore::createFolder() {
    isFolderCreated_ = disk_.makeFolder() || isFolderCreated_;
}

FileChanges NewStore::createFiles() {
    FileChanges changes;
    if (!isPersonal_) {
        createFile(StoreFiles::attributes, StoreFiles::attributesContent, changes);
    }
    createFile(StoreFiles::ignored, isPersonal_ ? StoreFiles::ignoredInPersonal : StoreFiles::ignoredContent,
               changes);
    auto text = ProjectText::empty();
    createFile(StoreFiles::text, text.body(), changes);
    if (created_.empty() || created_.back().name != StoreFiles::text) {
        throw StoreError(StoreError::Kind::Busy, StoreFiles::pathOfText(disk_), 0,
                         errorTexts.get("CreatedByProgram"), errorTexts.get("TryAgain"));
    }
    seen_.replaced(std::move(text), created_.back().file);
    disk_.syncFolder();
    return changes;
}

/// Creates one file, which is complete as soon as it has its name, unless the name is taken.
void NewStore::createFile(char const* name, std::string_view content, FileChanges& changes) {
    auto const temporary = StoreFiles::newTemporary();
    auto const file = disk_.create(temporary, content, std::nullopt);
    bool isCreated = false;
    try {
        disk_.sync();
        isCreated = disk_.renameToFree(temporary, name);
    } catch (StoreError const&) {
        removeLeftovers(disk_);
        throw;
    }
    if (!isCreated) {
        disk_.remove(temporary);
        return;
    }
    created_.push_back({name, file});
    // Renaming changes one of the file's times.
    auto const now = disk_.identify(name);
    bool const isKnown = now && now->isSameState(file.identity);
    created_.back().file = {isKnown ? *now : file.identity, isKnown && file.isStamped};
    changes.added.push_back(fl::filesystem::fromSystem(disk_.folder()) /
                            fl::filesystem::fromSystem(std::string(name)));
}

bool NewStore::rollBack() noexcept {
    bool isFolderGone = false;
    try {
        isFolderGone = removeCreatedFiles() && isFolderCreated_;
        if (isFolderGone) {
            disk_.removeFolder();
        }
    } catch (...) {
        // a store without nodes is left
    }
    commit();
    return isFolderGone;
}

/// @return false if another program has changed the text, so that all files stay.
bool NewStore::removeCreatedFiles() {
    if (!created_.empty() && created_.back().name == StoreFiles::text) {
        if (!isTextUnchanged()) {
            return false;
        }
        disk_.remove(StoreFiles::text);
        seen_.forget();
        created_.pop_back();
    }
    for (auto const& [name, file] : created_) {
        auto const there = disk_.identify(name);
        if (there && there->isSameState(file.identity)) {
            disk_.remove(name);
        }
    }
    return true;
}

/// True also after the text without the batch was written to a new file.
bool NewStore::isTextUnchanged() const {
    auto const there = disk_.identify(StoreFiles::text);
    return there && seen_.exists() && there->isSameState(seen_.identity()) &&
           seen_.text().hasSameBytes(ProjectText::empty().body());
}

} // namespace project::stores
