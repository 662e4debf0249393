#pragma once

#include <cstdint>
#include <map>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "fl/filesystem/Path.hpp"
#include "git/RawChanges.hpp"

namespace projectctl {

using fl::filesystem::Path;

/// A project in a git repository, for questions about its earlier versions.
class GitProject {
public:
    /// The project that contains the working folder.
    /// @param sharedMessage the message for a project that a server stores: git has no versions of it.
    /// @throws Failure if there is no such project, or it is not in a repository.
    explicit GitProject(char const* sharedMessage);

    /// The project with a root; nothing if it is not in a repository, or if git is not installed.
    static std::optional<GitProject> at(Path const& root);

    Path const& root() const noexcept { return root_; }

    /// The path of the text from the top of the repository.
    std::string textInRepository() const;

    /// The renames among some changes, as paths from the project's root. Files outside the project are left
    /// out.
    std::map<std::u16string, std::u16string> renamesIn(std::vector<RawChange> const& changes) const;

    /// The path of a file from the project's root; nothing for a file outside the project.
    /// @param path from the top of the repository.
    std::optional<std::u16string> pathFromRoot(std::string_view path) const;

    /// The id of a commit. @throws Failure if there is no such commit.
    std::string commit(std::string const& revision) const;

    /// The id of a commit; nothing if it does not exist.
    std::optional<std::string> findCommit(std::string const& revision) const;

    /// The differences between the tracked files of two commits, renamed ones as one.
    /// @param later without it, the files on disk are compared.
    std::vector<RawChange> changedFiles(std::string const& earlier,
                                        std::optional<std::string> const& later = {}) const;

    /// The sizes of the project's files in a commit, by their paths from the root.
    std::map<std::u16string, std::uint64_t> fileSizes(std::string const& commit) const;

    /// The text in a commit; empty if the commit does not contain the project.
    std::string textIn(std::string const& commit) const;

    /// The text on disk.
    std::string textOnDisk() const;

private:
    GitProject(Path root, std::string prefix) : root_(std::move(root)), prefix_(std::move(prefix)) {}

    Path root_;
    std::string prefix_; ///< the path of the root from the top of the repository, with a "/" at its end
};

} // namespace projectctl
