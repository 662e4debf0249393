#pragma once

#include <array>
#include <memory>
#include <string>

#include "repository/FileStamp.hpp"
#include "repository/HeadTree.hpp"
#include "repository/IndexContent.hpp"
#include "repository/LibGit.hpp"
#include "repository/WorkTreeRoot.hpp"

namespace project::git {

/// The settings that describe the disk and the checkout.
struct DiskSettings {
    bool hasExecutableBit; ///< core.fileMode
    bool hasLinks;         ///< core.symlinks
    bool isSparse;         ///< core.sparseCheckout
};

/// An open repository with a work tree: its index and last commit, as they are on disk when an operation
/// begins.
class Repository {
public:
    /// @param handle a repository that is not bare.
    /// @param indexFile empty for the repository's own.
    Repository(RepositoryHandle handle, fl::filesystem::Path const& projectRoot, std::string indexFile = {});

    /// False if the repository was deleted or its configuration has changed: libgit2 reads the configuration
    /// once.
    bool isAsOpened() const { return configuration_ == stampConfiguration(); }

    /// Reads the index and the last commit again if other programs changed them.
    /// @throws GitError if they cannot be read.
    void refresh();

    git_repository* get() const { return handle_.get(); }

    IndexContent const& index() const { return *index_; }

    std::shared_ptr<IndexContent const> sharedIndex() const { return index_; }

    /// Lets index() show another content until the index is read again.
    void showIndex(std::shared_ptr<IndexContent const> content) { index_ = std::move(content); }

    /// The same for the content of an index file that was just written.
    void showIndex(std::shared_ptr<IndexContent const> content, FileStamp const& stamp);

    std::string const& indexFile() const { return indexFile_; }

    /// The stamp of the index file when it was last read.
    FileStamp const& indexStamp() const { return indexStamp_; }

    HeadTree& head() { return head_; }

    WorkTreeRoot const& workTree() const { return workTree_; }

    DiskSettings const& settings() const { return settings_; }

    /// @param name for example "core.fileMode".
    bool isSet(std::string const& name, bool isSetByDefault) const;

    /// A text of the configuration; empty if it is not set.
    std::string configured(std::string const& name) const;

    /// The same for the name of a file, which may begin with "~/".
    std::string configuredPath(std::string const& name) const;

    /// The default path of a user's file, for example "ignore"; empty if there is none.
    std::string usersFile(char const* name) const;

    /// The content of a file of the work tree, or of its index entry if it is not on disk.
    std::string contentOf(TreePath const& path) const;

private:
    using TextGetter = int (*)(git_buf*, git_config const*, char const*);

    std::string textOf(std::string const& name, TextGetter read) const;
    std::array<FileStamp, 2> stampConfiguration() const;
    void addWorkTreeConfiguration();
    void readIndex();

    RepositoryHandle handle_;
    ConfigHandle config_;
    std::string indexFile_;
    std::shared_ptr<IndexContent const> index_;
    FileStamp indexStamp_;
    bool isIndexRead_ = false;
    HeadTree head_;
    WorkTreeRoot workTree_;
    DiskSettings settings_{};
    std::array<FileStamp, 2> configuration_;
};

} // namespace project::git
