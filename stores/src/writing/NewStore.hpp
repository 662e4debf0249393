#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "project/stores/Backend.hpp"
#include "project/stores/Disk.hpp"
#include "writing/SeenText.hpp"

namespace project::stores {

/// Makes the files of a store where there is none yet, and takes them away again when its first batch fails,
/// so that trying again makes, and reports, them again.
class NewStore {
public:
    NewStore(Disk& disk, SeenText& seen) : disk_(disk), seen_(seen) {}

    /// Makes the folder, which is not locked by that.
    void makeFolder();

    /// Makes the files that are missing, the text without nodes last, all durable.
    /// @return those that came into being.
    /// @throws StoreError when somebody else makes the text at the same time.
    FileChanges makeFiles();

    /// Takes away what was made, unless somebody has changed the text. Never throws: what cannot be removed
    /// stays, and is a store without nodes. @return true when the folder went, and the lock with it.
    bool takeBack() noexcept;

    /// What was made stays.
    void stand() noexcept {
        made_.clear();
        madeFolder_ = false;
    }

private:
    struct Made {
        std::string name;
        WrittenFile file;
    };

    void place(char const* name, std::string_view content, FileChanges& changes);
    bool removeMade();
    bool isTextAsMade() const;

    Disk& disk_;
    SeenText& seen_;
    bool madeFolder_ = false;
    std::vector<Made> made_;
};

} // namespace project::stores
