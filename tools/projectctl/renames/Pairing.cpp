#include "renames/Pairing.hpp"

#include <algorithm>
#include <cstddef>
#include <iterator>
#include <map>
#include <string_view>
#include <utility>

#include "fl/filesystem/Path.hpp"

namespace projectctl {

namespace {

std::u16string_view nameOf(std::u16string_view path) {
    return path.substr(path.rfind(u'/') + 1); // npos + 1 is 0
}

/// The number of names at the end that two paths have in common.
std::size_t commonNames(std::u16string_view left, std::u16string_view right) {
    std::size_t result = 0;
    while (!left.empty() && !right.empty() && nameOf(left) == nameOf(right)) {
        ++result;
        left = left.substr(0, left.size() - std::min(left.size(), nameOf(left).size() + 1));
        right = right.substr(0, right.size() - std::min(right.size(), nameOf(right).size() + 1));
    }
    return result;
}

/// Files with one content.
struct Group {
    std::vector<FileContentId> gone;
    std::vector<FileContentId> added;
};

using Groups = std::map<std::string, Group>;

/// The position of the one file that has most names in common with a path; -1 if there are several, or none
/// that has any.
std::ptrdiff_t nearestTo(std::u16string const& path, std::vector<FileContentId> const& files) {
    std::size_t most = 0;
    std::ptrdiff_t result = -1;
    for (auto const& file : files) {
        auto const common = commonNames(path, file.path);
        if (common > 0 && common >= most) {
            result = common > most ? &file - files.data() : -1;
            most = common;
        }
    }
    return result;
}

class ContentPairing {
public:
    void take(Group& group) {
        bool const isClear = group.gone.size() == 1 && group.added.size() == 1 && !group.gone[0].isEmpty;
        if (isClear) {
            pair(group.gone[0], group.added[0]);
        } else if (!group.gone.empty() && !group.added.empty()) {
            pairNearest(group);
        } else {
            move(group.gone, result_.gone);
            move(group.added, result_.added);
        }
    }

    PairedFiles finish() {
        sortByPath(result_.renames.pairs);
        return std::move(result_);
    }

private:
    void pair(FileContentId const& from, FileContentId const& to) {
        result_.renames.pairs.push_back({from.path, to.path, Kind::File, Rename::Evidence::Content, 100});
    }

    void pairNearest(Group& group) {
        std::vector<bool> isTaken(group.added.size(), false);
        std::vector<FileContentId> rest;
        for (auto const& from : group.gone) {
            auto const nearest = nearestTo(from.path, group.added);
            auto const position = static_cast<std::size_t>(nearest);
            bool const isMutual = nearest >= 0 && nearestTo(group.added[position].path, group.gone) ==
                                                      &from - group.gone.data();
            if (isMutual) {
                pair(from, group.added[position]);
                isTaken[position] = true;
            } else {
                rest.push_back(from);
            }
        }
        std::vector<FileContentId> left;
        for (std::size_t position = 0; position < group.added.size(); ++position) {
            if (!isTaken[position]) {
                left.push_back(group.added[position]);
            }
        }
        leaveRest(rest, left);
    }

    /// Empty files of different names have nothing in common.
    void leaveRest(std::vector<FileContentId>& gone, std::vector<FileContentId>& added) {
        bool const isAmbiguous = !gone.empty() && !added.empty() && !gone[0].isEmpty;
        if (isAmbiguous) {
            AmbiguousRename ambiguous;
            std::ranges::transform(gone, std::back_inserter(ambiguous.from), &FileContentId::path);
            std::ranges::transform(added, std::back_inserter(ambiguous.to), &FileContentId::path);
            std::ranges::sort(ambiguous.from);
            std::ranges::sort(ambiguous.to);
            result_.renames.ambiguous.push_back(std::move(ambiguous));
        } else if (gone.empty() || !gone[0].isEmpty) {
            move(gone, result_.gone);
            move(added, result_.added);
        }
    }

    static void move(std::vector<FileContentId>& from, std::vector<FileContentId>& to) {
        std::move(from.begin(), from.end(), std::back_inserter(to));
    }

    PairedFiles result_;
};

} // namespace

PairedFiles pairByContent(std::vector<FileContentId> gone, std::vector<FileContentId> added) {
    Groups groups;
    for (auto& file : gone) {
        auto& group = groups[file.id].gone;
        group.push_back(std::move(file));
    }
    for (auto& file : added) {
        auto& group = groups[file.id].added;
        group.push_back(std::move(file));
    }
    ContentPairing pairing;
    for (auto& [id, group] : groups) {
        pairing.take(group);
    }
    return pairing.finish();
}

Renames pairByName(std::vector<std::u16string> const& gone, std::vector<std::u16string> const& added) {
    std::map<std::u16string_view, AmbiguousRename> byName;
    for (auto const& path : gone) {
        byName[nameOf(path)].from.push_back(path);
    }
    for (auto const& path : added) {
        byName[nameOf(path)].to.push_back(path);
    }
    Renames result;
    for (auto& [name, paths] : byName) {
        if (paths.from.size() == 1 && paths.to.size() == 1) {
            result.pairs.push_back({paths.from[0], paths.to[0], Kind::File, Rename::Evidence::Name, 0});
        } else if (!paths.from.empty() && !paths.to.empty()) {
            std::ranges::sort(paths.from);
            std::ranges::sort(paths.to);
            result.ambiguous.push_back(std::move(paths));
        }
    }
    sortByPath(result.pairs);
    return result;
}

void sortByPath(std::vector<Rename>& pairs) {
    std::ranges::sort(pairs, [](Rename const& left, Rename const& right) {
        return std::is_lt(fl::filesystem::detail::compare_elements(left.from, right.from));
    });
}

std::u16string newFolderOf(std::u16string const& folder, std::vector<Rename> const& pairs) {
    std::u16string const inside = folder + u'/';
    std::u16string result;
    auto const first = std::ranges::lower_bound(
        pairs, inside,
        [](std::u16string const& left, std::u16string const& right) {
            return std::is_lt(fl::filesystem::detail::compare_elements(left, right));
        },
        &Rename::from);
    for (auto pair = first; pair != pairs.end() && pair->from.starts_with(inside); ++pair) {
        auto const end = std::u16string_view(pair->from).substr(folder.size()); // with its slash
        bool const isSame = pair->to.size() > end.size() && std::u16string_view(pair->to).ends_with(end);
        auto const to = isSame ? pair->to.substr(0, pair->to.size() - end.size()) : std::u16string();
        if (to.empty() || (!result.empty() && to != result)) {
            return {};
        }
        result = to;
    }
    return result;
}

} // namespace projectctl
