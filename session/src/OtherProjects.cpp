#include "OtherProjects.hpp"

#include <filesystem>
#include <optional>
#include <string>
#include <system_error>
#include <utility>

#include "DiskEntries.hpp"
#include "project/metadata/MetadataFunctions.hpp"
#include "project/metadata/TreeSchema.hpp"
#include "project/references/FolderReference.hpp"
#include "project/stores/TextBackend.hpp"

namespace project::session {

namespace referenceSchema = metadata::schema::references;

using management::FolderReference;
using management::FolderReferenceManager;

namespace {

/// A path without "." and "..".
Path normal(Path const& path) {
    auto const result = fl::filesystem::toSystem(path).lexically_normal();
    return fl::filesystem::fromSystem(result.has_filename() ? result : result.parent_path());
}

Path movedPath(Path const& path, std::vector<Move> const& moves) {
    for (auto const& move : moves) {
        if (path == move.from || metadata::isParent(path, move.from)) {
            return move.to / Path(metadata::getRelativePath(move.from, path));
        }
    }
    return path;
}

/// The place of a project before the moves.
Path earlierPath(Path const& path, std::vector<Move> const& moves) {
    std::vector<Move> reversed;
    reversed.reserve(moves.size());
    for (auto const& move : moves) {
        reversed.push_back({move.to, move.from});
    }
    return movedPath(path, reversed);
}

/// Whether there is a project in a folder, which is not a link.
bool isProject(Path const& folder) {
    auto const store = diskEntry(folder / stores::TextBackend::folderName);
    return store && S_ISDIR(store->st_mode);
}

void addProjectsBelow(Path const& folder, std::set<Path>& projects) {
    auto const entry = diskEntry(folder);
    if (!entry || !S_ISDIR(entry->st_mode)) {
        return;
    }
    if (isProject(folder)) {
        projects.insert(folder);
    }
    std::error_code error;
    auto found = std::filesystem::recursive_directory_iterator(
        fl::filesystem::toSystem(folder), std::filesystem::directory_options::skip_permission_denied, error);
    for (; !error && found != std::filesystem::recursive_directory_iterator(); found.increment(error)) {
        auto const name = found->path().filename();
        if (name == ".git") {
            found.disable_recursion_pending();
        } else if (name == fl::filesystem::toSystem(Path(stores::TextBackend::folderName))) {
            found.disable_recursion_pending();
            projects.insert(fl::filesystem::fromSystem(found->path().parent_path()));
        }
    }
}

/// A reference of a project as it is after the moves; nothing if it does not change.
std::optional<FolderReference> followed(FolderReference const& reference, Path const& project,
                                        std::vector<Move> const& moves, bool isRepeated) {
    bool const isRelative = reference.getType() == referenceSchema::relative;
    Path const stored = reference.getStoredPath();
    Path const now = normal(isRelative ? project / stored : stored);
    if (isRepeated && metadata::exists(now)) {
        return std::nullopt;
    }
    Path const before = normal(isRelative ? earlierPath(project, moves) / stored : stored);
    Path const to = movedPath(before, moves);
    if (to == now || !metadata::exists(to)) {
        return std::nullopt;
    }
    auto text = isRelative ? metadata::getRelativePath(project, to) : to.native();
    return FolderReference(to, reference.getType(), std::move(text), reference.getUUID());
}

void followIn(FolderReferenceManager& manager, Path const& project, std::vector<Move> const& moves,
              bool isRepeated) {
    for (auto const& reference : manager.getReferences()) {
        if (auto const changed = followed(reference, project, moves, isRepeated)) {
            manager.removeReferences({reference});
            manager.addReferences({*changed});
        }
    }
}

} // namespace

void OtherProjects::follow(std::vector<Move> const& moves, std::vector<Path> const& referenced,
                           bool isRepeated) const noexcept {
    try {
        std::set<Path> projects;
        for (auto const& folder : referenced) {
            if (isProject(folder)) {
                projects.insert(folder);
            }
        }
        for (auto const& move : moves) {
            addProjectsBelow(move.to, projects);
        }
        projects.erase(root_);
        for (auto const& project : projects) {
            followIn(project, moves, isRepeated);
        }
    } catch (...) { // without memory
    }
}

void OtherProjects::followIn(Path const& project, std::vector<Move> const& moves, bool isRepeated) const {
    try {
        auto session = Session::open(project, options_);
        auto transaction = session.transaction();
        session::followIn(session.project().getProjectReferenceManager().getFolderReferenceManager(), project,
                          moves, isRepeated);
        session::followIn(session.project().getProjectPathManager().getFolderReferenceManager(), project,
                          moves, isRepeated);
        transaction.commit();
    } catch (std::exception const&) { // it stays as it is
    }
}

} // namespace project::session
