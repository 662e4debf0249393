#include "states/ContentIds.hpp"

#include "repository/FileContent.hpp"
#include "repository/LibGit.hpp"
#include "repository/TrackedFiles.hpp"

namespace project::git {

namespace {

std::string textOf(git_oid const& id) {
    return {reinterpret_cast<char const*>(id.id), sizeof id.id};
}

bool hashLink(git_oid& result, std::string const& name) {
    auto const target = readLink(name);
    return target && libgit().git_odb_hash(&result, target->data(), target->size(), GIT_OBJECT_BLOB) == 0;
}

} // namespace

bool hashOnDisk(git_oid& id, Repository const& repository, ContentRules& rules, TreePath const& path,
                struct stat const& found) {
    std::string const name = repository.workTree().onDisk(path);
    if (S_ISLNK(found.st_mode)) {
        return hashLink(id, name);
    }
    return S_ISREG(found.st_mode) && rules.conversionOf(path).foreign.empty() &&
           libgit().git_repository_hashfile(&id, repository.get(), name.c_str(), GIT_OBJECT_BLOB,
                                            path.c_str()) == 0;
}

std::optional<std::string> ContentIds::stored(fl::filesystem::Path const& file) {
    auto const path = repository_.workTree().relativeInProject(file);
    if (!path || path->empty()) {
        return std::nullopt;
    }
    if (auto const entry = trackedAt(repository_.index(), *path)) {
        bool const isContent = !isSubmodule(*entry) && libgit().git_index_entry_is_conflict(&*entry) == 0;
        return isContent ? std::optional(textOf(entry->id)) : std::nullopt;
    }
    auto const* const committed = repository_.head().find(*path);
    bool const isContent = committed != nullptr && libgit().git_tree_entry_type(committed) == GIT_OBJECT_BLOB;
    return isContent ? std::optional(textOf(*libgit().git_tree_entry_id(committed))) : std::nullopt;
}

std::optional<std::string> ContentIds::onDisk(fl::filesystem::Path const& file) {
    auto const path = repository_.workTree().relativeInProject(file);
    if (!path || path->empty()) {
        return std::nullopt;
    }
    std::string const name = repository_.workTree().onDisk(*path);

    struct stat found {};

    git_oid id{};
    bool const isRead =
        ::lstat(name.c_str(), &found) == 0 && hashOnDisk(id, repository_, rules_, *path, found);
    return isRead ? std::optional(textOf(id)) : std::nullopt;
}

} // namespace project::git
