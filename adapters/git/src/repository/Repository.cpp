#include "repository/Repository.hpp"

#include <utility>

#include "repository/FileContent.hpp"

namespace project::git {

namespace {

ConfigHandle configOf(git_repository* repository) {
    git_config* config = nullptr;
    require(git_repository_config(&config, repository), git_repository_path(repository),
            "the configuration cannot be read");
    return ConfigHandle(config);
}

} // namespace

Repository::Repository(RepositoryHandle handle, fl::filesystem::Path const& projectRoot)
    : handle_(std::move(handle)),
      config_(configOf(handle_.get())),
      head_(handle_.get()),
      workTree_(git_repository_workdir(handle_.get()), projectRoot),
      configuration_(stampConfiguration()) {
    addWorkTreeConfiguration();
    settings_ = {isSet("core.fileMode", true), isSet("core.symlinks", true),
                 isSet("core.sparseCheckout", false)};
}

std::array<FileStamp, 2> Repository::stampConfiguration() const {
    return {FileStamp::of(git_repository_commondir(get()) + std::string("config")),
            FileStamp::of(git_repository_path(get()) + std::string("config.worktree"))};
}

// git stores the settings of a sparse checkout in a file that libgit2 does not read before version 1.8.
void Repository::addWorkTreeConfiguration() {
    std::string const file = git_repository_path(get()) + std::string("config.worktree");
    if (isSet("extensions.worktreeConfig", false) && FileStamp::of(file) != FileStamp()) {
        require(git_config_add_file_ondisk(config_.get(), file.c_str(), GIT_CONFIG_LEVEL_APP, get(), 1), file,
                "the configuration cannot be read");
    }
}

/// libgit2 1.5.1 determines the size of the index before it opens the file. If git replaces the index in
/// between, libgit2 reports it as truncated. An error is therefore final only if the file has not changed.
template <typename Read>
FileStamp Repository::readIndex(std::string const& file, Read const& read) const {
    constexpr int tries = 100;
    for (int count = 1;; ++count) {
        auto const stamp = FileStamp::of(file);
        auto const code = read();
        if (code >= 0 || count == tries || stamp == FileStamp::of(file)) {
            requireReadable(code);
            return stamp;
        }
    }
}

void Repository::refresh() {
    if (index_ == nullptr) {
        openIndex();
    }
    // After a failure, the next call tries again.
    if (!isIndexRead_ || FileStamp::of(indexFile()) != indexStamp_) {
        isIndexRead_ = false;
        indexStamp_ = readIndex(indexFile(), [this] { return git_index_read(index_.get(), 1); });
        isIndexRead_ = true;
    }
    head_.refresh();
}

void Repository::openIndex() {
    git_index* index = nullptr;
    readIndex(git_repository_path(get()) + std::string("index"),
              [&] { return git_repository_index(&index, get()); });
    index_.reset(index);
    // By default, libgit2 sorts and searches the index according to core.ignoreCase.
    require(git_index_set_caps(index, 0), indexFile(), "the index cannot be used");
}

void Repository::requireReadable(int code) const {
    if (code < 0) {
        throwLibGitError(git_repository_path(get()) + std::string("index"), "the index cannot be read",
                         "If `git status` reads it, it has a format that this library does not know. "
                         "`git update-index --no-split-index --index-version 2` and "
                         "`git sparse-checkout reapply --no-sparse-index` write it in a known format.");
    }
}

bool Repository::isSet(std::string const& name, bool isSetByDefault) const {
    int value = 0;
    return git_config_get_bool(&value, config_.get(), name.c_str()) == 0 ? value != 0 : isSetByDefault;
}

std::string Repository::configured(std::string const& name) const {
    return textOf(name, git_config_get_string_buf);
}

std::string Repository::configuredPath(std::string const& name) const {
    return textOf(name, git_config_get_path);
}

std::string Repository::usersFile(char const* name) const {
    git_buf folder = GIT_BUF_INIT;
    std::string result;
    if (git_libgit2_opts(GIT_OPT_GET_SEARCH_PATH, GIT_CONFIG_LEVEL_XDG, &folder) == 0 && folder.size > 0) {
        result = std::string(folder.ptr, folder.size) + '/' + name;
    }
    git_buf_dispose(&folder);
    return result;
}

std::string Repository::contentOf(TreePath const& path) const {
    if (auto content = readFile(workTree_.onDisk(path), Links::NotFollowed)) {
        return *std::move(content);
    }
    auto const* const entry = git_index_get_bypath(index(), path.c_str(), 0);
    git_blob* blob = nullptr;
    if (entry == nullptr || git_blob_lookup(&blob, get(), &entry->id) != 0) {
        return {};
    }
    BlobHandle const owned(blob);
    return {static_cast<char const*>(git_blob_rawcontent(blob)),
            static_cast<std::size_t>(git_blob_rawsize(blob))};
}

std::string Repository::textOf(std::string const& name, TextGetter read) const {
    git_buf value = GIT_BUF_INIT;
    std::string result;
    if (read(&value, config_.get(), name.c_str()) == 0) {
        result.assign(value.ptr, value.size);
    }
    git_buf_dispose(&value);
    return result;
}

} // namespace project::git
