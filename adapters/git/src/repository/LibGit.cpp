#include "repository/LibGit.hpp"

#include <cerrno>

#include <unistd.h>

#include "project/git/GitError.hpp"
#include "texts/ErrorTexts.hpp"

namespace project::git {

namespace {

/// git ignores a user's configuration that the process must not read (config.c, "access_or_die" with
/// ACCESS_EACCES_OK), but libgit2 1.5.1 then opens no repository. This happens in the environment of another
/// user, for example after `su` without a login.
void ignoreUnreadable(git_config_level_t level, char const* file) {
    git_buf folder = GIT_BUF_INIT;
    if (libgit().git_libgit2_opts(GIT_OPT_GET_SEARCH_PATH, level, &folder) != 0) {
        return;
    }
    auto const name = std::string(folder.ptr, folder.size) + '/' + file;
    if (folder.size > 0 && access(name.c_str(), R_OK) != 0 && errno == EACCES) {
        libgit().git_libgit2_opts(GIT_OPT_SET_SEARCH_PATH, level, "");
    }
    libgit().git_buf_dispose(&folder);
}

} // namespace

LibGit::LibGit() {
    require(libgit().git_libgit2_init(), "", "LibGitFailed");
    ignoreUnreadable(GIT_CONFIG_LEVEL_GLOBAL, ".gitconfig");
    ignoreUnreadable(GIT_CONFIG_LEVEL_XDG, "config");
}

LibGit::~LibGit() {
    libgit().git_libgit2_shutdown();
}

void throwLibGitError(std::string const& file, char const* problem) {
    auto const* const error = libgit().git_error_last();
    throw GitError(GitError::Kind::Failed, file,
                   errorTexts.get(problem) + (error == nullptr ? "" : ": " + std::string(error->message)),
                   "");
}

void require(int code, std::string const& file, char const* problem) {
    if (code < 0) {
        throwLibGitError(file, problem);
    }
}

bool isRepositoryFound(std::string const& folder, std::string const& ceiling) {
    git_buf found = GIT_BUF_INIT;
    bool const isFound = libgit().git_repository_discover(&found, folder.c_str(), 0, ceiling.c_str()) == 0;
    libgit().git_buf_dispose(&found);
    return isFound;
}

} // namespace project::git
