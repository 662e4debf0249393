#include "MovePlan.hpp"

#include <set>
#include <string>

#include "DiskEntries.hpp"
#include "project/metadata/Messages.hpp"
#include "project/metadata/MetadataFunctions.hpp"
#include "project/metadata/ProjectException.hpp"

namespace project::session {

using metadata::getParentFolder;
using metadata::isParent;
using ZEPHRA::project::management::FileNotInProject;

namespace {

using Reason = MoveError::Reason;

bool isAtOrBelow(Path const& path, Path const& folder) {
    return path == folder || isParent(path, folder);
}

bool isFolder(Path const& path) {
    auto const entry = diskEntry(path);
    return entry && S_ISDIR(entry->st_mode);
}

Path withoutSlashes(Path const& path) {
    std::u16string text = path.native();
    while (text.size() > 1 && text.back() == u'/') {
        text.pop_back();
    }
    return text;
}

Path nameOf(Path const& path) {
    return metadata::getRelativePath(getParentFolder(path), path);
}

void requireNoNesting(std::vector<Move> const& moves, Path const& root) {
    std::set<Path> sources;
    for (auto const& move : moves) {
        sources.insert(move.from);
    }
    for (auto const& move : moves) {
        for (auto above = getParentFolder(move.from); isParent(above, root); above = getParentFolder(above)) {
            if (sources.contains(above)) {
                throw MoveError(Reason::IsNested, move);
            }
        }
    }
}

void requireDifferentTargets(std::vector<Move> const& moves) {
    std::set<Path> targets;
    for (auto const& move : moves) {
        if (!targets.insert(move.to).second) {
            throw MoveError(Reason::IsInProject, move);
        }
    }
}

} // namespace

std::vector<Move> MovePlan::onDisk(std::vector<Path> const& sources, Path const& destination) const {
    auto const target = withoutSlashes(destination);
    bool const isItself = sources.size() == 1 && sources.front() == target;
    bool const isInto = !isItself && isFolder(target);
    bool const needsFolder = sources.size() > 1 || target != destination;
    std::vector<Move> result;
    for (auto const& source : std::set<Path>(sources.begin(), sources.end())) {
        requireSource(source, target);
        Move move{source, isInto ? target / nameOf(source) : target};
        if (move.from == move.to) {
            continue;
        }
        if (needsFolder && !isInto) {
            throw MoveError(Reason::HasNoFolder, {source, target});
        }
        requireInside(move);
        if (isParent(move.to, move.from)) {
            throw MoveError(Reason::EntersItself, move);
        }
        requireFolder(move);
        if (!isFree(move)) {
            throw MoveError(Reason::Exists, move);
        }
        result.push_back(std::move(move));
    }
    requireNoNesting(result, root_);
    requireDifferentTargets(result);
    return result;
}

std::vector<Move> MovePlan::made(std::vector<Move> const& moves) const {
    std::vector<Move> result;
    for (auto const& move : moves) {
        if (move.from == root_) {
            throw MoveError(Reason::IsRoot, move);
        }
        if (!isInProject_(move.from)) {
            exception::raise(FileNotInProject(move.from.native()));
        }
        if (move.from == move.to) {
            continue;
        }
        requireInside(move);
        result.push_back(move);
    }
    requireDifferentTargets(result);
    return result;
}

void MovePlan::requireSource(Path const& source, Path const& destination) const {
    if (source == root_) {
        throw MoveError(Reason::IsRoot, {source, destination});
    }
    if (!isInProject_(source)) {
        exception::raise(FileNotInProject(source.native()));
    }
    if (!isParent(source, root_)) { // the project's text may have been written by anybody
        throw MoveError(Reason::LeavesProject, {source, source});
    }
    if (!diskEntry(source)) {
        throw MoveError(Reason::IsMissing, {source, destination});
    }
}

void MovePlan::requireInside(Move const& move) const {
    if (!isParent(move.to, root_) || metadata::leadsUpward(root_, move.to)) {
        throw MoveError(Reason::LeavesProject, move);
    }
    if (isAtOrBelow(move.to, storeFolder_)) {
        throw MoveError(Reason::EntersStore, move);
    }
}

/// The folders above the new path exist, and none of them is a link, which might lead out of the project.
void MovePlan::requireFolder(Move const& move) const {
    for (auto folder = getParentFolder(move.to); isParent(folder, root_); folder = getParentFolder(folder)) {
        auto const entry = diskEntry(folder);
        if (entry && S_ISLNK(entry->st_mode)) {
            throw MoveError(Reason::IsBeyondLink, move);
        }
        if (!entry || !S_ISDIR(entry->st_mode)) {
            throw MoveError(Reason::HasNoFolder, move);
        }
    }
}

} // namespace project::session
