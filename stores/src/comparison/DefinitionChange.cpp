#include "project/stores/DefinitionChange.hpp"

#include <algorithm>
#include <set>
#include <utility>

#include "comparison/ChangeList.hpp"
#include "moves/ConfirmedRenames.hpp"
#include "moves/MovedBody.hpp"
#include "project/stores/StoreError.hpp"
#include "text/TextDifference.hpp"
#include "text/TextReader.hpp"
#include "texts/ErrorTexts.hpp"

namespace project::stores {

namespace {

using Paths = ConfirmedRenames::Paths;

/// A version as a canonical body.
TextBody readVersion(std::string_view text, char const* name) {
    if (text.empty()) {
        return TextContent().write({});
    }
    auto reading = readText(std::string(text), name);
    if (!reading) {
        throw StoreError(StoreError::Kind::Damaged, name, 0, errorTexts.get("TextUnfinished"), "");
    }
    bool const isTidy = reading->isCanonical && reading->content.overlay().empty();
    return isTidy ? std::move(reading->content.body()) : reading->content.write({});
}

/// Whether a path moved because a folder above it did.
bool isWithFolder(std::u16string const& from, std::u16string const& to, Paths const& folders) {
    for (auto at = from.rfind(u'/'); at != from.npos && at > 0; at = from.rfind(u'/', at - 1)) {
        auto const folder = folders.find(from.substr(0, at));
        if (folder != folders.end() && folder->second + from.substr(at) == to) {
            return true;
        }
    }
    return false;
}

/// Adds the renames to the list, and the folders that are new because something was moved into them.
class RenameChanges {
public:
    RenameChanges(FileList const& before, FileList const& after, ConfirmedRenames const& renames,
                  ChangeList& changes)
        : before_(before), after_(after), renames_(renames), changes_(changes) {
        add(renames.folders(), true);
        add(renames.files(), false);
        addNewFolders();
    }

private:
    void add(Paths const& paths, bool isFolder) {
        for (auto const& [from, to] : paths) {
            if (!before_.has(from)) {
                continue; // a file outside the project
            }
            DefinitionChange change{DefinitionChange::Subject::File, DefinitionChange::Kind::Renamed};
            change.name = to;
            change.earlier = from;
            change.isFolder = isFolder;
            change.isWithFolder = isWithFolder(from, to, renames_.folders());
            changes_.add(std::move(change));
            noteFoldersAbove(to);
        }
    }

    void noteFoldersAbove(std::u16string const& path) {
        for (auto at = path.rfind(u'/'); at != path.npos && at > 0; at = path.rfind(u'/', at - 1)) {
            foldersAbove_.insert(path.substr(0, at));
        }
    }

    void addNewFolders() {
        std::set<std::u16string> targets;
        for (auto const& [from, to] : renames_.folders()) {
            targets.insert(to);
        }
        for (auto const& folder : foldersAbove_) {
            if (!targets.contains(folder) && !before_.has(folder) && after_.has(folder)) {
                DefinitionChange change{DefinitionChange::Subject::File, DefinitionChange::Kind::Added};
                change.name = folder;
                change.isFolder = true;
                changes_.add(std::move(change));
            }
        }
    }

    FileList const& before_;
    FileList const& after_;
    ConfirmedRenames const& renames_;
    ChangeList& changes_;
    std::set<std::u16string> foldersAbove_;
};

PathMoves movesOf(ConfirmedRenames const& renames) {
    PathMoves moves;
    for (auto const* paths : {&renames.files(), &renames.folders()}) {
        for (auto const& [from, to] : *paths) {
            moves.add(from, to);
        }
    }
    return moves;
}

} // namespace

std::vector<DefinitionChange> changesBetween(std::string_view before, std::string_view after,
                                             std::map<std::u16string, std::u16string> const& renames) {
    auto earlier = readVersion(before, "before");
    TextContent const later(readVersion(after, "after"));
    FileList const earlierList(earlier);
    FileList const laterList(later.body());
    ConfirmedRenames const confirmed(earlierList, laterList, renames);
    TextContent const moved(movedBody(earlier, movesOf(confirmed)));
    ChangeList changes(moved, later);
    RenameChanges const ofFiles(earlierList, laterList, confirmed, changes);
    for (auto const& difference : differences(moved, later)) {
        changes.add(difference);
    }
    return std::move(changes).take();
}

} // namespace project::stores
