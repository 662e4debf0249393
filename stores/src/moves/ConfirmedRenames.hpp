#pragma once

#include <cstddef>
#include <map>
#include <optional>
#include <string>

#include "moves/FileList.hpp"

namespace project::stores {

/// The renames between two versions that source control knows and that their file lists show, too: the later
/// one does not have the earlier path any more, and it has the later path if the earlier one was in the list.
///
/// A folder is renamed if nothing is left in it and most of its renamed files agree on the new place.
/// Everything that moved with such a folder is renamed, whether source control knows it or not.
class ConfirmedRenames {
public:
    using Paths = std::map<std::u16string, std::u16string>;

    /// @param known the renamed files: the earlier and the later paths. The lists are used in this call only.
    ConfirmedRenames(FileList const& before, FileList const& after, Paths const& known);

    Paths const& files() const noexcept { return files_; }

    Paths const& folders() const noexcept { return folders_; }

private:
    using Votes = std::map<std::u16string, std::size_t>;

    bool isConfirmed(std::u16string const& from, std::u16string const& to) const;
    void addFolders();
    static std::optional<std::u16string> winner(Votes const& targets);
    void addContentOf(std::u16string const& folder, std::u16string const& to);

    FileList before_;
    FileList after_;
    Paths files_;
    Paths folders_;
};

} // namespace project::stores
