#include "repository/Commit.hpp"

#include <algorithm>
#include <utility>

namespace project::git {

namespace {

constexpr auto headUnreadable = "HeadUnreadable";

} // namespace

std::optional<Commit> Commit::head(git_repository* repository) {
    git_reference* head = nullptr;
    auto const code = libgit().git_repository_head(&head, repository);
    ReferenceHandle const owned(head);
    if (code == GIT_EUNBORNBRANCH || code == GIT_ENOTFOUND) {
        return std::nullopt;
    }
    require(code, libgit().git_repository_path(repository), headUnreadable);
    git_object* found = nullptr;
    require(libgit().git_reference_peel(&found, head, GIT_OBJECT_COMMIT),
            libgit().git_repository_path(repository), headUnreadable);
    return withTree(CommitHandle(reinterpret_cast<git_commit*>(found)));
}

std::optional<Commit> Commit::withTree(CommitHandle commit) {
    git_tree* tree = nullptr;
    if (libgit().git_commit_tree(&tree, commit.get()) != 0) {
        return std::nullopt;
    }
    return Commit(std::move(commit), TreeHandle(tree));
}

std::optional<Commit::Entry> Commit::find(TreePath const& path) const {
    if (path.empty()) {
        return Entry{bytesOf(*libgit().git_tree_id(tree_.get())), GIT_OBJECT_TREE};
    }
    git_tree_entry* found = nullptr;
    if (libgit().git_tree_entry_bypath(&found, tree_.get(), path.c_str()) != 0) {
        return std::nullopt;
    }
    TreeEntryHandle const entry(found);
    return Entry{bytesOf(*libgit().git_tree_entry_id(found)), libgit().git_tree_entry_type(found)};
}

std::optional<std::string> Commit::contentAt(TreePath const& path) const {
    auto entry = find(path);
    bool const isContent = entry && entry->type == GIT_OBJECT_BLOB;
    return isContent ? std::optional(std::move(entry->id)) : std::nullopt;
}

std::vector<Commit> Commit::parents() const {
    std::vector<Commit> result;
    auto const count = libgit().git_commit_parentcount(commit_.get());
    for (unsigned int position = 0; position < count; ++position) {
        git_commit* parent = nullptr;
        if (libgit().git_commit_parent(&parent, commit_.get(), position) == 0) {
            if (auto read = withTree(CommitHandle(parent))) {
                result.push_back(*std::move(read));
            }
        }
    }
    return result;
}

std::optional<Commit> lastChangeOf(TreePath const& path, std::optional<Commit> newest) {
    while (newest) {
        auto const entry = newest->find(path);
        auto parents = newest->parents();
        auto const same =
            std::ranges::find_if(parents, [&](Commit const& parent) { return parent.find(path) == entry; });
        if (same == parents.end()) {
            bool const isChange = entry || !parents.empty();
            return isChange ? std::move(newest) : std::nullopt;
        }
        newest = std::move(*same);
    }
    return std::nullopt;
}

std::map<TreePath, std::string> deletedContents(std::vector<TreePath> files, std::optional<Commit> newest) {
    struct Search {
        Commit commit;
        std::vector<TreePath> files; ///< that it does not contain
    };

    std::map<TreePath, std::string> result;
    std::vector<Search> open;
    if (newest && !files.empty()) {
        open.push_back({*std::move(newest), std::move(files)});
    }
    while (!open.empty()) {
        auto const search = std::move(open.back());
        open.pop_back();
        auto parents = search.commit.parents();
        std::vector<std::vector<TreePath>> rest(parents.size());
        for (auto const& file : search.files) {
            auto const lacking = std::ranges::find_if(
                parents, [&file](Commit const& parent) { return !parent.contentAt(file); });
            if (lacking != parents.end()) {
                rest[static_cast<std::size_t>(lacking - parents.begin())].push_back(file);
            } else if (!parents.empty()) {
                result.emplace(file, *parents.front().contentAt(file));
            }
        }
        for (std::size_t position = 0; position < parents.size(); ++position) {
            if (!rest[position].empty()) {
                open.push_back({std::move(parents[position]), std::move(rest[position])});
            }
        }
    }
    return result;
}

} // namespace project::git
