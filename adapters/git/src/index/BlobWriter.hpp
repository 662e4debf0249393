#pragma once

#include <string>

#include <sys/stat.h>

#include "repository/Repository.hpp"

namespace project::git {

/// Stores the content of files of the work tree in the repository, as git does.
///
/// It opens the repository's objects itself: libgit2's usual way lists the packs again for each new object,
/// which took most of the time when 100,000 files were staged.
class BlobWriter {
public:
    explicit BlobWriter(Repository const& repository);

    /// Stores a file's content, converted as its attributes require, or the target of a link.
    /// @param[out] id the identity of the stored content.
    /// @return false if the file no longer exists.
    /// @throws GitError if it cannot be read or stored.
    bool write(TreePath const& path, struct stat const& onDisk, bool isConverted, git_oid& id);

private:
    std::string convert(TreePath const& path, std::string const& content) const;
    void store(TreePath const& path, std::string const& content, git_oid& id) const;

    Repository const& repository_;
    OdbHandle objects_;
};

} // namespace project::git
