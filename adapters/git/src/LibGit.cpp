#include "LibGit.hpp"

#include "project/git/GitError.hpp"

namespace project::git {

LibGit::LibGit() {
    require(git_libgit2_init(), "", "libgit2 can't be used");
}

LibGit::~LibGit() {
    git_libgit2_shutdown();
}

void throwLibGitError(std::string const& file, std::string const& action, std::string const& remedy) {
    auto const* const error = git_error_last();
    throw GitError(file, action + (error == nullptr ? "" : ": " + std::string(error->message)), remedy);
}

void require(int code, std::string const& file, char const* action) {
    if (code < 0) {
        throwLibGitError(file, action);
    }
}

} // namespace project::git
