#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "project/stores/Backend.hpp"
#include "project/stores/Disk.hpp"
#include "writing/SeenText.hpp"

namespace project::stores {

/// Creates the files of a store for its first batch, and deletes them if that batch fails, so that the next
/// attempt creates and reports them again.
class NewStore {
public:
    /// @param isPersonal the store is one that source control ignores as a whole.
    NewStore(Disk& disk, SeenText& seen, bool isPersonal)
        : disk_(disk), seen_(seen), isPersonal_(isPersonal) {}

    /// Creates the folder, without locking it.
    void createFolder();

    /// Creates the files that are missing, durably. The text, which has no nodes yet, comes last.
    /// @return the files that were created.
    /// @throws StoreError if another program creates the text at the same time.
    FileChanges createFiles();

    /// Deletes the files that were created, unless another program has changed the text. Never throws: a file
    /// that cannot be deleted stays, and is a store without nodes. @return true if the folder was deleted,
    /// and the lock released with it.
    bool rollBack() noexcept;

    /// Keeps the files that were created.
    void commit() noexcept {
        created_.clear();
        isFolderCreated_ = false;
    }

private:
    struct CreatedFile {
        std::string name;
        WrittenFile file;
    };

    void createFile(char const* name, std::string_view content, FileChanges& changes);
    bool removeCreatedFiles();
    bool isTextUnchanged() const;

    Disk& disk_;
    SeenText& seen_;
    bool const isPersonal_;
    bool isFolderCreated_ = false;
    std::vector<CreatedFile> created_;
};

} // namespace project::stores
