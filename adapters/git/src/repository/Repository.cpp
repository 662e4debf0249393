#include "repository/Repository.hpp"

#include <cerrno>
#include <system_error>
#include <utility>

#include "project/git/GitError.hpp"
#include "repository/FileContent.hpp"
#include "repository/TrackedFiles.hpp"
#include "texts/ErrorTexts.hpp"

namespace project::git {

namespace {

ConfigHandle configOf(git_repository* repository) {
    git_config* config = nullptr;
    require(libgit().git_repository_config(&config, repository), libgit().git_repository_path(repository),
            "ConfigurationUnreadable");
    return ConfigHandle(config);
}

} // namespace

Repository::Repository(RepositoryHandle handle, fl::filesystem::Path const& projectRoot,
                       std::string indexFile)
    : handle_(std::move(handle)),
      config_(configOf(handle_.get())),
      indexFile_(indexFile.empty() ? libgit().git_repository_path(handle_.get()) + std::string("index")
                                   : std::move(indexFile)),
      head_(handle_.get()),
      workTree_(libgit().git_repository_workdir(handle_.get()), projectRoot),
      configuration_(stampConfiguration()) {
    addWorkTreeConfiguration();
    settings_ = {isSet("core.fileMode", true), isSet("core.symlinks", true),
                 isSet("core.sparseCheckout", false)};
}

std::array<FileStamp, 2> Repository::stampConfiguration() const {
    return {FileStamp::of(libgit().git_repository_commondir(get()) + std::string("config")),
            FileStamp::of(libgit().git_repository_path(get()) + std::string("config.worktree"))};
}

// git stores the settings of a sparse checkout in a file that libgit2 does not read before version 1.8.
void Repository::addWorkTreeConfiguration() {
    std::string const file = libgit().git_repository_path(get()) + std::string("config.worktree");
    if (isSet("extensions.worktreeConfig", false) && FileStamp::of(file) != FileStamp()) {
        require(
            libgit().git_config_add_file_ondisk(config_.get(), file.c_str(), GIT_CONFIG_LEVEL_APP, get(), 1),
            file, "ConfigurationUnreadable");
    }
}

void Repository::refresh() {
    // After a failure, the next call tries again.
    if (!isIndexRead_ || FileStamp::of(indexFile_) != indexStamp_) {
        isIndexRead_ = false;
        readIndex();
        isIndexRead_ = true;
    }
    head_.refresh();
}

/// The stamp is taken first: if the index is replaced in between, the next call reads it again.
void Repository::readIndex() {
    indexStamp_ = FileStamp::of(indexFile_);
    auto bytes = readFile(indexFile_, Links::Followed, static_cast<std::size_t>(indexStamp_.size));
    if (!bytes && errno == ENOENT) {
        index_ = std::make_shared<IndexContent>();
        return;
    }
    if (!bytes) {
        throw GitError(GitError::Kind::Failed, indexFile_,
                       errorTexts.get("IndexUnreadable", std::generic_category().message(errno)),
                       errorTexts.get("RemedyOfUnreadableIndex"));
    }
    index_ = std::make_shared<IndexContent>(*std::move(bytes), indexFile_);
}

void Repository::showIndex(std::shared_ptr<IndexContent const> content, FileStamp const& stamp) {
    index_ = std::move(content);
    indexStamp_ = stamp;
    isIndexRead_ = true;
}

bool Repository::isSet(std::string const& name, bool isSetByDefault) const {
    int value = 0;
    return libgit().git_config_get_bool(&value, config_.get(), name.c_str()) == 0 ? value != 0
                                                                                  : isSetByDefault;
}

std::string Repository::configured(std::string const& name) const {
    return textOf(name, libgit().git_config_get_string_buf);
}

std::string Repository::configuredPath(std::string const& name) const {
    return textOf(name, libgit().git_config_get_path);
}

std::string Repository::usersFile(char const* name) const {
    git_buf folder = GIT_BUF_INIT;
    std::string result;
    if (libgit().git_libgit2_opts(GIT_OPT_GET_SEARCH_PATH, GIT_CONFIG_LEVEL_XDG, &folder) == 0 &&
        folder.size > 0) {
        result = std::string(folder.ptr, folder.size) + '/' + name;
    }
    libgit().git_buf_dispose(&folder);
    return result;
}

std::string Repository::contentOf(TreePath const& path) const {
    if (auto content = readFile(workTree_.onDisk(path), Links::NotFollowed)) {
        return *std::move(content);
    }
    auto const entry = trackedAt(index(), path);
    git_blob* blob = nullptr;
    if (!entry || libgit().git_index_entry_is_conflict(&*entry) != 0 ||
        libgit().git_blob_lookup(&blob, get(), &entry->id) != 0) {
        return {};
    }
    BlobHandle const owned(blob);
    return {static_cast<char const*>(libgit().git_blob_rawcontent(blob)),
            static_cast<std::size_t>(libgit().git_blob_rawsize(blob))};
}

std::string Repository::textOf(std::string const& name, TextGetter read) const {
    git_buf value = GIT_BUF_INIT;
    std::string result;
    if (read(&value, config_.get(), name.c_str()) == 0) {
        result.assign(value.ptr, value.size);
    }
    libgit().git_buf_dispose(&value);
    return result;
}

} // namespace project::git
