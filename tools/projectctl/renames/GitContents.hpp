#pragma once

#include <map>
#include <optional>
#include <set>
#include <string>
#include <string_view>
#include <vector>

#include "fl/filesystem/Path.hpp"

namespace projectctl {

using fl::filesystem::Path;

/// A file as git stores it: its mode, as six octal digits, and the id of its content.
struct GitContent {
    std::string mode;
    std::string id;
};

/// The contents of files by their names in the system's bytes, relative to a folder.
using GitContents = std::map<std::string, GitContent, std::less<>>;

/// A rename that git has found.
struct GitRename {
    std::string from;
    std::string to;
    int similarity;
};

/// Asks git for the contents of files, those on disk included. Git's own index is only read: questions about
/// files that are not tracked use a copy of it, which the destructor deletes. Stores nothing in the
/// repository.
class GitContentQuery {
public:
    /// @param root the project's root, in a repository.
    /// @throws Failure if git fails, std::system_error if it is not installed.
    explicit GitContentQuery(Path const& root);
    ~GitContentQuery();
    GitContentQuery(GitContentQuery const&) = delete;
    GitContentQuery& operator=(GitContentQuery const&) = delete;

    /// The last commit that changed a file; nothing if there is none.
    std::optional<std::string> lastCommitOf(std::string const& file) const;

    /// The files of a commit below the root.
    GitContents of(std::string const& commit) const;

    /// The contents that files had before the last commit that deleted them. A file that no commit has
    /// deleted is missing in the result.
    GitContents deleted(std::vector<std::string> const& files) const;

    /// The files below the root that git tracks, or that it knows nothing about and does not ignore.
    std::vector<std::string> tracked() const;
    std::vector<std::string> untracked() const;

    /// The tracked files below the root, as they are on disk for some of them, and as they are staged for the
    /// others.
    /// @param onDisk files on disk, which need not be tracked.
    GitContents staged(std::vector<std::string> const& onDisk) const;

    /// The renames between earlier contents and files on disk, as git finds them.
    /// @param similarity in percent.
    std::vector<GitRename> similar(GitContents const& before, GitContents const& onDisk,
                                   int similarity) const;

    /// The id of an empty content in this repository.
    std::string const& emptyId() const noexcept { return emptyId_; }

private:
    using Arguments = std::vector<std::string>;

    std::string ask(Arguments const& arguments, std::string_view input = {}) const;
    std::string askOn(std::string const& index, Arguments const& arguments,
                      std::string_view input = {}) const;

    std::string newIndex(char const* name) const;

    std::string temporary(char const* name) const { return folder_ + '/' + name; }

    Path const& root_;
    std::string folder_; ///< of temporary files
    std::string prefix_; ///< of the root in the work tree, with a slash at the end unless it is empty
    std::string index_;
    std::string objects_;
    std::string emptyId_;
};

} // namespace projectctl
