#include "states/EarlierContents.hpp"

#include <optional>
#include <utility>

#include "repository/Commit.hpp"
#include "repository/TrackedFiles.hpp"

namespace project::git {

namespace {

using fl::filesystem::Path;

/// Of a file that is staged without a conflict.
std::optional<std::string> stagedContent(Repository const& repository, TreePath const& path) {
    auto const entry = trackedAt(repository.index(), path);
    bool const isContent =
        entry && !isSubmodule(*entry) && libgit().git_index_entry_is_conflict(&*entry) == 0;
    return isContent ? std::optional(bytesOf(entry->id)) : std::nullopt;
}

} // namespace

std::map<Path, std::string> earlierContents(Repository& repository, std::vector<Path> const& files,
                                            TreePath const& writer) {
    std::map<Path, std::string> result;
    auto const written = lastChangeOf(writer, Commit::head(repository.get()));
    auto head = Commit::head(repository.get());
    std::map<TreePath, Path> unknown;
    for (auto const& file : files) {
        auto const path = repository.workTree().relativeInProject(file);
        if (!path || path->empty()) {
            continue;
        }
        auto content = written ? written->contentAt(*path) : std::nullopt;
        if (!content) {
            content = stagedContent(repository, *path);
        }
        if (!content && head) {
            content = head->contentAt(*path);
        }
        if (content) {
            result.emplace(file, *std::move(content));
        } else {
            unknown.emplace(*path, file);
        }
    }
    std::vector<TreePath> sought;
    sought.reserve(unknown.size());
    for (auto const& [path, file] : unknown) {
        sought.push_back(path);
    }
    for (auto& [path, content] : deletedContents(std::move(sought), std::move(head))) {
        result.emplace(unknown.at(path), std::move(content));
    }
    return result;
}

} // namespace project::git
