#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace projectctl {

/// A change of one file between two states of a repository.
struct RawChange {
    char status;        ///< 'A' added, 'C' copied, 'D' deleted, 'M' modified, 'R' renamed, 'T' type changed
    int similarity;     ///< of a renamed or copied file, in percent; otherwise 0
    std::string before; ///< the id of the earlier content; zeros if there was none or it is not stored
    std::string after;  ///< the id of the later content, likewise
    std::string from;   ///< the earlier path, from the top of the repository
    std::string to;     ///< the later path: the same one, unless the file was renamed or copied
};

/// Reads the changes that git writes with the options `--raw -z`.
/// @param raw up to something that is not a change. @return the changes before it.
std::vector<RawChange> readRawChanges(std::string_view raw);

/// The same. @param raw afterwards the part that was not read.
std::vector<RawChange> takeRawChanges(std::string_view& raw);

} // namespace projectctl
