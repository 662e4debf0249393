#include "repository/LibGitFunctions.hpp"

#include <string>

#include <dlfcn.h>

#include "project/git/GitError.hpp"
#include "texts/ErrorTexts.hpp"

namespace project::git {

namespace {

char const* const libraryName = PROJECT_GIT_LIBGIT2_SONAME;

[[noreturn]] void throwNotLoaded() {
    auto const* const reason = dlerror();
    throw GitError(GitError::Kind::Failed, libraryName,
                   reason == nullptr ? errorTexts.get("LibGitMissing")
                                     : errorTexts.get("LibGitMissingBecause", reason),
                   errorTexts.get("RemedyOfMissingLibGit"));
}

void* openLibrary() {
    auto* const result = dlopen(libraryName, RTLD_LAZY | RTLD_LOCAL);
    if (result == nullptr) {
        throwNotLoaded();
    }
    return result;
}

} // namespace

LibGitFunctions::LibGitFunctions() : library_(openLibrary()) {
}

LibGitFunctions::Symbol LibGitFunctions::symbol(char const* name) const {
    auto* const address = dlsym(library_, name);
    if (address == nullptr) {
        throwNotLoaded();
    }
    return Symbol(address);
}

LibGitFunctions const& libgit() {
    static LibGitFunctions const functions;
    return functions;
}

} // namespace project::git
