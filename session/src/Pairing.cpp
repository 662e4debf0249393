#include "Pairing.hpp"

#include <algorithm>
#include <compare>
#include <cstddef>
#include <functional>
#include <iterator>
#include <map>
#include <optional>
#include <set>
#include <string_view>
#include <tuple>
#include <utility>

#include "fl/filesystem/Path.hpp"

namespace project::session {

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
        result_.renames.pairs.push_back({from.path, to.path, FileKind::File, Rename::Evidence::Content, 100});
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

/// The number of files of each name.
std::map<std::u16string_view, std::size_t> countNames(std::vector<FileContentId> const& files) {
    std::map<std::u16string_view, std::size_t> result;
    for (auto const& file : files) {
        ++result[nameOf(file.path)];
    }
    return result;
}

class SimilarityPairing {
public:
    using Similar = git::SimilarContent;

    SimilarityPairing(std::vector<FileContentId> const& gone, std::vector<FileContentId> const& added)
        : gone_(gone),
          added_(added),
          goneNames_(countNames(gone)),
          addedNames_(countNames(added)),
          ofGone_(gone.size()),
          ofAdded_(added.size()) {}

    RenamesFound run(std::vector<Similar> similar, int similarity) {
        auto const rank = [this, similarity](Similar const& each) {
            return std::tuple(isCertainByName(each, similarity), each.hundredths, hasSameName(each));
        };
        std::ranges::stable_sort(similar, std::greater<>(), rank);
        for (auto const& each : similar) {
            if (!ofGone_[each.before] && !ofAdded_[each.after]) {
                ofGone_[each.before] = each;
                ofAdded_[each.after] = each;
            }
        }
        for (auto const& each : similar) {
            noteRival(each);
        }
        return result();
    }

private:
    /// The files that are left over, and as similar to one of a pair as the other one of it.
    struct Rivals {
        std::set<std::u16string> gone;
        std::set<std::u16string> added;
    };

    bool hasSameName(Similar const& each) const {
        return nameOf(gone_[each.before].path) == nameOf(added_[each.after].path);
    }

    /// Whether the name, which no other file has, is half of what the contents lack in similarity.
    bool isCertainByName(Similar const& each, int similarity) const {
        auto const name = nameOf(gone_[each.before].path);
        return hasSameName(each) && each.hundredths >= (similarity + 100) * 50 && goneNames_.at(name) == 1 &&
               addedNames_.at(name) == 1;
    }

    void noteRival(Similar const& each) {
        auto const& ofGone = ofGone_[each.before];
        auto const& ofAdded = ofAdded_[each.after];
        if (ofGone.has_value() == ofAdded.has_value()) {
            return;
        }
        auto const& pair = ofGone ? *ofGone : *ofAdded;
        bool const isRival = each.hundredths / 100 >= pair.hundredths / 100;
        if (isRival && ofGone) {
            rivals_[pair.before].added.insert(added_[each.after].path);
        } else if (isRival) {
            rivals_[pair.before].gone.insert(gone_[each.before].path);
        }
    }

    RenamesFound result() {
        RenamesFound result;
        for (auto const& pair : ofGone_) {
            if (!pair) {
                continue;
            }
            auto const& from = gone_[pair->before].path;
            auto const& to = added_[pair->after].path;
            if (auto const found = rivals_.find(pair->before); found != rivals_.end()) {
                auto& [gone, added] = found->second;
                gone.insert(from);
                added.insert(to);
                result.ambiguous.push_back({{gone.begin(), gone.end()}, {added.begin(), added.end()}});
            } else {
                result.pairs.push_back(
                    {from, to, FileKind::File, Rename::Evidence::Similarity, pair->hundredths / 100});
            }
        }
        sortByPath(result.pairs);
        return result;
    }

    std::vector<FileContentId> const& gone_;
    std::vector<FileContentId> const& added_;
    std::map<std::u16string_view, std::size_t> goneNames_;
    std::map<std::u16string_view, std::size_t> addedNames_;
    std::vector<std::optional<Similar>> ofGone_; ///< the pair of each file
    std::vector<std::optional<Similar>> ofAdded_;
    std::map<std::size_t, Rivals> rivals_; ///< of pairs, by the file that is gone
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

RenamesFound pairBySimilarity(std::vector<FileContentId> const& gone, std::vector<FileContentId> const& added,
                              std::vector<git::SimilarContent> similar, int similarity) {
    return SimilarityPairing(gone, added).run(std::move(similar), similarity);
}

RenamesFound pairByName(std::vector<std::u16string> const& gone, std::vector<std::u16string> const& added) {
    std::map<std::u16string_view, AmbiguousRename> byName;
    for (auto const& path : gone) {
        byName[nameOf(path)].from.push_back(path);
    }
    for (auto const& path : added) {
        byName[nameOf(path)].to.push_back(path);
    }
    RenamesFound result;
    for (auto& [name, paths] : byName) {
        if (paths.from.size() == 1 && paths.to.size() == 1) {
            result.pairs.push_back({paths.from[0], paths.to[0], FileKind::File, Rename::Evidence::Name, 0});
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

bool isGuessBelow(std::u16string const& folder, std::vector<Rename> const& pairs) {
    return std::ranges::any_of(pairs, [inside = folder + u'/'](Rename const& pair) {
        return pair.evidence == Rename::Evidence::Name && pair.from.starts_with(inside);
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

} // namespace project::session
