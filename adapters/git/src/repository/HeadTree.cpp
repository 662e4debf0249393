#include "repository/HeadTree.hpp"

namespace project::git {

namespace {

constexpr auto unreadable = "HeadUnreadable";

} // namespace

void HeadTree::refresh() {
    git_reference* head = nullptr;
    auto const code = libgit().git_repository_head(&head, repository_);
    ReferenceHandle const owned(head);
    if (code == GIT_EUNBORNBRANCH || code == GIT_ENOTFOUND) {
        folders_.clear();
        folders_.try_emplace(TreePath(), nullptr);
        root_ = {};
        return;
    }
    require(code, libgit().git_repository_path(repository_), unreadable);
    git_object* found = nullptr;
    require(libgit().git_reference_peel(&found, head, GIT_OBJECT_TREE),
            libgit().git_repository_path(repository_), unreadable);
    TreeHandle tree(reinterpret_cast<git_tree*>(found));
    if (folders_.empty() || libgit().git_oid_equal(libgit().git_tree_id(tree.get()), &root_) == 0) {
        folders_.clear();
        root_ = *libgit().git_tree_id(tree.get());
        folders_.try_emplace(TreePath(), std::move(tree));
    }
}

git_tree_entry const* HeadTree::find(TreePath const& path) {
    auto* const tree = folder(parentOf(path));
    auto const* const entry =
        tree == nullptr ? nullptr : libgit().git_tree_entry_byname(tree, std::string(nameOf(path)).c_str());
    return entry == nullptr || libgit().git_tree_entry_type(entry) == GIT_OBJECT_TREE ? nullptr : entry;
}

git_tree* HeadTree::folder(TreePath const& path) {
    auto const known = folders_.find(path);
    if (known != folders_.end()) {
        return known->second.get();
    }
    return folders_.try_emplace(path, load(path)).first->second.get();
}

TreeHandle HeadTree::load(TreePath const& path) {
    auto* const above = folder(parentOf(path));
    auto const* const entry =
        above == nullptr ? nullptr : libgit().git_tree_entry_byname(above, std::string(nameOf(path)).c_str());
    if (entry == nullptr || libgit().git_tree_entry_type(entry) != GIT_OBJECT_TREE) {
        return nullptr;
    }
    git_tree* tree = nullptr;
    require(libgit().git_tree_lookup(&tree, repository_, libgit().git_tree_entry_id(entry)),
            libgit().git_repository_path(repository_), unreadable);
    return TreeHandle(tree);
}

} // namespace project::git
