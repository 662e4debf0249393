#pragma once

#include <string>
#include <string_view>

#include "index/IndexChanges.hpp"
#include "repository/IndexContent.hpp"

namespace project::git {

/// The bytes of a new index: those of an old one with changes. Copies the bytes of all entries between two
/// changes at once, with their flags and conflicts.
///
/// Parts that git can create again are left out: the cached trees, the list of untracked files, the record of
/// resolved conflicts. Zeros are in place of the checksum.
class IndexPatch {
public:
    explicit IndexPatch(IndexContent const& old) : old_(old) {}

    std::string apply(IndexChanges const& changes);

private:
    void keepUntil(std::size_t position);
    void drop(std::string_view path);
    void add(git_index_entry const& entry, TreePath const& path);
    void addName(std::string_view path);
    void finishEntry(std::size_t begin);

    IndexContent const& old_;
    std::size_t next_ = 0; ///< position in the old index
    std::string result_;
    std::size_t count_ = 0;
    std::string_view previous_; ///< name of the last entry in the result
};

} // namespace project::git
