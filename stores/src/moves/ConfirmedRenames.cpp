#include "moves/ConfirmedRenames.hpp"

#include <algorithm>
#include <string_view>
#include <utility>

namespace project::stores {

ConfirmedRenames::ConfirmedRenames(FileList const& before, FileList const& after, Paths const& known)
    : before_(before), after_(after) {
    for (auto const& [from, to] : known) {
        if (from != to && isConfirmed(from, to)) {
            files_.emplace(from, to);
        }
    }
    addFolders();
}

bool ConfirmedRenames::isConfirmed(std::u16string const& from, std::u16string const& to) const {
    return !after_.has(from) && (!before_.has(from) || after_.has(to));
}

void ConfirmedRenames::addFolders() {
    std::map<std::u16string, Votes> votes;
    for (auto const& [from, to] : files_) {
        for (auto at = from.rfind(u'/'); at != from.npos && at > 0; at = from.rfind(u'/', at - 1)) {
            auto const rest = std::u16string_view(from).substr(at);
            if (to.size() > rest.size() && to.ends_with(rest)) {
                ++votes[from.substr(0, at)][to.substr(0, to.size() - rest.size())];
            }
        }
    }
    for (auto const& [folder, targets] : votes) {
        auto const to = winner(targets);
        if (to && *to != folder && !after_.hasAnythingWithin(folder) && isConfirmed(folder, *to)) {
            folders_.emplace(folder, *to);
            addContentOf(folder, *to);
        }
    }
}

/// The target with the most votes; nothing if two have as many.
std::optional<std::u16string> ConfirmedRenames::winner(Votes const& targets) {
    auto const votes = [](auto const& each) { return each.second; };
    auto const best = std::ranges::max_element(targets, {}, votes);
    bool const isTied = std::ranges::count(targets, best->second, votes) > 1;
    return isTied ? std::nullopt : std::optional(best->first);
}

/// Everything that moved with its folder, and that source control does not know or does not recognise.
void ConfirmedRenames::addContentOf(std::u16string const& folder, std::u16string const& to) {
    auto const belowFolder = folder + u'/';
    auto const belowTarget = to + u'/';
    for (auto const& rest : before_.pathsBelow(folder)) {
        auto from = belowFolder + rest;
        auto target = belowTarget + rest;
        if (!before_.has(target) && after_.has(target)) {
            (before_.hasFolder(from) ? folders_ : files_).try_emplace(std::move(from), std::move(target));
        }
    }
}

} // namespace project::stores
