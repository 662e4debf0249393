#pragma once

#include <string>

#include <sys/stat.h>

#include "repository/Repository.hpp"

namespace project::git {

/// Puts the content of files of the work tree into the repository, as git would store it.
///
/// It has a way of its own to the repository's objects: libgit2's usual one lists the packs anew for each
/// object that isn't there yet, which took most of the time when 100,000 files were staged.
class BlobWriter {
public:
    explicit BlobWriter(Repository const& repository);

    /// Stores a file's content, with the line ends and other forms that its attributes ask for, or what a
    /// link leads to.
    /// @param[out] id of what was stored.
    /// @return false when it is gone.
    /// @throws GitError when it can't be read or stored.
    bool write(TreePath const& path, struct stat const& onDisk, bool isConverted, git_oid& id);

private:
    std::string convert(TreePath const& path, std::string const& content) const;
    void store(TreePath const& path, std::string const& content, git_oid& id) const;

    Repository const& repository_;
    OdbHandle objects_;
};

} // namespace project::git
