#pragma once

#include <array>
#include <string>

#include "repository/FileStamp.hpp"
#include "repository/HeadTree.hpp"
#include "repository/LibGit.hpp"
#include "repository/WorkTreeRoot.hpp"

namespace project::git {

/// What the repository is configured to believe of the disk.
struct DiskSettings {
    bool hasExecutableBit; ///< core.fileMode
    bool hasLinks;         ///< core.symlinks
    bool isSparse;         ///< core.sparseCheckout
};

/// One open repository with a work tree: its index and last commit, as they are on disk at a call's
/// beginning.
class Repository {
public:
    /// @param handle a repository that is not bare.
    Repository(RepositoryHandle handle, fl::filesystem::Path const& projectRoot);

    /// False when it went, or was configured anew: libgit2 keeps what it once read of the configuration.
    bool isAsOpened() const { return configuration_ == stampConfiguration(); }

    /// Takes in what others did to the index and to the last commit.
    /// @throws GitError when it can't be read.
    void refresh();

    git_repository* get() const { return handle_.get(); }

    /// Sorted by the bytes of the names. Never changed in memory.
    git_index* index() const { return index_.get(); }

    std::string indexFile() const { return git_index_path(index_.get()); }

    /// What the index file was like when it was last read.
    FileStamp const& indexStamp() const { return indexStamp_; }

    HeadTree& head() { return head_; }

    WorkTreeRoot const& workTree() const { return workTree_; }

    DiskSettings const& settings() const { return settings_; }

    /// @param name as in "core.fileMode".
    bool isSet(std::string const& name, bool whenAbsent) const;

    /// A text of the configuration, empty when it is absent.
    std::string configured(std::string const& name) const;

    /// The same for the name of a file, which may begin with "~/".
    std::string configuredPath(std::string const& name) const;

    /// Where git looks for a file of the user's, as in "ignore", when none is configured.
    std::string usersFile(char const* name) const;

    /// The content of a file of the work tree, or of its entry in the index where the disk has none.
    std::string contentOf(TreePath const& path) const;

private:
    using TextGetter = int (*)(git_buf*, git_config const*, char const*);

    std::string textOf(std::string const& name, TextGetter read) const;
    std::array<FileStamp, 2> stampConfiguration() const;
    void addWorkTreeConfiguration();
    void openIndex();
    void requireReadable(int code) const;

    /// @return what the index file was like before it was read.
    template <typename Read>
    FileStamp readIndex(std::string const& file, Read const& read) const;

    RepositoryHandle handle_;
    ConfigHandle config_;
    IndexHandle index_;
    FileStamp indexStamp_;
    bool isIndexRead_ = false;
    HeadTree head_;
    WorkTreeRoot workTree_;
    DiskSettings settings_{};
    std::array<FileStamp, 2> configuration_;
};

} // namespace project::git
