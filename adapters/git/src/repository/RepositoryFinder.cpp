#include "repository/RepositoryFinder.hpp"

#include <cstdlib>
#include <filesystem>
#include <utility>

#include "fl/filesystem/SystemName.hpp"
#include "project/git/GitError.hpp"
#include "texts/ErrorTexts.hpp"

namespace project::git {

namespace {

[[noreturn]] void throwOwnerError(std::string const& place) {
    throw GitError(GitError::Kind::Refused, place, errorTexts.get("OtherOwner"),
                   errorTexts.get("RemedyOfOtherOwner"));
}

/// @return null if there is none.
RepositoryHandle openAround(char const* root) {
    git_repository* found = nullptr;
    auto const code = libgit().git_repository_open_ext(&found, root, 0, nullptr);
    // libgit2 1.5.1 reports a repository of another user as missing, unless the configuration has a
    // `safe.directory` for some other repository.
    if (code == GIT_EOWNER || (code == GIT_ENOTFOUND && isRepositoryFound(root))) {
        throwOwnerError(root);
    }
    if (code != GIT_ENOTFOUND) {
        require(code, root, "RepositoryNotOpened");
    }
    return RepositoryHandle(found);
}

RepositoryHandle openNamed(char const* repository) {
    git_repository* found = nullptr;
    auto const flags = GIT_REPOSITORY_OPEN_NO_SEARCH | GIT_REPOSITORY_OPEN_NO_DOTGIT;
    require(libgit().git_repository_open_ext(&found, repository, flags, nullptr), repository,
            "GitDirNotOpened");
    return RepositoryHandle(found);
}

void setWorkTreeTo(git_repository* repository, std::filesystem::path const& folder) {
    auto const* const current = libgit().git_repository_workdir(repository);
    std::error_code missing;
    if (current != nullptr && std::filesystem::equivalent(current, folder, missing)) {
        return; // libgit2 1.5.1 leaks memory when it is given the folder that it already has
    }
    require(libgit().git_repository_set_workdir(repository, folder.c_str(), 0), folder, "WorkTreeNotUsed");
}

/// git's own rule (git(1), "The Git Repository"): with GIT_DIR alone, the working folder is the work tree.
void setWorkTree(git_repository* repository) {
    auto const* const folder = std::getenv("GIT_WORK_TREE");
    if (folder != nullptr) {
        setWorkTreeTo(repository, folder);
        return;
    }
    git_config* config = nullptr;
    require(libgit().git_repository_config(&config, repository), libgit().git_repository_path(repository),
            "ConfigurationUnreadable");
    ConfigHandle const owned(config);
    git_config_entry* entry = nullptr;
    int isBare = 0;
    bool const isConfigured = libgit().git_config_get_entry(&entry, config, "core.worktree") == 0;
    libgit().git_config_entry_free(entry);
    if (!isConfigured && (libgit().git_config_get_bool(&isBare, config, "core.bare") != 0 || isBare == 0)) {
        setWorkTreeTo(repository, std::filesystem::current_path());
    }
}

/// For libgit2, which reads attributes from the index.
void setIndex(git_repository* repository, char const* file) {
    git_index* index = nullptr;
    require(libgit().git_index_open(&index, file), file, "IndexNotRead");
    IndexHandle const owned(index);
    require(libgit().git_repository_set_index(repository, index), file, "IndexNotUsed");
}

/// libgit2 1.5 can read these variables itself, but returns an error if GIT_WORK_TREE is set.
RepositoryHandle openFromEnvironment(char const* root) {
    auto const* const repository = std::getenv("GIT_DIR");
    auto result = repository == nullptr ? openAround(root) : openNamed(repository);
    if (result != nullptr && (repository != nullptr || std::getenv("GIT_WORK_TREE") != nullptr)) {
        setWorkTree(result.get());
    }
    auto const* const index = std::getenv("GIT_INDEX_FILE");
    if (result != nullptr && index != nullptr) {
        setIndex(result.get(), index);
    }
    return result;
}

} // namespace

RepositoryFinder::RepositoryFinder(fl::filesystem::Path root, GitEnvironment environment)
    : root_(std::move(root)), environment_(environment) {
}

Repository* RepositoryFinder::find() {
    if (repository_ == nullptr || !repository_->isAsOpened()) {
        repository_ = nullptr;
        auto handle = open();
        if (handle == nullptr || libgit().git_repository_workdir(handle.get()) == nullptr) {
            return nullptr;
        }
        repository_ = std::make_unique<Repository>(std::move(handle), root_, indexOfEnvironment());
    }
    repository_->refresh();
    return repository_.get();
}

/// Empty if none is set.
std::string RepositoryFinder::indexOfEnvironment() const {
    auto const* const file =
        environment_ == GitEnvironment::Honoured ? std::getenv("GIT_INDEX_FILE") : nullptr;
    return file == nullptr ? std::string() : file;
}

/// libgit2 is initialised here and not before, because it then reads the certificates of all authorities,
/// even if it is never used: that takes longer than many a command of the tool.
RepositoryHandle RepositoryFinder::open() {
    if (!library_) {
        library_.emplace();
    }
    fl::filesystem::SystemName const root(root_);
    if (root.get() == nullptr) {
        return nullptr;
    }
    return environment_ == GitEnvironment::Ignored ? openAround(root.get()) : openFromEnvironment(root.get());
}

} // namespace project::git
