#pragma once

#include <memory>
#include <string>

#include <git2.h>

#include "repository/LibGitFunctions.hpp"

namespace project::git {

/// Initialises libgit2 for its lifetime. Several objects may exist: libgit2 counts them.
class LibGit {
public:
    LibGit();
    ~LibGit();
    LibGit(LibGit const&) = delete;
    LibGit& operator=(LibGit const&) = delete;
};

template <auto Free>
struct FreedBy {
    template <typename T>
    void operator()(T* object) const noexcept {
        (libgit().*Free)(object);
    }
};

using RepositoryHandle = std::unique_ptr<git_repository, FreedBy<&LibGitFunctions::git_repository_free>>;
using CommitHandle = std::unique_ptr<git_commit, FreedBy<&LibGitFunctions::git_commit_free>>;
using IndexHandle = std::unique_ptr<git_index, FreedBy<&LibGitFunctions::git_index_free>>;
using ConfigHandle = std::unique_ptr<git_config, FreedBy<&LibGitFunctions::git_config_free>>;
using ReferenceHandle = std::unique_ptr<git_reference, FreedBy<&LibGitFunctions::git_reference_free>>;
using ObjectHandle = std::unique_ptr<git_object, FreedBy<&LibGitFunctions::git_object_free>>;
using OdbHandle = std::unique_ptr<git_odb, FreedBy<&LibGitFunctions::git_odb_free>>;
using BlobHandle = std::unique_ptr<git_blob, FreedBy<&LibGitFunctions::git_blob_free>>;
using TreeHandle = std::unique_ptr<git_tree, FreedBy<&LibGitFunctions::git_tree_free>>;
using TreeEntryHandle = std::unique_ptr<git_tree_entry, FreedBy<&LibGitFunctions::git_tree_entry_free>>;

/// The bytes of an id.
inline std::string bytesOf(git_oid const& id) {
    return {reinterpret_cast<char const*>(id.id), sizeof id.id};
}

/// Throws a GitError with the message of libgit2's last error.
/// @param file the file or folder concerned.
/// @param problem the name of the text of the problem, for example "IndexNotRead".
[[noreturn]] void throwLibGitError(std::string const& file, char const* problem);

/// The same if a call of libgit2 returned an error code.
void require(int code, std::string const& file, char const* problem);

/// Whether there is a repository at a folder or above it, regardless of its owner.
/// @param ceiling the folder above that the search does not reach; empty for a search up to the root.
bool isRepositoryFound(std::string const& folder, std::string const& ceiling = "");

} // namespace project::git
